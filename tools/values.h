// Values as text: read, and written so that they read back exactly.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <system_error>

#include "sql/from_chars.h"
#include "tevpf.hpp"
#include "text.h"

namespace tool {

using tevpf::Type;
using tevpf::Value;

// The type of that name: "integer", "double"; also by its size, "int32".
std::optional<Type> type_named(std::string_view word);

bool is_floating(Type type);  // real or double

Value zero_of(Type type);  // 0, or the empty text

// "an integer", "a double".
std::string with_article(Type type);

enum class Parsed { kValue, kNotANumber, kOutOfRange };

// Reads text as a value of the type. Numbers may have blanks around them and a sign; "nan" and
// "inf" are numbers of the floating types.
Parsed parse_value(Type type, std::string_view text, Value& value);
template <class T>
Parsed parse_number(std::string_view text, T& number);

// The shortest text that reads back as the same value.
std::string exact_text(const Value& value);

// Of a number as exact_text writes it: its digits without zeros at either end, at least 1.
std::int32_t significant_digits(std::string_view exact);

// Floating values with that many significant digits (0: exact), or fewer when these are exact; the
// others exact.
std::string display_text(const Value& value, std::int32_t precision);

bool is_nan(const Value& value);

// A number as a double, which holds all of them exactly; a text is not a number.
double as_number(const Value& value);

// Whether a parameter may have the value: what is not a number lies outside all bounds.
bool is_within(const Value& value, const std::optional<tevpf::Bounds>& bounds);

// Numbers by size, what is not a number last; texts by their bytes. Both values are of one type.
bool comes_before(const Value& a, const Value& b);

// Whether the bounds say more than what the type can hold.
bool has_min(const tevpf::Bounds& bounds);
bool has_max(const tevpf::Bounds& bounds);

// "0 to 3000 rpm", "at least 0 kg"; empty when the bounds only say what the type can hold.
std::string bounds_text(const std::optional<tevpf::Bounds>& bounds, const std::string& units);

// Why a text is refused that is no value of the type, or lies outside the bounds: the end of a
// sentence. `bounds`: their text.
std::string refused_value(const std::string& text, Parsed parsed, Type type,
                          const std::string& bounds);

// The same for a value of a parameter or a column.
template <class Definition>
std::string refused_value(const std::string& text, Parsed parsed, const Definition& definition) {
  return refused_value(text, parsed, definition.type(),
                       bounds_text(definition.bounds(), definition.units()));
}

// ---- Implementation ---------------------------------------------------------------------------

template <class T>
Parsed parse_number(std::string_view text, T& number) {
  const bool may_have_blanks = !text.empty() && (text.front() <= ' ' || text.back() <= ' ');
  if (may_have_blanks) text = trimmed(text);
  if (text.size() > 1 && text[0] == '+' && text[1] != '-') text.remove_prefix(1);
  const auto [end, error] = sql::from_chars(text.data(), text.data() + text.size(), number);
  if (error == std::errc::invalid_argument || end != text.data() + text.size()) {
    return Parsed::kNotANumber;
  }
  return error == std::errc{} ? Parsed::kValue : Parsed::kOutOfRange;
}

}  // namespace tool
