// What a text is as a number, without its value: what column could hold it.
#pragma once

#include <string>
#include <string_view>

namespace tool {

struct NumberText {
  bool is_number = false;   // one that no column of numbers would change
  bool is_integer = false;  // of 32 bits
  bool has_digits = false;  // not nan or inf
  bool is_infinity = false;
  int precision = 1;  // significant digits that show it exactly
};

// `text` has no blanks around it. `point`: the point or the comma, whichever the decimals follow.
NumberText read_number_text(std::string_view text, char point);

// A number with its decimal comma as a point; empty when it has a point already.
std::string with_decimal_point(std::string_view text);

}  // namespace tool
