// Index operations that are exported individually. They work on records as outside callers see
// them, so they settle the table first.
#include "tables/column_index.h"
#include "tables/columns.h"
#include "tables/index_search.h"
#include "tables/row_store.h"
#include "tables/rows.h"
#include "tables/search_keys.h"
#include "tables/settle.h"

using namespace tevpf;

TEVPF_STATUS TEV8R1_create_index(TEVPF_TABLE* table, TEVPF_COLUMN* column) noexcept {
  if (!settle(*table)) return fail_empty(PF_NOMEM);
  const std::int64_t room = std::int64_t{table->num_rows} + table->free_rows;
  if (room < 1) return PF_NORMAL;
  sort_from_now_on(*table, *column);
  NewIndex index;
  if (!build_index(*table, *column, room, index)) return fail_empty(PF_NOMEM);
  adopt_index(*column, std::move(index));
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_check_unique_values(TEVPF_TABLE* table, TEVPF_COLUMN* column) noexcept {
  if (!settle(*table)) return fail_empty(PF_NOMEM);
  if (table->num_rows < 2 || index_entries(*column) == nullptr) return PF_NORMAL;
  if (has_equal_neighbours(*table, index_entries(*column), *column)) {
    return fail_empty(PF_NOTUNIQUE);
  }
  return PF_NORMAL;
}

// The row is already stored at its row number, or will be. An index without room for it is
// unchanged.
TEVPF_STATUS TEV8R1_update_indexes(TEVPF_TABLE* table, const void* row,
                                   int32_t row_number) noexcept {
  if (!settle(*table)) return PF_NORMAL;
  drop_search_keys(*table);
  for (int32_t i = 0; i < table->num_cols; ++i) {
    TEVPF_COLUMN& column = table->col_array[i];
    if (!is_indexed(column) || column.index.room <= table->num_rows) continue;
    const void* const value = static_cast<const unsigned char*>(row) + column.offset;
    const int32_t position = search_index(*table, column, value).place.position;
    TEV8R1_insert_index_value(column.idx_ptr, table->num_rows, position, row_number);
  }
  return PF_NORMAL;
}
