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

constexpr std::size_t kExactDigits = 15;  // every integer of so many digits is a double
constexpr std::int32_t kLeastPrecision = 6, kMostPrecision = 17;

bool is_digit(char c) { return c >= '0' && c <= '9'; }

// Whether reading text as a number would lose digits that may matter: leading zeros, and integers
// beyond what a double tells apart.
bool would_lose_digits(std::string_view text) {
  if (text.starts_with('-') || text.starts_with('+')) text.remove_prefix(1);
  if (text.size() > 1 && text[0] == '0' && is_digit(text[1])) return true;
  return text.size() > kExactDigits && std::all_of(text.begin(), text.end(), is_digit);
}

// Of a number's shortest text: without zeros at either end.
std::int32_t significant_digits(std::string_view text) {
  const std::string_view mantissa = text.substr(0, text.find('e'));
  static constexpr std::string_view kNotZero = "123456789";
  const std::size_t first = mantissa.find_first_of(kNotZero);
  if (first == std::string_view::npos) return 1;
  const std::string_view digits =
      mantissa.substr(first, mantissa.find_last_of(kNotZero) + 1 - first);
  return static_cast<std::int32_t>(std::count_if(digits.begin(), digits.end(), is_digit));
}

// Whether a bound says more than what the type can hold.
template <class Limit>
bool is_set(const Value& bound, const Limit& limit) {
  return std::visit(
      [&](const auto& value) {
        using T = std::decay_t<decltype(value)>;
        if constexpr (std::is_same_v<T, std::string>) {
          return false;
        } else {
          return limit(value, std::numeric_limits<T>());
        }
      },
      bound);
}

// In front of bounds that are set on one side only, and in no other text of bounds.
constexpr std::string_view kAtLeast = "at least ", kAtMost = "at most ";

bool is_one_sided(std::string_view bounds) {
  return bounds.starts_with(kAtLeast) || bounds.starts_with(kAtMost);
}

}  // namespace

bool is_floating(Type type) { return type == Type::float32 || type == Type::float64; }

Type guess_type(std::string_view text) {
  const std::string_view number = trimmed(text);
  Value value;
  if (would_lose_digits(number) || std::none_of(number.begin(), number.end(), is_digit)) {
    return Type::string;
  }
  for (const Type type : {Type::int32, Type::float64}) {
    if (parse_value(type, number, value) == Parsed::kValue) return type;
  }
  return Type::string;
}

Value zero_of(Type type) {
  Value zero = std::string();
  if (type != Type::string) parse_value(type, "0", zero);
  return zero;
}

std::int32_t precision_of(std::string_view number) {
  Value value;
  if (parse_value(Type::float64, number, value) != Parsed::kValue) return kLeastPrecision;
  return std::clamp(significant_digits(exact_text(value)), kLeastPrecision, kMostPrecision);
}

std::string with_article(Type type) {
  return std::string(type == Type::int32 ? "an " : "a ") + tevpf::to_string(type);
}

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
  std::string exact = exact_text(value);
  if (significant_digits(exact) <= precision) return exact;
  std::array<char, 64> buffer;
  const int length = std::snprintf(buffer.data(), buffer.size(), "%.*g", precision, number);
  return {buffer.data(), static_cast<std::size_t>(length)};
}

bool is_within(const Value& value, const std::optional<tevpf::Bounds>& bounds) {
  return !is_nan(value) && (!bounds || !(value < bounds->min || bounds->max < value));
}

bool is_nan(const Value& value) {
  return std::visit([](const auto& v) { return v != v; }, value);
}

double as_number(const Value& value) {
  return std::visit(
      [](const auto& v) -> double {
        if constexpr (std::is_same_v<std::decay_t<decltype(v)>, std::string>) {
          return std::nan("");
        } else {
          return v;
        }
      },
      value);
}

bool comes_before(const Value& a, const Value& b) {
  if (is_nan(a) || is_nan(b)) return !is_nan(a) && is_nan(b);
  return a < b;
}

bool has_min(const tevpf::Bounds& bounds) {
  return is_set(bounds.min, [](auto min, auto limits) { return min > limits.lowest(); });
}

bool has_max(const tevpf::Bounds& bounds) {
  return is_set(bounds.max, [](auto max, auto limits) { return max < limits.max(); });
}

std::string bounds_text(const std::optional<tevpf::Bounds>& bounds, const std::string& units) {
  const bool from = bounds && has_min(*bounds);
  const bool to = bounds && has_max(*bounds);
  if (!from && !to) return {};
  const std::string unit = units.empty() ? "" : " " + visible(units);
  if (!to) return std::string(kAtLeast) + exact_text(bounds->min) + unit;
  if (!from) return std::string(kAtMost) + exact_text(bounds->max) + unit;
  return exact_text(bounds->min) + " to " + exact_text(bounds->max) + unit;
}

std::string refused_value(const std::string& text, Parsed parsed, Type type,
                          const std::string& bounds) {
  if (parsed == Parsed::kNotANumber) {
    return in_quotes(text) + " is not " + with_article(type) +
           (bounds.empty()         ? ""
            : is_one_sided(bounds) ? "; give a number of " + bounds
                                   : "; give a number from " + bounds);
  }
  if (!bounds.empty()) {
    return visible(text) + " is out of range; it must " +
           (is_one_sided(bounds) ? "be " : "lie within ") + bounds;
  }
  return visible(text) + " does not fit " + with_article(type);
}

}  // namespace tool
