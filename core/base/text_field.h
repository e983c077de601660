// Texts in fixed-size fields of records: names, units, descriptions.
#pragma once

#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <type_traits>

#include "core/base/text_word.h"
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

// Terminates a field from a file or a caller in its last byte if it has no terminator. No other
// byte changes.
template <std::size_t N>
void terminate_field(char (&field)[N]) noexcept {
  if (field[N - 1] != '\0' && std::memchr(field, '\0', N) == nullptr) field[N - 1] = '\0';
}

// Copies the text of a terminated name field with its terminator, and nothing behind it. This is
// strcpy without the call. Two possibly overlapping copies of n bytes cover any size from n to 2n.
[[gnu::always_inline]] inline void copy_name(char* to,
                                             const char (&field)[TEVPF_NAME_SIZE]) noexcept {
  constexpr std::size_t kWord = sizeof(std::uint64_t), kHalf = kWord / 2;
  const auto copy = [&](std::size_t at, auto size) { std::memcpy(to + at, field + at, size); };
  const auto whole = std::integral_constant<std::size_t, kWord>{};
  const auto half = std::integral_constant<std::size_t, kHalf>{};
  const auto size_in = [](std::uint64_t zeros) {
    return static_cast<std::size_t>(std::countr_zero(zeros)) / 8 + 1;
  };
  if (const std::uint64_t zeros = zero_bytes(load_word(field)); zeros != 0) {
    const std::size_t size = size_in(zeros);
    if (size < kHalf) {  // one to three bytes, of which some may be the same
      to[0] = field[0];
      to[size / 2] = field[size / 2];
      to[size - 1] = '\0';
      return;
    }
    copy(0, half);
    return copy(size - kHalf, half);
  }
  copy(0, whole);
  if (const std::uint64_t zeros = zero_bytes(load_word(field + kWord)); zeros != 0) {
    return copy(size_in(zeros), whole);
  }
  copy(kWord, whole);
  static_assert(TEVPF_NAME_SIZE == 2 * kWord + kHalf);
  copy(kHalf + size_in(zero_bytes(load_word(field + kWord + kHalf))), whole);
}

// Whether a field holds exactly this text; always false for texts of 8 or more characters. Most
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

// Element names are equal when the characters that are kept of them are equal.
inline bool same_element_name(const char* a, const char* b) noexcept {
  return std::strncmp(a, b, TEVPF_NAME_SIZE - 1) == 0;
}

}  // namespace tevpf
