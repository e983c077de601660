// What callers need to know about columns to build rows: definitions, names, positions. The caller
// owns everything that is returned.
#include "core/base/heap.h"
#include "core/base/status.h"
#include "core/base/text_field.h"
#include "tables/column_record.h"
#include "tables/directory.h"
#include "tables/table.h"

namespace tevpf {
namespace {

// Returns one entry per column, in column order; without columns, only a count of 0.
template <class Entry, class Fill>
TEVPF_STATUS hand_out_columns(const char* table_name, std::int32_t* count_out, Entry** entries_out,
                              Fill fill) noexcept {
  TEVPF_TABLE* table = nullptr;
  PF_TRY(find_table(table_name, table));
  const std::int32_t count = *count_out = table->num_cols;
  if (count == 0) return PF_NORMAL;
  auto* entries =
      static_cast<Entry*>(heap_zeroed(static_cast<std::uint64_t>(count), sizeof(Entry)));
  if (entries == nullptr) return fail_empty(PF_NOMEM);
  for (std::int32_t i = 0; i < count; ++i) fill(table->col_array[i], entries[i]);
  *entries_out = entries;
  return PF_NORMAL;
}

}  // namespace
}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_PF_inq_col_def(const char* table_name, const char* column_name,
                                   TEVPF_COL_DEF* def_out) noexcept {
  TEVPF_TABLE* table = nullptr;
  TEVPF_COLUMN* column = nullptr;
  PF_TRY(find_table(table_name, table));
  PF_TRY(find_column(*table, column_name, column));
  return copy_definition(column->def, *def_out);
}

TEVPF_STATUS TEV8R1_PF_inq_col_def_by_pos(const char* table_name, std::int32_t pos,
                                          TEVPF_COL_DEF* def_out) noexcept {
  TEVPF_TABLE* table = nullptr;
  PF_TRY(find_table(table_name, table));
  if (pos < 0 || pos >= table->num_cols) return fail(PF_BADPOS, Text(pos), Text(table->num_cols));
  return copy_definition(table->col_array[pos].def, *def_out);
}

TEVPF_STATUS TEV8R1_get_col_type(const char* table_name, const char* column_name,
                                 std::int32_t* type_out) noexcept {
  TEVPF_TABLE* table = nullptr;
  TEVPF_COLUMN* column = nullptr;
  PF_TRY(find_table(table_name, table));
  PF_TRY(find_column(*table, column_name, column));
  *type_out = column->def.type;
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_inq_col_names(const char* table_name, std::int32_t* count_out,
                                     char (**names_out)[TEVPF_NAME_SIZE]) noexcept {
  using Name = char[TEVPF_NAME_SIZE];
  return hand_out_columns<Name>(
      table_name, count_out, names_out,
      [](const TEVPF_COLUMN& column, Name& name) { set_field(name, column.def.name); });
}

TEVPF_STATUS TEV8R1_PF_inq_col_offsets(const char* table_name, std::int32_t* count_out,
                                       std::int32_t** offsets_out) noexcept {
  return hand_out_columns<std::int32_t>(
      table_name, count_out, offsets_out,
      [](const TEVPF_COLUMN& column, std::int32_t& offset) { offset = column.offset; });
}
