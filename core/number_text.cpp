// std::to_chars knows no locale and gives printf's bytes, except that it does so on every platform.
#include "core/number_text.h"

#include <algorithm>
#include <charconv>

namespace tevpf {

namespace {
constexpr std::int32_t kUsualPrecision = 6;
constexpr int kMaxDecimal = 20;
}  // namespace

char* write_decimal(char* out, std::int64_t number) noexcept {
  return std::to_chars(out, out + kMaxDecimal, number).ptr;
}

char* write_general(char* out, double number, std::int32_t precision) noexcept {
  const std::int32_t digits =
      precision < 0 ? kUsualPrecision : std::min(precision, std::int32_t{kMaxPrecision});
  return std::to_chars(out, out + kMaxNumberText, number, std::chars_format::general, digits).ptr;
}

}  // namespace tevpf
