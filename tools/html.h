// Texts and values as parts of an HTML page.
#pragma once

#include <cstddef>
#include <cstdint>
#include <initializer_list>
#include <string>
#include <string_view>

#include "values.h"

namespace tool {

// A text made visible, in which nothing is markup: for content and for attributes in double quotes.
std::string html_text(std::string_view text);

// An opening tag. Values of attributes are HTML already.
struct HtmlAttribute {
  std::string_view name;
  std::string value;
};
std::string html_tag(std::string_view name, std::initializer_list<HtmlAttribute> attributes);

// A cell of a table. A number has the digits of its precision, and all of them in its title where
// these are fewer.
std::string html_cell(const Value& value, std::int32_t precision);
std::string html_cell(std::string_view text);

// Digits in groups of three, for people: "1 000 000".
std::string grouped(std::uintmax_t count);
std::string counted_in_groups(std::uintmax_t count,
                              std::string_view noun);  // "1 row", "1 000 rows"

// The heading of a column, with the unit of its values in brackets.
std::string html_heading(std::string_view name, std::string_view units, bool is_number);

}  // namespace tool
