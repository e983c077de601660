#include "reports/table_listing.h"

#include <algorithm>
#include <cstring>

#include "reports/definition_text.h"
#include "reports/report_file.h"
#include "reports/row_text.h"
#include "reports/segments.h"
#include "reports/table_dump.h"
#include "tables/column_record.h"
#include "tables/cursor.h"
#include "tables/directory.h"
#include "tables/row_store.h"
#include "tables/settle.h"

namespace tevpf {

namespace {

struct Request {
  bool definitions;
  std::int32_t count;
  const char (*names)[TEVPF_NAME_SIZE];
  std::int32_t first;  // positions, inclusive
  std::int32_t last;
};

[[nodiscard]] TEVPF_STATUS take_named(TEVPF_TABLE& table, const Request& request,
                                      RowText& rows) noexcept {
  if (!rows.make_room(request.count)) return fail_empty(PF_NOMEM);
  for (std::int32_t n = 0; n < request.count; ++n) {
    char name[TEVPF_NAME_SIZE] = {};
    std::memcpy(name, request.names[n], strnlen(request.names[n], sizeof name - 1));
    TEVPF_COLUMN* column = nullptr;
    PF_TRY(find_column(table, name, column));
    rows.take(*column);
  }
  return PF_NORMAL;
}

[[nodiscard]] TEVPF_STATUS take_columns(TEVPF_TABLE& table, const Request& request,
                                        RowText& rows) noexcept {
  if (request.count <= 0) return fail(PF_BADARG, Text(request.count));
  if (request.count <= table.num_cols) return take_named(table, request, rows);
  return rows.take_all(table) ? TEVPF_STATUS{PF_NORMAL} : fail_empty(PF_NOMEM);
}

// The width that decides whether rows are cut: the sum over the chosen columns, including a gap
// after the last one, but the table's own display width when more columns were requested than
// exist.
std::int64_t total_width(const TEVPF_TABLE& table, const Request& request,
                         const RowText& rows) noexcept {
  if (request.count > table.num_cols) return table.dsp_wid;
  std::int64_t total = 0;
  for (std::int32_t n = 0; n < rows.count(); ++n) {
    total += std::int64_t{display_width(rows.column(n))} + kColumnGap;
  }
  return total;
}

TEVPF_STATUS write_rows(TextOut& out, const TEVPF_TABLE& table, const Request& request,
                        RowText& rows) noexcept {
  Segments segments;
  if (!rows.prepare(StringPadding::kListing) ||
      !segments.cut(rows, total_width(table, request, rows), kListingPage)) {
    return fail_empty(PF_NOMEM);
  }
  rows.write_heading();
  segments.write_heading(out, rows.line());
  out.print('\n');
  for (std::int32_t pos = request.first; pos <= request.last; ++pos) {
    fetch_ahead(table, pos);
    rows.write_row(row_at(table, traversal_of(table).at(pos)));
    segments.write_row(out, rows.line());
  }
  return rows.count() > 0 ? conversion_status(rows.column(rows.count() - 1)) : PF_NORMAL;
}

TEVPF_STATUS write_listing(TextOut& out, TEVPF_TABLE& table, Request request) noexcept {
  request.first = std::max(request.first, 0);
  if (request.last >= table.num_rows) request.last = table.num_rows - 1;
  if (!settle(table)) return fail_empty(PF_NOMEM);
  RowText rows;
  PF_TRY(take_columns(table, request, rows));
  ensure_formats(table);

  write_table_head(out, table, rows.count(), std::int64_t{request.last} - request.first + 1);
  if (request.definitions) {
    write_definitions_heading(out);
    for (std::int32_t n = 0; n < rows.count(); ++n) write_column_definition(out, rows.column(n));
  }
  write_data_heading(out);
  if (request.last < request.first || table.num_rows <= 0) return PF_NORMAL;
  return write_rows(out, table, request, rows);
}

}  // namespace

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_print_table(TEVPF_TABLE* table, std::FILE* stream, std::int32_t definitions,
                                std::int32_t count, const char (*names)[TEVPF_NAME_SIZE],
                                std::int32_t first, std::int32_t last) noexcept {
  TextOut out(stream);
  return write_listing(out, *table, {definitions != 0, count, names, first, last});
}

TEVPF_STATUS TEV8R1_PF_print_table(const char* table_name, const char* path,
                                   std::int32_t definitions, std::int32_t count,
                                   const char (*names)[TEVPF_NAME_SIZE], std::int32_t first,
                                   std::int32_t last) noexcept {
  return write_report(path, [&](TextOut& out) -> TEVPF_STATUS {
    TEVPF_TABLE* table = nullptr;
    PF_TRY(find_table(table_name, table));
    return write_listing(out, *table, {definitions != 0, count, names, first, last});
  });
}
