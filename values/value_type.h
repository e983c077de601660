// The five value types: maps their codes to properties and C++ types.
//
// Numeric differences are in a table (value_type); differences in code go through one dispatch with
// a typed tag (with_number). Strings are the fifth type and are always handled separately from the
// four number types.
#pragma once

#include <cstdint>
#include <cstring>
#include <iterator>
#include <type_traits>

#include "include/tevpf.h"

namespace tevpf {

struct ValueType {
  std::int32_t size;         // bytes of a value; strings: 0, as their width decides
  std::int32_t alignment;    // of a value in a row
  std::int32_t param_part;   // bytes of the stored type part of a parameter; strings: the length
  std::int32_t column_part;  // bytes of a column's stored limits
  const char* word;          // in the error context of conversions
};

// In the order of the type codes, starting at PF_TYPE_INT.
inline constexpr ValueType kValueTypes[] = {
    {4, 4, 12, 8, "integer"}, {4, 4, 16, 12, "real"}, {0, 1, 4, 0, ""},
    {8, 8, 28, 20, "double"}, {2, 2, 6, 4, "short"},
};

// The number of entries of every table in this order.
inline constexpr std::int32_t kValueTypeCount = std::size(kValueTypes);
static_assert(PF_TYPE_INT + kValueTypeCount - 1 == PF_TYPE_SHORT);

constexpr bool is_value_type(std::int32_t type) noexcept {
  return type >= PF_TYPE_INT && type < PF_TYPE_INT + kValueTypeCount;
}

// The properties of a valid type.
constexpr const ValueType& value_type(std::int32_t type) noexcept {
  return kValueTypes[type - PF_TYPE_INT];
}

// Bytes of one value of a valid type; 64 bits, so that no width overflows.
constexpr std::int64_t value_size(std::int32_t type, std::int32_t width) noexcept {
  return type == PF_TYPE_STRING ? std::int64_t{width} + 1 : value_type(type).size;
}

template <class T>
inline constexpr bool kIsFloating = std::is_floating_point_v<T>;

// Calls f with a value of the C++ type for a number's type code: int32_t, float, double or int16_t.
// The type must be one of the four numbers.
template <class F>
decltype(auto) with_number(std::int32_t type, F&& f) {
  switch (type) {
    case PF_TYPE_REAL:
      return f(float{});
    case PF_TYPE_DOUBLE:
      return f(double{});
    case PF_TYPE_SHORT:
      return f(std::int16_t{});
    default:
      return f(std::int32_t{});
  }
}

constexpr bool is_number_type(std::int32_t type) noexcept {
  return is_value_type(type) && type != PF_TYPE_STRING;
}

constexpr bool is_floating_type(std::int32_t type) noexcept {
  return type == PF_TYPE_REAL || type == PF_TYPE_DOUBLE;
}

// Values in rows and callers' buffers may be unaligned.
template <class T>
T load(const void* place) noexcept {
  static_assert(std::is_trivially_copyable_v<T>);
  T value;
  std::memcpy(&value, place, sizeof value);
  return value;
}

template <class T>
void store(void* place, T value) noexcept {
  static_assert(std::is_trivially_copyable_v<T>);
  std::memcpy(place, &value, sizeof value);
}

// The type part of a parameter definition, and the limits of a column definition, that hold a T.
// Their fields may be unaligned: copy them, do not point at them.
template <class T, class Def>
auto& number_part(Def& definition) noexcept {
  if constexpr (std::is_same_v<T, std::int32_t>) {
    return definition.part.i32;
  } else if constexpr (std::is_same_v<T, std::int16_t>) {
    return definition.part.i16;
  } else if constexpr (std::is_same_v<T, float>) {
    return definition.part.f32;
  } else {
    return definition.part.f64;
  }
}

static_assert(sizeof(TEVPF_PARAM_DEF{}.part.i32) == value_type(PF_TYPE_INT).param_part &&
              sizeof(TEVPF_PARAM_DEF{}.part.f32) == value_type(PF_TYPE_REAL).param_part &&
              sizeof(TEVPF_PARAM_DEF{}.part.f64) == value_type(PF_TYPE_DOUBLE).param_part &&
              sizeof(TEVPF_PARAM_DEF{}.part.i16) == value_type(PF_TYPE_SHORT).param_part);

template <class T, class Def>
auto& limits_of(Def& definition) noexcept {
  if constexpr (std::is_same_v<T, std::int32_t>) {
    return definition.limits.i32;
  } else if constexpr (std::is_same_v<T, std::int16_t>) {
    return definition.limits.i16;
  } else if constexpr (std::is_same_v<T, float>) {
    return definition.limits.f32;
  } else {
    return definition.limits.f64;
  }
}

}  // namespace tevpf
