#include "values.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <type_traits>

#include "tevpf.h"
#include "text.h"

namespace tool {
namespace {

template <class T>
T load(const void* bytes) {
  T value;
  std::memcpy(&value, bytes, sizeof value);
  return value;
}

template <class T>
Parsed parse_number(std::string_view text, Value& value) {
  text = trimmed(text);
  if (text.size() > 1 && text[0] == '+' && text[1] != '-') text.remove_prefix(1);
  T number{};
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
  if (error == std::errc::invalid_argument || end != text.data() + text.size()) {
    return Parsed::kNotANumber;
  }
  if (error != std::errc{}) return Parsed::kOutOfRange;
  value = number;
  return Parsed::kValue;
}

}  // namespace

const char* type_word(std::int32_t type) {
  switch (type) {
    case PF_TYPE_INT:
      return "integer";
    case PF_TYPE_REAL:
      return "real";
    case PF_TYPE_STRING:
      return "string";
    case PF_TYPE_DOUBLE:
      return "double";
    case PF_TYPE_SHORT:
      return "short";
    default:
      return "unknown";
  }
}

bool is_number(std::int32_t type) { return type != PF_TYPE_STRING; }

bool is_floating(std::int32_t type) { return type == PF_TYPE_REAL || type == PF_TYPE_DOUBLE; }

Value load_value(std::int32_t type, const void* bytes) {
  switch (type) {
    case PF_TYPE_INT:
      return load<std::int32_t>(bytes);
    case PF_TYPE_SHORT:
      return load<std::int16_t>(bytes);
    case PF_TYPE_REAL:
      return load<float>(bytes);
    case PF_TYPE_DOUBLE:
      return load<double>(bytes);
    default:
      return std::string(static_cast<const char*>(bytes));
  }
}

Parsed parse_value(std::int32_t type, std::string_view text, Value& value) {
  switch (type) {
    case PF_TYPE_INT:
      return parse_number<std::int32_t>(text, value);
    case PF_TYPE_SHORT:
      return parse_number<std::int16_t>(text, value);
    case PF_TYPE_REAL:
      return parse_number<float>(text, value);
    case PF_TYPE_DOUBLE:
      return parse_number<double>(text, value);
    default:
      value = std::string(text);
      return Parsed::kValue;
  }
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

}  // namespace tool
