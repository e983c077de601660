// Converts control characters in texts to two-character backslash sequences, and back.
#pragma once

#include <cstdint>
#include <string_view>

#include "include/tevpf.h"

namespace tevpf {

// The characters that are escaped, and the letters that follow the backslash for them.
inline constexpr std::string_view kEscaped = "\b\t\n\v\f\r\\";
inline constexpr std::string_view kEscapeLetters = "btnvfr\\";

// Indexed by character; 0 for characters that are not escaped.
struct LetterTable {
  char of[256];
};
constexpr LetterTable make_letter_table() noexcept {
  LetterTable letters{};
  for (std::size_t n = 0; n < kEscaped.size(); ++n) {
    letters.of[static_cast<unsigned char>(kEscaped[n])] = kEscapeLetters[n];
  }
  return letters;
}
inline constexpr LetterTable kLetterTable = make_letter_table();

constexpr char escape_letter(char character) noexcept {
  return kLetterTable.of[static_cast<unsigned char>(character)];
}

// Writes the escaped text to `out`, which has room for twice its length; returns the end of the
// output.
inline char* write_escaped(char* out, const char* text, std::int64_t length) noexcept {
  for (const char* end = text + length; text != end; ++text) {
    const char letter = escape_letter(*text);
    if (letter == 0) {
      *out++ = *text;
    } else {
      *out++ = '\\';
      *out++ = letter;
    }
  }
  return out;
}

}  // namespace tevpf
