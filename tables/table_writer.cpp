#include "tables/table_writer.h"

#include "core/base/status.h"
#include "core/writer.h"
#include "tables/column_index.h"
#include "tables/row_store.h"
#include "tables/table_fields.h"
#include "values/value_type.h"

namespace tevpf {
namespace {

TEVPF_STATUS put_column(Sink& sink, const TEVPF_COLUMN& column) noexcept {
  const TEVPF_COL_DEF& def = column.def;
  put_fields<kColumnFields>(sink, &column);
  if (!is_value_type(def.type)) return fail(PF_BADTYPE, "column", Text(def.type));
  sink.put(&def.limits, static_cast<std::uint64_t>(value_type(def.type).column_part));
  if (def.description != nullptr) sink.put_text(def.description);
  return PF_NORMAL;
}

}  // namespace

TEVPF_STATUS store_table(Sink& sink, TEVPF_TABLE& table) noexcept {
  sink.put(&table.header, sizeof table.header);
  put_fields<kTableFields>(sink, &table);
  for (std::int32_t i = 0; i < table.num_cols; ++i) PF_TRY(put_column(sink, table.col_array[i]));
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    const TEVPF_COLUMN& column = table.col_array[i];
    if (is_indexed(column)) sink.put_numbers(index_entries(column), table.num_rows);
  }
  const auto rows = static_cast<std::uint64_t>(table.num_rows);
  if (rows != 0) sink.put(row_at(table, 0), rows * static_cast<std::uint64_t>(table.row_wid));
  return PF_NORMAL;
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_store_table(std::FILE* stream, TEVPF_TABLE* table) noexcept {
  return write_element(stream, table->header, table_kind);
}
