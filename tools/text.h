// Texts as people see them: bytes that a terminal would act upon are shown as escapes.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace tool {

// Control characters as \n, \t, \r or \xNN, and so every byte that is not well-formed UTF-8.
std::string visible(std::string_view text);

// The same for whole lines: line ends, tabs and page ends stay as they are.
std::string visible_lines(std::string_view text);

// 'text', made visible.
std::string in_quotes(std::string_view text);

// Characters of a visible text: its bytes without UTF-8 continuations.
std::size_t display_width(std::string_view text);

// The front of a visible text, so many characters of it.
std::string_view first_characters(std::string_view text, std::size_t count);

bool is_utf8(std::string_view text);

inline bool is_digit(char byte) { return byte >= '0' && byte <= '9'; }

std::string_view trimmed(std::string_view text);  // without blanks and tabs at both ends

// The front of a text that has `size` bytes at most and ends with a whole character of UTF-8.
std::string_view cut(std::string_view text, std::size_t size);

// "1 row", "2 rows".
std::string counted(std::uintmax_t count, std::string_view noun);

// "; did you mean 'Thrust'?" when one of the names is nearly the given one, else nothing.
std::string did_you_mean(std::string_view name, const std::vector<std::string>& names);

}  // namespace tool
