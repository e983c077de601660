// Wraps long texts over several lines of limited width.
#pragma once

#include <cctype>
#include <cstdint>
#include <cstdio>
#include <string_view>

#include "reports/text_out.h"

extern "C" {

// Writes a text. A text longer than `width` (at least 3) is broken at white space, and each line
// that continues on the next one ends with a continuation character. No newline follows the last
// line.
//   first   nonzero: the first line continues the caller's current line, without the indent
//   indent  written before every further line
//   PF_NOMORE  the text took several lines
TEVPF_API TEVPF_STATUS TEV8R1_display_string_value(std::int32_t first, std::int32_t width,
                                                   const char* text, std::FILE* stream,
                                                   const char* indent) noexcept;
}

namespace tevpf {

// The white-space class is the only part of the locale that reports use.
inline bool is_white(char character) noexcept {
  return std::isspace(static_cast<unsigned char>(character)) != 0;
}

enum class FirstLine { kGoesOn, kIndented };

// Same as TEV8R1_display_string_value, for writers that already hold the stream's buffer.
TEVPF_STATUS write_wrapped(TextOut& out, FirstLine first, std::int32_t width, std::string_view text,
                           std::string_view indent) noexcept;

}  // namespace tevpf
