// Values of the five types outside the library: read from and written as text that reads back
// exactly.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <variant>

namespace tool {

using Value = std::variant<std::int32_t, std::int16_t, float, double, std::string>;

const char* type_word(std::int32_t type);  // integer, real, string, double, short
bool is_number(std::int32_t type);         // any of the four types that are not text
bool is_floating(std::int32_t type);       // real or double

// A value of the type from its binary form, at any address; texts end at their terminator.
Value load_value(std::int32_t type, const void* bytes);

enum class Parsed { kValue, kNotANumber, kOutOfRange };

// Reads text as a value of the type. Numbers may have blanks around them and a sign; "nan" and
// "inf" are numbers of the floating types.
Parsed parse_value(std::int32_t type, std::string_view text, Value& value);

// The shortest text that reads back as the same value.
std::string exact_text(const Value& value);

// Floating values with that many significant digits (0: exact), the others exact.
std::string display_text(const Value& value, std::int32_t precision);

bool is_nan(const Value& value);

// Numbers by size, what is not a number last; texts by their bytes. Both values are of one type.
bool comes_before(const Value& a, const Value& b);

}  // namespace tool
