// The first digits of a floating-point number, exactly rounded: the fast way for numbers of usual
// size.
#pragma once

#include <cstdint>

namespace tevpf {

inline constexpr int kMostLeadingDigits = 17;

struct LeadingDigits {
  std::uint64_t digits;   // exactly as many as asked for; the point stands behind the first
  std::int32_t exponent;  // decimal
};

// Rounds a positive finite number to so many digits (1 .. kMostLeadingDigits), ties to even. False
// when the number is so large or so small that exact arithmetic would need more than 128 bits, and
// always where the compiler has no integers of that size.
[[nodiscard]] bool leading_digits(double number, std::int32_t count, LeadingDigits& out) noexcept;

}  // namespace tevpf
