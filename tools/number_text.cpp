#include "number_text.h"

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdint>

#include "values.h"

namespace tool {
namespace {

constexpr int kExactDigits = 15;  // every number of so many digits is that of one double alone

bool is_digit(char c) { return c >= '0' && c <= '9'; }

int significant_digits(double number) {
  const std::string text = exact_text(number);
  const std::string_view mantissa = std::string_view(text).substr(0, text.find('e'));
  const std::size_t first = mantissa.find_first_of("123456789");
  if (first == std::string_view::npos) return 1;
  return static_cast<int>(std::count_if(mantissa.begin() + static_cast<std::ptrdiff_t>(first),
                                        mantissa.end(), is_digit));
}

// Digits that a number would lose make a text: leading zeros, and integers beyond what a double
// tells apart.
bool would_lose_digits(std::string_view text) {
  if (text.front() == '-' || text.front() == '+') text.remove_prefix(1);
  if (text.size() > 1 && text[0] == '0' && is_digit(text[1])) return true;
  return text.size() > kExactDigits && std::all_of(text.begin(), text.end(), is_digit);
}

// By converting it.
NumberText read_any(std::string_view text) {
  double number = 0;
  if (would_lose_digits(text) || parse_number(text, number) != Parsed::kValue) return {};
  NumberText result{true};
  result.has_digits = std::any_of(text.begin(), text.end(), is_digit);
  result.is_infinity = std::isinf(number);
  if (!result.has_digits) return result;
  std::int32_t integer = 0;
  result.is_integer = parse_number(text, integer) == Parsed::kValue;
  result.precision = significant_digits(number);
  return result;
}

// The usual ones by their digits: a sign, few digits, and a point among them. False for others.
bool read_plain(std::string_view text, char point, NumberText& result) {
  constexpr int kSureDigits = 9;  // fit 32 bits
  if (text.size() > kExactDigits + 2) return false;
  std::size_t at = text[0] == '-' || text[0] == '+' ? 1 : 0;
  if (at + 1 < text.size() && text[at] == '0' && is_digit(text[at + 1])) return false;
  int digits = 0, trailing_zeros = 0, significant = 0;
  bool has_point = false;
  for (; at < text.size(); ++at) {
    const char byte = text[at];
    if (byte == point && !has_point) {
      has_point = true;
      continue;
    }
    if (!is_digit(byte)) return false;
    ++digits;
    if (byte != '0') {
      significant += (significant > 0 ? trailing_zeros : 0) + 1;
      trailing_zeros = 0;
    } else {
      ++trailing_zeros;
    }
  }
  if (digits == 0 || digits > kExactDigits) return false;
  if (!has_point && digits > kSureDigits) return false;
  result = {true, !has_point, true, false, std::max(significant, 1)};
  return true;
}

}  // namespace

NumberText read_number_text(std::string_view text, char point) {
  NumberText result;
  if (read_plain(text, point, result)) return result;
  if (point == '.') return read_any(text);
  const std::string plain = with_decimal_point(text);
  return plain.empty() ? NumberText{} : read_any(plain);
}

std::string with_decimal_point(std::string_view text) {
  if (text.find('.') != std::string_view::npos) return {};
  std::string result(text);
  std::replace(result.begin(), result.end(), ',', '.');
  return result;
}

}  // namespace tool
