// The five value types, values of them, and values as programs hand them in.
#pragma once

#include <charconv>
#include <cmath>
#include <concepts>
#include <cstdint>
#include <cstring>
#include <limits>
#include <optional>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>
#include <variant>

#include "../tevpf.h"
#include "error.hpp"

namespace tevpf {
inline namespace v1 {

enum class Type : std::int32_t {
  int32 = PF_TYPE_INT,
  float32 = PF_TYPE_REAL,
  string = PF_TYPE_STRING,
  float64 = PF_TYPE_DOUBLE,
  int16 = PF_TYPE_SHORT,
};

// A value of one of the five types.
using Value = std::variant<std::int32_t, std::int16_t, float, double, std::string>;

// Inclusive bounds of numbers; both values are of the number's type.
struct Bounds {
  Value min, max;
  bool operator==(const Bounds&) const = default;
};

// The C++ types of numbers, of all values, and of values as rows are read: where the text stays in place
// a string can be a std::string_view.
template <class T>
concept Number = std::same_as<T, std::int32_t> || std::same_as<T, std::int16_t> ||
    std::same_as<T, float> || std::same_as<T, double>;
template <class T>
concept Storable = Number<T> || std::same_as<T, std::string>;
template <class T>
concept Readable = Storable<T> || std::same_as<T, std::string_view>;

template <Readable T>
inline constexpr Type type_of = std::same_as<T, std::int32_t>   ? Type::int32
                                : std::same_as<T, std::int16_t> ? Type::int16
                                : std::same_as<T, float>        ? Type::float32
                                : std::same_as<T, double>       ? Type::float64
                                                                : Type::string;

inline Type type_of_value(const Value& value) {
  return std::visit([](const auto& v) { return type_of<std::remove_cvref_t<decltype(v)>>; }, value);
}

// "integer", "short", "real", "double", "string": the words of the library's messages.
constexpr const char* to_string(Type type) noexcept {
  switch (type) {
    case Type::int32:
      return "integer";
    case Type::int16:
      return "short";
    case Type::float32:
      return "real";
    case Type::float64:
      return "double";
    case Type::string:
      return "string";
  }
  return "unknown";
}

namespace detail {
// The integral types that are numbers.
template <class T>
concept Integer = std::integral<T> && !std::same_as<T, bool> && !std::same_as<T, char> &&
                  !std::same_as<T, wchar_t> && !std::same_as<T, char8_t> &&
                  !std::same_as<T, char16_t> && !std::same_as<T, char32_t>;
}  // namespace detail

// A value as it is handed in: any integer, floating-point number or text. It becomes a value of the
// type that the parameter or column has:
//   an integer    any type of numbers; PF_RANGE beyond an integer type's range
//   a fraction    real or double, rounded to the nearest; PF_RANGE beyond the range of a real
//   a text        string
// and PF_BADTYPE is thrown for every other pair. A text is not copied: a Cell lives as long as the
// call that it is an argument of.
class Cell {
 public:
  template <detail::Integer T>
  Cell(T number) noexcept {
    if (std::in_range<std::int64_t>(number)) {
      given_ = static_cast<std::int64_t>(number);
    } else {
      given_ = static_cast<double>(number);
    }
  }
  template <std::floating_point T>
  Cell(T number) noexcept : given_(static_cast<double>(number)) {}
  Cell(std::string_view text) noexcept : given_(text) {}
  Cell(const std::string& text) noexcept : given_(std::string_view(text)) {}
  Cell(const char* text) noexcept : given_(std::string_view(text)) {}
  Cell(const Value& value) noexcept {
    std::visit([this](const auto& v) { *this = Cell(v); }, value);
  }

  const std::variant<std::int64_t, double, std::string_view>& given() const noexcept {
    return given_;
  }

 private:
  std::variant<std::int64_t, double, std::string_view> given_;
};

namespace detail {

// What a value is meant for: "column" and its name.
struct Subject {
  std::string_view kind, name;
};

[[noreturn]] inline void raise_type(const Subject& subject, Type type) {
  std::string item(subject.kind);
  item += ' ';
  item += subject.name;
  throw Error(PF_BADTYPE, std::move(item), to_string(type));
}

template <class T>
[[noreturn]] void raise_range(const Subject& subject, T number) {
  char text[64];
  const auto end = std::to_chars(text, text + sizeof text, number).ptr;
  throw Error(PF_RANGE, std::string(text, end), std::string(subject.name));
}

template <class T>
inline constexpr T lowest = (std::numeric_limits<T>::lowest)();
template <class T>
inline constexpr T highest = (std::numeric_limits<T>::max)();

// Whether a number of another type has a place in T.
template <Number T>
bool fits(std::int64_t number) noexcept {
  if constexpr (std::integral<T>) {
    return std::in_range<T>(number);
  } else {
    return true;
  }
}
template <std::floating_point T>
bool fits(double number) noexcept {
  return !std::isfinite(number) || std::abs(number) <= static_cast<double>(highest<T>);
}

template <Number T>
T to_number(const Cell& cell, const Subject& subject) {
  return std::visit(
      [&](const auto& given) -> T {
        using Given = std::remove_cvref_t<decltype(given)>;
        if constexpr (std::same_as<Given, std::string_view> ||
                      (std::integral<T> && std::same_as<Given, double>)) {
          raise_type(subject, type_of<T>);
        } else {
          if (!fits<T>(given)) raise_range(subject, given);
          return static_cast<T>(given);
        }
      },
      cell.given());
}

// A text without NUL characters, which would end it early.
inline std::string_view to_text(const Cell& cell, const Subject& subject) {
  const auto* const text = std::get_if<std::string_view>(&cell.given());
  if (text == nullptr) raise_type(subject, Type::string);
  if (text->find('\0') != std::string_view::npos) {
    throw Error(PF_BADARG, std::string(*text), std::string(subject.name),
                "'" + std::string(subject.name) + "': a text cannot contain a NUL character");
  }
  return *text;
}

// Calls f with std::type_identity of the type in which values of `type` are kept in a Value.
template <class F>
decltype(auto) with_type(Type type, F&& f) {
  switch (type) {
    case Type::int32:
      return f(std::type_identity<std::int32_t>{});
    case Type::int16:
      return f(std::type_identity<std::int16_t>{});
    case Type::float32:
      return f(std::type_identity<float>{});
    case Type::float64:
      return f(std::type_identity<double>{});
    case Type::string:
      break;
  }
  return f(std::type_identity<std::string>{});
}

inline Value to_value(Type type, const Cell& cell, const Subject& subject) {
  return with_type(type, [&](auto tag) -> Value {
    using T = typename decltype(tag)::type;
    if constexpr (Number<T>) {
      return to_number<T>(cell, subject);
    } else {
      return std::string(to_text(cell, subject));
    }
  });
}

// The bytes that the C interface takes for a value.
inline const void* bytes_of(const Value& value) {
  return std::visit(
      [](const auto& v) -> const void* {
        if constexpr (std::same_as<std::remove_cvref_t<decltype(v)>, std::string>) {
          return v.c_str();
        } else {
          return &v;
        }
      },
      value);
}

// A value from where it lies in a row: at any address, a text with its terminator.
template <Readable T>
T load(const unsigned char* place) {
  if constexpr (Number<T>) {
    T value;
    std::memcpy(&value, place, sizeof value);
    return value;
  } else {
    return T(reinterpret_cast<const char*>(place));
  }
}

}  // namespace detail
}  // namespace v1
}  // namespace tevpf
