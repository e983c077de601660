// Definitions of columns, and the numbers in definitions.
#pragma once

#include <cstdint>
#include <cstring>

#include "include/tevpf.h"
#include "values/value_type.h"

namespace tevpf {

inline constexpr std::int32_t kInt = PF_TYPE_INT, kReal = PF_TYPE_REAL, kText = PF_TYPE_STRING,
                              kDouble = PF_TYPE_DOUBLE;

struct Bounds {
  double min = -1000, max = 1000;
  std::int32_t precision = 6;
};

// Fills the part of a parameter or the limits of a column; an integer keeps the low bits of what it
// cannot hold.
template <class T, class Part>
void put_numbers(Part& part, Bounds bounds, [[maybe_unused]] double value = 0) {
  using Wide = std::conditional_t<kIsFloating<T>, double, std::int64_t>;
  part.max = static_cast<T>(static_cast<Wide>(bounds.max));
  part.min = static_cast<T>(static_cast<Wide>(bounds.min));
  if constexpr (kIsFloating<T>) part.precision = bounds.precision;
  if constexpr (requires { part.value; }) part.value = static_cast<T>(static_cast<Wide>(value));
}

inline TEVPF_COL_DEF col(const char* name, std::int32_t type, std::int32_t width = 6,
                         Bounds bounds = {}) {
  TEVPF_COL_DEF def{};
  def.type = type;
  std::strncpy(def.name, name, sizeof def.name - 1);
  def.width = width;
  if (!is_number_type(type)) return def;
  with_number(type, [&](auto t) { put_numbers<decltype(t)>(limits_of<decltype(t)>(def), bounds); });
  return def;
}

inline TEVPF_COL_DEF indexed(TEVPF_COL_DEF def, bool unique = false) {
  def.idx_flag = 1;
  def.unq_flag = unique;
  return def;
}

inline TEVPF_COL_DEF described(TEVPF_COL_DEF def, const char* text) {
  def.description = const_cast<char*>(text);
  return def;
}

}  // namespace tevpf
