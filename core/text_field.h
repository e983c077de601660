// Texts in the fixed fields of records: names, units, descriptions.
#pragma once

#include <cstddef>
#include <cstring>

#include "include/tevpf.h"

namespace tevpf {

// Copies as much of the text as fits, with a terminator, and zeroes the rest of the field. The text
// may be the field itself.
template <std::size_t N>
void set_field(char (&field)[N], const char* text) noexcept {
  const std::size_t length = strnlen(text, N - 1);
  std::memmove(field, text, length);
  std::memset(field + length, 0, N - length);
}

// Puts a terminator into the last byte of a field that came from a file or a caller.
template <std::size_t N>
void terminate_field(char (&field)[N]) noexcept {
  field[N - 1] = '\0';
}

// Whether a field holds exactly this text, which has fewer than 8 characters; false when it is
// longer. Most names are short, and a call costs as much as eight steps.
template <std::size_t N>
bool holds_short_text(const char (&field)[N], const char* text) noexcept {
  static_assert(N >= 8);
  for (std::size_t i = 0; i < 8; ++i) {
    if (field[i] != text[i]) return false;
    if (text[i] == '\0') return true;
  }
  return false;
}

inline bool starts_with_blank(const char* name) noexcept { return name[0] == ' '; }

// Names of elements count as equal when as much of them as is kept is equal.
inline bool same_element_name(const char* a, const char* b) noexcept {
  return std::strncmp(a, b, TEVPF_NAME_SIZE - 1) == 0;
}

}  // namespace tevpf
