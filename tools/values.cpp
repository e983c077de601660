#include "values.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdio>
#include <limits>
#include <type_traits>

namespace tool {
namespace {

template <class T>
Parsed parse_as(std::string_view text, Value& value) {
  T number{};
  const Parsed parsed = parse_number(text, number);
  if (parsed == Parsed::kValue) value = number;
  return parsed;
}

bool is_whole_range(const tevpf::Bounds& bounds) {
  return std::visit(
      [&](const auto& min) {
        using T = std::decay_t<decltype(min)>;
        if constexpr (std::is_same_v<T, std::string>) {
          return true;
        } else {
          return min <= std::numeric_limits<T>::lowest() &&
                 std::get<T>(bounds.max) >= std::numeric_limits<T>::max();
        }
      },
      bounds.min);
}

}  // namespace

bool is_floating(Type type) { return type == Type::float32 || type == Type::float64; }

Parsed parse_value(Type type, std::string_view text, Value& value) {
  switch (type) {
    case Type::int32:
      return parse_as<std::int32_t>(text, value);
    case Type::int16:
      return parse_as<std::int16_t>(text, value);
    case Type::float32:
      return parse_as<float>(text, value);
    case Type::float64:
      return parse_as<double>(text, value);
    case Type::string:
      break;
  }
  value = std::string(text);
  return Parsed::kValue;
}

std::string exact_text(const Value& value) {
  return std::visit(
      [](const auto& v) -> std::string {
        if constexpr (std::is_same_v<std::decay_t<decltype(v)>, std::string>) {
          return v;
        } else {
          // The sign of what is not a number carries no meaning: "nan" for all of them.
          if (v != v) return "nan";
          std::array<char, 64> buffer;
          return {buffer.data(),
                  std::to_chars(buffer.data(), buffer.data() + buffer.size(), v).ptr};
        }
      },
      value);
}

std::string display_text(const Value& value, std::int32_t precision) {
  const double* wide = std::get_if<double>(&value);
  const float* narrow = std::get_if<float>(&value);
  if (precision < 1 || is_nan(value) || (wide == nullptr && narrow == nullptr)) {
    return exact_text(value);
  }
  const double number = wide != nullptr ? *wide : static_cast<double>(*narrow);
  std::array<char, 64> buffer;
  // More digits than tell all doubles apart say nothing.
  const int length =
      std::snprintf(buffer.data(), buffer.size(), "%.*g", std::min(precision, 17), number);
  return {buffer.data(), static_cast<std::size_t>(length)};
}

bool is_nan(const Value& value) {
  return std::visit([](const auto& v) { return v != v; }, value);
}

bool comes_before(const Value& a, const Value& b) {
  if (is_nan(a) || is_nan(b)) return !is_nan(a) && is_nan(b);
  return a < b;
}

std::string bounds_text(const std::optional<tevpf::Bounds>& bounds, const std::string& units) {
  if (!bounds || is_whole_range(*bounds)) return {};
  return exact_text(bounds->min) + " to " + exact_text(bounds->max) +
         (units.empty() ? "" : " " + visible(units));
}

std::string refused_value(const std::string& text, Parsed parsed, Type type,
                          const std::string& bounds) {
  const std::string word = tevpf::to_string(type);
  const std::string article = type == Type::int32 ? "an " : "a ";
  if (parsed == Parsed::kNotANumber) {
    return in_quotes(text) + " is not " + article + word +
           (bounds.empty() ? "" : "; give a number from " + bounds);
  }
  if (!bounds.empty()) return visible(text) + " is out of range; it must lie within " + bounds;
  return visible(text) + " does not fit " + article + word;
}

}  // namespace tool
