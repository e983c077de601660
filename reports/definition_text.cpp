#include "reports/definition_text.h"

#include "core/base/status.h"
#include "reports/display.h"

namespace tevpf {

namespace {

constexpr std::int32_t kDescriptionWidth = 54;

}  // namespace

void write_name_and_units(TextOut& out, const char (&name)[TEVPF_NAME_SIZE],
                          const char (&units)[TEVPF_UNITS_SIZE]) noexcept {
  out.print(' ', LeftText{field_text(name), 19}, ' ',
            LeftText{units[0] == '\0' ? kNoValue : field_text(units), 7}, ' ');
}

void write_no_bounds(TextOut& out, std::int32_t max_width) noexcept {
  out.print(RightText{kNoValue, 4}, ' ', RightText{kNoValue, max_width}, ' ',
            RightText{kNoValue, 11});
}

TEVPF_STATUS write_column_definition(TextOut& out, const TEVPF_COLUMN& column) noexcept {
  const TEVPF_COL_DEF& def = column.def;
  write_name_and_units(out, def.name, def.units);
  if (!is_value_type(def.type)) return fail(PF_BADTYPE, "column", Text(def.type));

  out.print(type_text(def.type).word, "  ", Right{def.width, 5}, ' ');
  if (is_number_type(def.type)) {
    with_number(def.type, [&](auto tag) {
      using T = decltype(tag);
      write_bounds<T>(out, def.type, limits_of<T>(def), 11);
    });
  } else {
    write_no_bounds(out, 11);
  }
  out.print(is_indexed(column) ? "  T " : "  F ", is_unique(column) ? "  T  " : "  F  ");
  if (def.description != nullptr) {
    write_wrapped(out, FirstLine::kGoesOn, kDescriptionWidth, def.description, kDescriptionIndent);
  } else {
    out.print(kNoValue);
  }
  out.print('\n');
  return PF_NORMAL;
}

void write_definitions_heading(TextOut& out) noexcept {
  out.print(
      ".                              COLUMN DEFINITIONS\n\n"
      "    Column_name       Units  Type  Width Prec     Max         Min"
      "     Idx Unq\t\tDescription\n"
      ".",
      Repeat{'-', 106}, "\n\n");
}

}  // namespace tevpf

TEVPF_STATUS TEV8R1_print_col_def(std::FILE* stream, const TEVPF_COLUMN* column) noexcept {
  tevpf::TextOut out(stream, tevpf::TextOut::Size::kLine);
  return tevpf::write_column_definition(out, *column);
}
