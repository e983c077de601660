// Texts as people see them: bytes that a terminal would act upon are shown as escapes.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

namespace tool {

// Control characters as \n, \t, \r or \xNN, and so every byte that is not well-formed UTF-8.
std::string visible(std::string_view text);

// The same for whole lines: line ends, tabs and page ends stay as they are.
std::string visible_lines(std::string_view text);

// 'text', made visible.
std::string in_quotes(std::string_view text);

// Characters of a visible text: its bytes without UTF-8 continuations.
std::size_t display_width(std::string_view text);

bool is_utf8(std::string_view text);

std::string_view trimmed(std::string_view text);  // without blanks and tabs at both ends

// The front of a text that has `size` bytes at most and ends with a whole character of UTF-8.
std::string_view cut(std::string_view text, std::size_t size);

// "1 row", "2 rows".
std::string counted(std::uintmax_t count, std::string_view noun);

}  // namespace tool
