#include "reports/table_dump.h"

#include <algorithm>

#include "core/library.h"
#include "reports/debug_text.h"
#include "reports/definition_text.h"
#include "reports/report_file.h"
#include "reports/row_text.h"
#include "reports/segments.h"
#include "tables/column_index.h"
#include "tables/directory.h"
#include "tables/row_store.h"
#include "tables/settle.h"

namespace tevpf {

namespace {

void write_debug_fields(TextOut& out, const TEVPF_TABLE& table) noexcept {
  out.print("btf = ", table.header.btf, '\n');
  out.print("row wid = ", table.row_wid, '\n');
  out.print("dsp_wid = ", table.dsp_wid, '\n');
  out.print("RESERVED = ", table.RESERVED, '\n');
  out.print("free_rows = ", table.free_rows, '\n');
  out.print("next_row = ", table.next_row, '\n');
  out.print("cur_row = ", table.cur_row, '\n');
  out.print("mod = ", table.mod, '\n');
  out.print("extra_bytes = ", table.extra_bytes, '\n');
  out.print("cur_col = ", table.cur_col == nullptr ? kNoValue : field_text(table.cur_col->def.name),
            "\n\n\n");
}

void write_debug_column(TextOut& out, const TEVPF_TABLE& table,
                        const TEVPF_COLUMN& column) noexcept {
  out.print("offset = ", column.offset, '\n');
  out.print("col_ptr->RESERVED = ", RightText{field_text(column.RESERVED), 2}, '\n');
  out.print("desc flag = ", column.desc_flag, '\n');
  out.print("format = ", column.format, '\n');
  if (is_floating_type(column.def.type)) {
    out.print("tolerance = ", General{column.tolerance, 0, kDefaultPrecision}, '\n');
  }
  const std::int32_t* const entries = index_entries(column);
  out.print("idx_ptr = ", address_of(entries), '\n');
  if (column.def.idx_flag == 1 && entries != nullptr) {
    write_index_entries(out, entries, table.num_rows);
  }
}

void write_columns(TextOut& out, const TEVPF_TABLE& table) noexcept {
  write_definitions_heading(out);
  for (std::int32_t n = 0; n < table.num_cols; ++n) {
    write_column_definition(out, table.col_array[n]);
    if (library.debug_value != nullptr) write_debug_column(out, table, table.col_array[n]);
  }
}

TEVPF_STATUS write_rows(TextOut& out, const TEVPF_TABLE& table) noexcept {
  RowText rows;
  Segments segments;
  if (!rows.take_all(table) || !rows.prepare(StringPadding::kDump) ||
      !segments.cut(rows, table.dsp_wid, kDumpPage)) {
    return fail_empty(PF_NOMEM);
  }
  rows.write_heading();
  segments.write_heading(out, rows.line());
  out.print('\n');
  if (library.debug_value != nullptr && table.dft_row != nullptr) {
    rows.write_row(table.dft_row);
    out.print("default :\n", rows.line(), '\n');
  }
  for (std::int32_t row = 0; row < table.num_rows; ++row) {
    rows.write_row(row_at(table, row));
    segments.write_row(out, rows.line());
  }
  return PF_NORMAL;
}

}  // namespace

void ensure_formats(TEVPF_TABLE& table) noexcept {
  const bool missing =
      std::any_of(table.col_array, table.col_array + table.num_cols,
                  [](const TEVPF_COLUMN& column) { return column.format[0] == '\0'; });
  if (missing) TEV8R1_make_table_format(&table);
}

void write_table_head(TextOut& out, const TEVPF_TABLE& table, std::int32_t columns,
                      std::int64_t rows) noexcept {
  out.print(" Table name:  ", table.header.elem_name, '\n');
  out.print(" Description:  ", table.header.elem_desc, '\n');
  out.print(".Number of columns:  ", columns, '\n');
  out.print(".Number of rows:  ", rows, "\n\n");
}

void write_data_heading(TextOut& out) noexcept { out.print("!\n\n.    \t\t\t\tTABLE DATA\n\n"); }

TEVPF_STATUS write_table(TextOut& out, TEVPF_TABLE& table) noexcept {
  if (!settle(table)) return fail_empty(PF_NOMEM);
  ensure_formats(table);
  write_table_head(out, table, table.num_cols, table.num_rows);
  if (library.debug_value != nullptr) write_debug_fields(out, table);
  write_columns(out, table);
  write_data_heading(out);
  return table.num_rows > 0 ? write_rows(out, table) : PF_NORMAL;
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_table_dump(TEVPF_TABLE* table, std::FILE* stream) noexcept {
  TextOut out(stream);
  return write_table(out, *table);
}

TEVPF_STATUS TEV8R1_PF_dump_table(const char* name, const char* path) noexcept {
  return write_report(path, [&](TextOut& out) -> TEVPF_STATUS {
    TEVPF_TABLE* table = nullptr;
    PF_TRY(find_table(name, table));
    return write_table(out, *table);
  });
}
