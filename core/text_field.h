// Texts in the fixed fields of records: names, units, descriptions.
#pragma once

#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>

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

// Copies the text of a field of 20 bytes and its terminator, nothing behind it: whole words, the last one
// over the one before, since a walk over names would spend most of its time in calls to strlen and memcpy.
inline void copy_name(char* out, const char (&field)[20]) noexcept {
  const auto words = [](const char* place) {
    std::uint64_t word;
    std::memcpy(&word, place, sizeof word);
    return word;
  };
  const auto zero_byte = [](std::uint64_t word) {  // its number, at most 8
    const std::uint64_t zeros = (word - 0x0101010101010101u) & ~word & 0x8080808080808080u;
    return static_cast<std::size_t>(std::countr_zero(zeros)) / 8;
  };
  std::size_t end = zero_byte(words(field));
  if (end == 8) end += zero_byte(words(field + 8));
  if (end == 16) end = 12 + zero_byte(words(field + 12));
  if (end < 7) {
    std::memcpy(out, field, end + 1);
    return;
  }
  std::memcpy(out, field, 8);
  if (end > 15) std::memcpy(out + 8, field + 8, 8);
  std::memcpy(out + end - 7, field + end - 7, 8);
}

// Whether a field holds exactly this text, which has fewer than 8 characters; false when it is longer. Most
// names are short, and a call costs as much as eight steps.
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
  return std::strncmp(a, b, 19) == 0;
}

}  // namespace tevpf
