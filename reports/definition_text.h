// Definitions of parameters and columns in dumps: the fields that both share, and the complete line
// of a column.
#pragma once

#include <cstdint>
#include <cstdio>
#include <iterator>

#include "reports/text_out.h"
#include "tables/table.h"
#include "values/value_type.h"

extern "C" {

// Writes a column's definition as one line.
//   PF_BADTYPE  no such value type; the line is incomplete
TEVPF_API TEVPF_STATUS TEV8R1_print_col_def(std::FILE* stream, const TEVPF_COLUMN* column) noexcept;
}

namespace tevpf {

inline constexpr char kNoValue[] = "@";  // stands for a field without a value
inline constexpr char kDescriptionIndent[] =
    "\t\t\t\t\t\t\t\t\t      ";  // up to the column where descriptions start

// How a value type appears in a definition.
struct TypeText {
  const char* word;
  std::int32_t digits;  // digits of the bounds of reals and doubles
};

// In the order of the type codes, from PF_TYPE_INT on.
inline constexpr TypeText kTypeTexts[] = {
    {"INT ", 0}, {"REAL", 5}, {"STG ", 0}, {"DBL ", 4}, {"SHT ", 0}};
static_assert(std::size(kTypeTexts) == kValueTypeCount);

constexpr const TypeText& type_text(std::int32_t type) noexcept {
  return kTypeTexts[type - PF_TYPE_INT];
}

// The fields that lists and tables show in the same way: name and units; a right-aligned number
// (reals and doubles with the given number of digits); precision, maximum and minimum.
void write_name_and_units(TextOut& out, const char (&name)[TEVPF_NAME_SIZE],
                          const char (&units)[TEVPF_UNITS_SIZE]) noexcept;

template <class T>
void write_number(TextOut& out, T number, std::int32_t width, std::int32_t digits) noexcept {
  if constexpr (kIsFloating<T>) {
    out.print(General{number, width, digits});
  } else {
    out.print(Right{number, width});
  }
}

// Writes the bounds of a parameter or column of type T; `part` holds them.
template <class T, class Part>
void write_bounds(TextOut& out, std::int32_t type, const Part& part,
                  std::int32_t max_width) noexcept {
  if constexpr (kIsFloating<T>) {
    out.print(Right{part.precision, 4}, ' ');
  } else {
    out.print(RightText{kNoValue, 4}, ' ');
  }
  write_number<T>(out, part.max, max_width, type_text(type).digits);
  out.print(' ');
  write_number<T>(out, part.min, 11, type_text(type).digits);
}

// The same fields for a string, which has no bounds.
void write_no_bounds(TextOut& out, std::int32_t max_width) noexcept;

// What TEV8R1_print_col_def does.
TEVPF_STATUS write_column_definition(TextOut& out, const TEVPF_COLUMN& column) noexcept;

// Writes the heading above column definitions.
void write_definitions_heading(TextOut& out) noexcept;

}  // namespace tevpf
