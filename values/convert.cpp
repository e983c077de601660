// Converts values to text and text to values. The locale affects only the white-space class and,
// for formats supplied by the caller, printf itself.
#include <cctype>
#include <cerrno>
#include <cfloat>
#include <charconv>
#include <clocale>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <limits>
#include <system_error>

#include "core/base/number_text.h"
#include "core/base/status.h"
#include "include/tevpf.h"
#include "values/value_type.h"

namespace tevpf {
namespace {

TEVPF_STATUS bad_type(std::int32_t type) noexcept { return fail(PF_BADTYPE, "value", Text(type)); }

bool is_space(char c) noexcept { return std::isspace(static_cast<unsigned char>(c)) != 0; }
bool is_digit(char c) noexcept { return c >= '0' && c <= '9'; }

// A whole text as an integer; empty text is 0. A text longer than `longest` is out of range,
// leading zeros and blanks included.
template <class T>
TEVPF_STATUS convert_integer(const char* text, std::int32_t type, std::size_t longest,
                             T& result) noexcept {
  char* end;
  const long long number = std::strtoll(text, &end, 10);
  const bool whole = *end == '\0' && (end != text || *text == '\0');
  if (!whole) return fail(PF_BADARG, text, value_type(type).word);
  using Limits = std::numeric_limits<T>;
  if (std::strlen(text) > longest || number < Limits::min() || number > Limits::max()) {
    return fail(PF_RANGE, text);
  }
  result = static_cast<T>(number);
  return PF_NORMAL;
}

#ifdef __cpp_lib_to_chars
using std::from_chars;
#else
// libc++ has none for reals before its version 20. The text ends in a zero byte, and starts with a digit
// or a point.
std::from_chars_result from_chars(const char* text, const char*, double& number) noexcept {
  if (text[0] == '0' && (text[1] == 'x' || text[1] == 'X')) {  // hexadecimal to strtod
    number = 0;
    return {text + 1, std::errc{}};
  }
  static const locale_t plain = newlocale(LC_ALL_MASK, "C", nullptr);
  char* end;
  errno = 0;
  const double read = strtod_l(text, &end, plain);
  if (end == text) return {text, std::errc::invalid_argument};
  if (errno == ERANGE) return {end, std::errc::result_out_of_range};
  number = read;
  return {end, std::errc{}};
}
#endif

enum class Number { kNone, kOutOfRange, kEmpty, kValue };

// Trailing characters make a text invalid only if its number is in range; a number out of range is
// reported as such whatever follows it. Subnormal numbers are out of range, as are those too large.
Number parse_double(const char* text, double& value) noexcept {
  if (*text == '\0') return Number::kEmpty;
  const char* start = text;
  while (is_space(*start)) ++start;
  const bool negative = *start == '-';
  if (*start == '-' || *start == '+') ++start;
  // Rejects infinities, NaN and a second sign.
  if (!is_digit(*start) && *start != '.') return Number::kNone;

  double magnitude = 0.0;
  const char* const text_end = start + std::strlen(start);
  const auto [end, error] = from_chars(start, text_end, magnitude);
  if (error == std::errc::result_out_of_range) return Number::kOutOfRange;
  if (error != std::errc{}) return Number::kNone;
  if (magnitude != 0.0 && magnitude < DBL_MIN) return Number::kOutOfRange;
  if (end != text_end) return Number::kNone;
  value = negative ? -magnitude : magnitude;
  return Number::kValue;
}

// As TEV8R1_convert_double, with the word for the type in the error context.
TEVPF_STATUS convert_floating(const char* text, std::int32_t type, double& result) noexcept {
  switch (parse_double(text, result)) {
    case Number::kNone:
      return fail(PF_BADARG, text, value_type(type).word);
    case Number::kOutOfRange:
      return fail(PF_RANGE, text);
    default:
      return PF_NORMAL;  // empty text leaves the result as it was
  }
}

TEVPF_STATUS real_from_text(const char* text, void* destination) noexcept {
  double number = 0.0;
  PF_TRY(convert_floating(text, PF_TYPE_REAL, number));
  if (std::fabs(number) > FLT_MAX) return fail(PF_RANGE, text);
  store(destination, static_cast<float>(number));
  return PF_NORMAL;
}

// Runs a conversion on an aligned value of its own, so that the destination may lie anywhere.
template <class T>
TEVPF_STATUS convert_into(void* destination, const char* text,
                          TEVPF_STATUS (*convert)(const char*, T*) noexcept) noexcept {
  T number = load<T>(destination);
  PF_TRY(convert(text, &number));
  store(destination, number);
  return PF_NORMAL;
}

// Formats with the caller's format, which takes exactly this argument; returns the length.
template <class Argument>
std::int32_t print(char* destination, const char* format, Argument argument) noexcept {
  const int length = std::snprintf(nullptr, 0, format, argument);
  if (length <= 0) {  // a format that fails writes nothing
    *destination = '\0';
    return 0;
  }
  std::snprintf(destination, static_cast<std::size_t>(length) + 1, format, argument);
  return length;
}

std::int32_t text_from_string(const char* format, const char* value, char* destination) noexcept {
  if (format != nullptr) return print(destination, format, value);
  const std::size_t length = std::strlen(value);
  std::memmove(destination, value, length + 1);
  return static_cast<std::int32_t>(length);
}

template <class T>
std::int32_t text_from_number(const char* format, T value, char* destination) noexcept {
  using Argument = std::conditional_t<kIsFloating<T>, double, int>;
  if (format != nullptr) return print(destination, format, static_cast<Argument>(value));
  char* end;
  if constexpr (kIsFloating<T>) {
    end = write_general(destination, static_cast<double>(value), kDefaultPrecision);
  } else {
    end = write_decimal(destination, value);
  }
  *end = '\0';
  return static_cast<std::int32_t>(end - destination);
}

}  // namespace
}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_compute_size(std::int32_t type, std::int32_t width,
                                 std::int32_t* size_out) noexcept {
  if (!is_value_type(type)) return bad_type(type);
  *size_out = static_cast<std::int32_t>(value_size(type, width));
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_convert_int(const char* text, std::int32_t* result) noexcept {
  const std::size_t longest = *text == '-' || *text == '+' ? 11 : 10;
  return convert_integer(text, PF_TYPE_INT, longest, *result);
}

TEVPF_STATUS TEV8R1_convert_short(const char* text, std::int16_t* result) noexcept {
  return convert_integer(text, PF_TYPE_SHORT, SIZE_MAX, *result);
}

TEVPF_STATUS TEV8R1_convert_double(const char* text, double* result) noexcept {
  return convert_floating(text, PF_TYPE_DOUBLE, *result);
}

TEVPF_STATUS TEV8R1_from_char(std::int32_t type, const char* text, void* destination) noexcept {
  switch (type) {
    case PF_TYPE_INT:
      return convert_into(destination, text, TEV8R1_convert_int);
    case PF_TYPE_REAL:
      return real_from_text(text, destination);
    case PF_TYPE_STRING:
      std::memmove(destination, text, std::strlen(text) + 1);
      return PF_NORMAL;
    case PF_TYPE_DOUBLE:
      return convert_into(destination, text, TEV8R1_convert_double);
    case PF_TYPE_SHORT:
      return convert_into(destination, text, TEV8R1_convert_short);
    default:
      return bad_type(type);
  }
}

TEVPF_STATUS TEV8R1_to_char(std::int32_t type, const char* format, const void* value,
                            char* destination, std::int32_t* length_out) noexcept {
  if (!is_value_type(type)) return bad_type(type);
  *length_out = type == PF_TYPE_STRING
                    ? text_from_string(format, static_cast<const char*>(value), destination)
                    : with_number(type, [&](auto tag) {
                        return text_from_number(format, load<decltype(tag)>(value), destination);
                      });
  return PF_NORMAL;
}
