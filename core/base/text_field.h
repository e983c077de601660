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

// The size in bytes of the text in a terminated field, terminator included. Scans eight bytes per
// step.
template <std::size_t N>
std::size_t text_bytes(const char (&field)[N]) noexcept {
  constexpr std::size_t kWord = sizeof(std::uint64_t), kLast = N - kWord;
  for (std::size_t at = 0; at < kLast; at += kWord) {
    const std::uint64_t zeros = zero_bytes(load_word(field + at));
    if (zeros != 0) return at + static_cast<std::size_t>(std::countr_zero(zeros)) / 8 + 1;
  }
  const std::uint64_t zeros = zero_bytes(load_word(field + kLast));
  return kLast + static_cast<std::size_t>(std::countr_zero(zeros)) / 8 + 1;
}

// Copies the text of a terminated field of at most 24 bytes, with its terminator and nothing after
// it. This is strcpy without the call. Two possibly overlapping copies of n bytes cover any size
// from n to 2n.
template <std::size_t N>
void copy_field_text(char* to, const char (&field)[N]) noexcept {
  static_assert(N <= 24);
  const std::size_t bytes = text_bytes(field);
  const auto copy_ends = [&](auto size) {
    std::memcpy(to, field, size);
    std::memcpy(to + bytes - size, field + bytes - size, size);
  };
  if (bytes > 16) {
    std::memcpy(to + 8, field + 8, 8);
    copy_ends(std::integral_constant<std::size_t, 8>{});
  } else if (bytes >= 8) {
    copy_ends(std::integral_constant<std::size_t, 8>{});
  } else if (bytes >= 4) {
    copy_ends(std::integral_constant<std::size_t, 4>{});
  } else {
    for (std::size_t i = 0; i < bytes; ++i) to[i] = field[i];
  }
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
