// std::to_chars ignores the locale and writes the same bytes as printf, identically on every
// platform. Common floating-point numbers take a faster path to the same bytes.
#include "core/base/number_text.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstring>

#include "core/base/leading_digits.h"

namespace tevpf {

namespace {

constexpr int kMaxDecimal = 20;
constexpr std::int32_t kLeastPlainExponent = -4;  // smaller numbers are written with an exponent

char* copy_digits(char* out, const char* first, const char* last) noexcept {
  while (first != last) *out++ = *first++;
  return out;
}

char* write_exponent(char* out, std::int32_t exponent) noexcept {
  *out++ = 'e';
  *out++ = exponent < 0 ? '-' : '+';
  const std::int32_t size = exponent < 0 ? -exponent : exponent;
  if (size < 10) *out++ = '0';
  return write_decimal(out, size);
}

// Writes digits as "%g" does: without trailing zeros after the decimal point.
char* write_digits(char* out, const LeadingDigits& number, std::int32_t precision) noexcept {
  char text[kMaxDecimal];
  const char* const all = write_decimal(text, static_cast<std::int64_t>(number.digits));
  const char* end = all;
  while (end[-1] == '0') --end;
  const std::int32_t exponent = number.exponent;
  if (exponent < kLeastPlainExponent || exponent >= precision) {
    *out++ = text[0];
    if (end - text > 1) *out++ = '.';
    return write_exponent(copy_digits(out, text + 1, end), exponent);
  }
  if (exponent < 0) {
    constexpr char kZeros[] = "0.000";
    return copy_digits(copy_digits(out, kZeros, kZeros + 1 - exponent), text, end);
  }
  const char* const point = text + exponent + 1;
  out = copy_digits(out, text, point);
  if (end > point) {
    *out++ = '.';
    out = copy_digits(out, point, end);
  }
  return out;
}

}  // namespace

char* write_decimal(char* out, std::int64_t number) noexcept {
  const auto small = static_cast<std::int32_t>(number);  // 32-bit divisions are cheaper
  if (small == number) return std::to_chars(out, out + kMaxDecimal, small).ptr;
  return std::to_chars(out, out + kMaxDecimal, number).ptr;
}

char* write_general(char* out, double number, std::int32_t precision) noexcept {
  const std::int32_t digits =
      precision < 0 ? kDefaultPrecision : std::min(precision, kMaxPrecision);
  if (std::isnan(number)) {  // libc++ names its kind as well
    if (std::signbit(number)) *out++ = '-';
    std::memcpy(out, "nan", 3);
    return out + 3;
  }
  LeadingDigits leading;
  const double size = number < 0 ? -number : number;
  if (digits > 0 && digits <= kMostLeadingDigits && size > 0 &&
      leading_digits(size, digits, leading)) {
    if (number < 0) *out++ = '-';
    return write_digits(out, leading, digits);
  }
  return std::to_chars(out, out + kMaxNumberText, number, std::chars_format::general, digits).ptr;
}

}  // namespace tevpf
