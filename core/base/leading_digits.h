// The leading digits of a floating-point number, exactly rounded: the fast path for numbers of
// moderate magnitude.
#pragma once

#include <cstdint>

namespace tevpf {

inline constexpr int kMostLeadingDigits = 17;

struct LeadingDigits {
  std::uint64_t digits;   // exactly `count` digits; the decimal point follows the first
  std::int32_t exponent;  // decimal
};

// Rounds a positive finite number to `count` digits (1 .. kMostLeadingDigits), ties to even. False
// when exact arithmetic would need more than 128 bits because the number is too large or too small,
// and always when the compiler has no 128-bit integers.
[[nodiscard]] bool leading_digits(double number, std::int32_t count, LeadingDigits& out) noexcept;

}  // namespace tevpf
