// What a text is as a number, without its value: what column could hold it.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "tevpf.hpp"

namespace tool {

inline constexpr std::int32_t kMostPrecision = 17;  // shows every double exactly

struct NumberText {
  bool is_number = false;   // one that no column of numbers would change
  bool is_integer = false;  // of 32 bits
  bool has_digits = false;  // not nan or inf
  bool is_infinity = false;
  std::int32_t precision = 1;  // significant digits that show it exactly
};

// `text` has no blanks around it. `point`: the point or the comma, whichever the decimals follow.
NumberText read_number_text(std::string_view text, char point);

// The type that a value most likely has: integer, else double, else string.
tevpf::Type guess_type(std::string_view text);

// Significant digits that show the number exactly, at least those of a new definition.
std::int32_t precision_for(std::string_view number);

// A number with its decimal comma as a point; empty when it has a point already.
std::string with_decimal_point(std::string_view text);

}  // namespace tool
