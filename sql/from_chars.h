// std::from_chars for all numbers: libc++ has none for reals before its version 20.
#pragma once

#include <charconv>
#include <type_traits>

#ifndef __cpp_lib_to_chars
#include <cerrno>
#include <clocale>
#include <cmath>
#include <cstdlib>
#include <string>
#endif

namespace sql {

#ifndef __cpp_lib_to_chars
// By strtod, which reads more: blanks, a plus sign and hexadecimal digits do not belong to the number.
template <class Real>
std::from_chars_result real_from_chars(const char* first, const char* last, Real& number) {
  std::string text(first, last);
  if (const auto hex = text.find_first_of("xX"); hex != text.npos) text.resize(hex);
  if (text.empty() || text[0] <= ' ' || text[0] == '+') return {first, std::errc::invalid_argument};
  static const locale_t plain = newlocale(LC_ALL_MASK, "C", nullptr);
  char* end = nullptr;
  Real read = 0;
  errno = 0;
  if constexpr (std::is_same_v<Real, float>) {
    read = strtof_l(text.c_str(), &end, plain);
  } else {
    read = strtod_l(text.c_str(), &end, plain);
  }
  const char* const behind = first + (end - text.c_str());
  if (behind == first) return {first, std::errc::invalid_argument};
  if (errno == ERANGE && (read == 0 || std::isinf(read))) {
    return {behind, std::errc::result_out_of_range};
  }
  number = read;
  return {behind, std::errc{}};
}
#endif

template <class Number>
std::from_chars_result from_chars(const char* first, const char* last, Number& number) {
#ifndef __cpp_lib_to_chars
  if constexpr (std::is_floating_point_v<Number>) {
    return real_from_chars(first, last, number);
  } else {
    return std::from_chars(first, last, number);
  }
#else
  return std::from_chars(first, last, number);
#endif
}

}  // namespace sql
