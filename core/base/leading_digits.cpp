// A number is m * 2^e with m below 2^53, and 10^q is 5^q * 2^q. For |q| up to 27, 5^q fits 64 bits,
// so m * 2^e * 10^q is a product or quotient of at most 128 bits and is rounded exactly, without an
// error estimate.
#include "core/base/leading_digits.h"

#include <bit>

namespace tevpf {

#ifdef __SIZEOF_INT128__

namespace {

__extension__ using Wide = unsigned __int128;

constexpr int kMostPower = 27;
constexpr int kMantissaBits = 52;
constexpr int kExponentBias = 1023 + kMantissaBits;

struct Powers {
  std::uint64_t of5[kMostPower + 1];
  std::uint64_t of10[kMostLeadingDigits + 1];
};
constexpr Powers make_powers() noexcept {
  Powers powers{};
  powers.of5[0] = powers.of10[0] = 1;
  for (int n = 1; n <= kMostPower; ++n) powers.of5[n] = powers.of5[n - 1] * 5;
  for (int n = 1; n <= kMostLeadingDigits; ++n) powers.of10[n] = powers.of10[n - 1] * 10;
  return powers;
}
constexpr Powers kPowers = make_powers();

std::uint64_t rounded_shift(Wide number, int bits) noexcept {
  const auto floor = static_cast<std::uint64_t>(number >> bits);
  const Wide rest = number & ((Wide{1} << bits) - 1);
  const Wide half = Wide{1} << (bits - 1);
  return floor + (rest > half || (rest == half && floor % 2 == 1) ? 1 : 0);
}

std::uint64_t rounded_quotient(Wide number, Wide divisor) noexcept {
  const Wide floor = number / divisor;
  const Wide rest = number - floor * divisor;
  const bool up = rest > divisor - rest || (rest == divisor - rest && floor % 2 == 1);
  return static_cast<std::uint64_t>(floor) + (up ? 1 : 0);
}

// m * 2^e * 10^q rounded; the result is known to be at least about 1 and below 2^63.
std::uint64_t scaled(std::uint64_t m, int e, int q) noexcept {
  const int shift = e + q;
  if (q >= 0) {
    const Wide product = Wide{m} * kPowers.of5[q];
    return shift >= 0 ? static_cast<std::uint64_t>(product << shift)
                      : rounded_shift(product, -shift);
  }
  const Wide divisor = kPowers.of5[-q];
  return shift >= 0 ? rounded_quotient(Wide{m} << shift, divisor)
                    : rounded_quotient(m, divisor << -shift);
}

}  // namespace

bool leading_digits(double number, std::int32_t count, LeadingDigits& out) noexcept {
  const auto bits = std::bit_cast<std::uint64_t>(number);
  const int biased = static_cast<int>(bits >> kMantissaBits);
  if (biased == 0) return false;  // subnormal: too small for 128 bits
  const int e = biased - kExponentBias;
  const std::uint64_t m =
      (bits & ((std::uint64_t{1} << kMantissaBits) - 1)) | (std::uint64_t{1} << kMantissaBits);

  // floor(log10(2^b)), correct for |b| up to several hundred; that of the number may be one more.
  std::int32_t exponent = ((e + kMantissaBits) * 78913) >> 18;
  int q = count - 1 - exponent;
  if (q > kMostPower || q <= -kMostPower) return false;
  std::uint64_t digits = scaled(m, e, q);
  if (digits >= kPowers.of10[count]) {
    ++exponent;
    digits = scaled(m, e, --q);
  }
  out = {digits, exponent};
  return true;
}

#else

bool leading_digits(double, std::int32_t, LeadingDigits&) noexcept { return false; }

#endif

}  // namespace tevpf
