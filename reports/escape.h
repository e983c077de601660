// Control characters of texts as two-character backslash sequences, and back.
#pragma once

#include <cstdint>

#include "include/tevpf.h"

namespace tevpf {

// What stands behind the backslash for each character that is escaped; 0 for all others.
struct EscapeLetters {
  char of[256];
};
constexpr EscapeLetters make_escape_letters() noexcept {
  EscapeLetters letters{};
  constexpr char kCharacters[] = "\b\t\n\v\f\r\\";
  constexpr char kLetters[] = "btnvfr\\";
  for (int i = 0; kLetters[i] != 0; ++i) {
    letters.of[static_cast<unsigned char>(kCharacters[i])] = kLetters[i];
  }
  return letters;
}
inline constexpr EscapeLetters kEscapeLetters = make_escape_letters();

constexpr char escape_letter(char character) noexcept {
  return kEscapeLetters.of[static_cast<unsigned char>(character)];
}

// Writes the escaped text at `out`, which has room for twice its length; gives the end of it.
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
