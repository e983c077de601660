// Numbers as text, the same on every platform and in every locale.
#pragma once

#include <cstdint>

namespace tevpf {

inline constexpr int kDefaultPrecision = 6;  // of "%g", and for a negative precision

// The largest precision used; larger ones are reduced to it.
inline constexpr int kMaxPrecision = 1100;

// Bytes for any number that write_general writes with that precision: sign, digits, decimal point,
// exponent and the leading zeros of a small number.
inline constexpr int kMaxNumberText = kMaxPrecision + 32;

// Write a number at `out` without a terminator and return the end of the text.
char* write_decimal(char* out, std::int64_t number) noexcept;  // as "%d", at most 20 bytes
char* write_general(char* out, double number, std::int32_t precision) noexcept;  // as "%.*g"

}  // namespace tevpf
