// Defining, deleting and moving columns. Each operation checks first, then allocates every block
// that it needs, and only then changes the table, in steps that cannot fail. redefine.cpp holds
// redefinition.
#include "tables/columns.h"

#include <cstdio>
#include <cstring>
#include <utility>

#include "core/base/heap.h"
#include "core/base/status.h"
#include "core/library.h"
#include "tables/column_index.h"
#include "tables/column_record.h"
#include "tables/default_row.h"
#include "tables/directory.h"
#include "tables/formats.h"
#include "tables/layout.h"
#include "tables/row_store.h"
#include "tables/settle.h"
#include "values/value_type.h"

namespace tevpf {

void give_up_spare_rows(TEVPF_TABLE& table) noexcept {
  table.free_rows = 0;
  if (table.num_rows > 0) return;
  release_rows(table);
  for (std::int32_t i = 0; i < table.num_cols; ++i) release_index(table.col_array[i]);
}

namespace {

constexpr std::int16_t kColumnIncrement = 3;

using ColumnArray = Owned<TEVPF_COLUMN>;

TEVPF_COLUMN& at(const ColumnArray& columns, std::int32_t i) noexcept {
  return columns[static_cast<std::size_t>(i)];
}

// Replaces the column array. The search column stays the same column; `position` is its place in
// the new array, -1 for none.
void replace_columns(TEVPF_TABLE& table, ColumnArray columns, std::int32_t position) noexcept {
  heap_free(table.col_array);
  table.col_array = columns.release();
  table.cur_col = position < 0 ? nullptr : table.col_array + position;
}

// ---- Defining -----------------------------------------------------------------------------------

// A column that is complete but not yet part of its table, and the storage that the table gets for
// it.
struct NewColumn {
  TEVPF_COLUMN record{};
  Layout layout;             // of the table including this column
  std::int32_t stored_size;  // bytes that btf grows by
  Owned<char> description;
  NewIndex index;
  ColumnArray larger;  // the column array with more slots, if the present one is full
};

bool acquire_column_slot(const TEVPF_TABLE& table, ColumnArray& larger) noexcept {
  if (table.free_cols > 0) return true;
  larger = new_array<TEVPF_COLUMN>(static_cast<std::uint64_t>(table.num_cols) + kColumnIncrement);
  if (!larger) return false;
  if (table.num_cols > 0) {
    std::memcpy(larger.get(), table.col_array,
                static_cast<std::size_t>(table.num_cols) * sizeof(TEVPF_COLUMN));
  }
  return true;
}

// Completes the record and places it in the row; the table does not change.
TEVPF_STATUS construct_new_column(const TEVPF_TABLE& table, const TEVPF_COL_DEF& definition,
                                  NewColumn& column) noexcept {
  TEVPF_COLUMN& record = column.record;
  TEVPF_COL_DEF& def = record.def;
  def = definition;
  def.desc_byte = 0;
  def.spare_byte = 0;
  if (def.idx_flag == 0) def.unq_flag = 0;

  column.layout = layout_of(table);
  record.offset = static_cast<std::int32_t>(place_column(column.layout, def));
  if (column.layout.row_wid > kMaxRowWidth) return row_too_wide(def);

  std::int32_t size = 0;
  std::int16_t mod = table.mod;
  const TEVPF_STATUS status = TEV8R1_construct_column(&record, &column.stored_size, &size, &mod);
  column.description.reset(def.description);
  PF_TRY(status);
  record.desc_flag = description_flag(def);
  if (column.stored_size > INT32_MAX - table.header.btf) return fail_empty(PF_NOMEM);
  return PF_NORMAL;
}

// Allocates room in the table for the column's record, index, values and default value. Room left
// after a failure is not visible to callers.
bool acquire_room(TEVPF_TABLE& table, NewColumn& column) noexcept {
  const TEVPF_COL_DEF& def = column.record.def;
  if (!acquire_column_slot(table, column.larger)) return false;
  if (table.num_rows > 0 && !reserve_rows(table, 0, column.layout.row_wid)) return false;
  if (def.idx_flag != 0 && !make_identity_index(table.num_rows, table.num_rows, column.index)) {
    return false;
  }
  return widen_default_row(table, column.layout.row_wid, column.record.offset, def);
}

// The bytes of a new column in every row; null means zeros.
const unsigned char* initial_value(const TEVPF_COL_DEF& def, unsigned char (&buffer)[8]) noexcept {
  if (def.type == PF_TYPE_STRING) return nullptr;
  put_min(buffer, def);
  return buffer;
}

void append_column(TEVPF_TABLE& table, NewColumn column) noexcept {
  TEVPF_COLUMN& record = column.record;
  unsigned char value[8];
  widen_rows(table, column.layout.row_wid, record.offset, initial_value(record.def, value),
             column_size(record));
  if (column.larger) {
    replace_columns(table, std::move(column.larger), column_position(table, table.cur_col));
    table.free_cols = kColumnIncrement;
  }
  give_up_spare_rows(table);  // in the array that stays
  record.def.description = column.description.release();
  adopt_index(record, std::move(column.index));
  table.col_array[table.num_cols] = record;
  --table.free_cols;
  ++table.num_cols;
  table.header.btf += column.stored_size;
  set_layout(table, column.layout);
}

// Gives a column the next place in a new layout and notes which bytes of a row move there. Returns
// the new number of runs.
std::int32_t place_again(Layout& layout, TEVPF_COLUMN& column, Run* runs,
                         std::int32_t num_runs) noexcept {
  const auto offset = static_cast<std::int32_t>(place_column(layout, column.def));
  num_runs = add_run(runs, num_runs, {column.offset, offset, column_size(column)});
  column.offset = offset;
  return num_runs;
}

// ---- Deleting -----------------------------------------------------------------------------------

// Lays out all columns except one; the runs say which bytes of a row move where.
Layout lay_out_without(TEVPF_TABLE& table, std::int32_t deleted, Run* runs,
                       std::int32_t& num_runs) noexcept {
  Layout layout;
  num_runs = 0;
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    if (i != deleted) num_runs = place_again(layout, table.col_array[i], runs, num_runs);
  }
  return layout;
}

// Removes the record from the array; the search column stays the same column.
void remove_record(TEVPF_TABLE& table, std::int32_t position) noexcept {
  TEVPF_COLUMN* const record = table.col_array + position;
  release_column(*record);
  std::memmove(record, record + 1,
               static_cast<std::size_t>(table.num_cols - position - 1) * sizeof *record);
  --table.num_cols;
  if (table.cur_col == record) {
    table.cur_col = nullptr;
  } else if (table.cur_col != nullptr && table.cur_col > record) {
    --table.cur_col;
  }
}

// Deleting the last column deletes all rows, so the cursor has no row to point at.
void drop_all_rows(TEVPF_TABLE& table) noexcept {
  set_layout(table, Layout{});
  adopt_default_row(table, nullptr);
  table.num_rows = 0;
  table.cur_row = -1;
  table.next_row = 0;
}

// ---- Moving -------------------------------------------------------------------------------------

// A table's columns in a new order, and the storage that this order needs.
struct Reordered {
  ColumnArray columns;
  Owned<Run> runs;
  std::int32_t num_runs = 0;
  Layout layout;
  Owned<unsigned char> rows;  // null without rows
  Owned<unsigned char> default_row;
};

// The position of a column after the one at `from` has moved to `to`.
std::int32_t moved_position(std::int32_t position, std::int32_t from, std::int32_t to) noexcept {
  if (position == from) return to;
  if (from < position && position <= to) return position - 1;
  if (to <= position && position < from) return position + 1;
  return position;
}

bool lay_out_moved(const TEVPF_TABLE& table, std::int32_t from, std::int32_t to,
                   Reordered& next) noexcept {
  const auto count = static_cast<std::uint64_t>(table.num_cols);
  next.columns = new_array<TEVPF_COLUMN>(count);
  next.runs = new_array<Run>(count);
  if (!next.columns || !next.runs) return false;
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    at(next.columns, moved_position(i, from, to)) = table.col_array[i];
  }
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    next.num_runs = place_again(next.layout, at(next.columns, i), next.runs.get(), next.num_runs);
  }
  return true;
}

void print_move(const TEVPF_TABLE& table, std::int32_t from, std::int32_t to) noexcept {
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    const TEVPF_COLUMN& column = table.col_array[i];
    std::printf("%d. name = %s type=%d  size = %d  new_pos = %d\n", i, column.def.name,
                column.def.type, column_size(column), moved_position(i, from, to));
  }
}

bool relay_storage(TEVPF_TABLE& table, Reordered& next) noexcept {
  if (!ensure_default_row(table)) return false;
  const std::int64_t new_wid = next.layout.row_wid;
  next.default_row = new_zeroed<unsigned char>(static_cast<std::uint64_t>(new_wid));
  if (!next.default_row) return false;
  relay_rows(table.dft_row, 1, table.row_wid, next.default_row.get(), new_wid, next.runs.get(),
             next.num_runs);
  if (table.num_rows == 0) return true;

  next.rows = new_zeroed<unsigned char>(static_cast<std::uint64_t>(table.num_rows * new_wid));
  if (!next.rows) return false;
  relay_rows(row_at(table, 0), table.num_rows, table.row_wid, next.rows.get(), new_wid,
             next.runs.get(), next.num_runs);
  return true;
}

void adopt_order(TEVPF_TABLE& table, Reordered next, std::int32_t from, std::int32_t to) noexcept {
  const std::int32_t search = column_position(table, table.cur_col);
  replace_columns(table, std::move(next.columns),
                  search < 0 ? -1 : moved_position(search, from, to));
  adopt_rows(table, std::move(next.rows), table.num_rows * next.layout.row_wid);
  adopt_default_row(table, std::move(next.default_row));
  set_layout(table, next.layout);
  table.free_cols = 0;
  give_up_spare_rows(table);
}

}  // namespace
}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_adjust_data(TEVPF_TABLE* table, std::int32_t size, std::int32_t offset,
                                std::int32_t pad, const TEVPF_COL_DEF* definition) noexcept {
  if (table->num_rows == 0) return PF_NORMAL;
  if (!settle(*table)) return fail_empty(PF_NOMEM);
  const std::int64_t new_wid = std::int64_t{table->row_wid} + pad + size;
  if (!reserve_rows(*table, 0, new_wid)) return fail_empty(PF_NOMEM);
  unsigned char value[8];
  widen_rows(*table, new_wid, offset, initial_value(*definition, value), size);
  table->free_rows = 0;
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_def_column(const char* table_name, TEVPF_COL_DEF definition) noexcept {
  TEVPF_TABLE* table = nullptr;
  PF_TRY(find_settled_table(table_name, table));
  terminate_texts(definition);
  PF_TRY(TEV8R1_validate_col_def(table, definition));

  NewColumn column;
  PF_TRY(construct_new_column(*table, definition, column));
  if (!acquire_room(*table, column)) return fail_empty(PF_NOMEM);
  append_column(*table, std::move(column));
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_delete_col(const char* table_name, const char* column_name) noexcept {
  TEVPF_TABLE* table = nullptr;
  TEVPF_COLUMN* column = nullptr;
  PF_TRY(find_settled_table(table_name, table));
  PF_TRY(find_column(*table, column_name, column));

  const auto runs = new_array<Run>(static_cast<std::uint64_t>(table->num_cols));
  if (!runs || !ensure_default_row(*table)) return fail_empty(PF_NOMEM);

  const std::int32_t position = column_position(*table, column);
  std::int32_t num_runs = 0;
  const Layout layout = lay_out_without(*table, position, runs.get(), num_runs);
  table->header.btf -=
      static_cast<std::int32_t>(stored_column_size(column->def.type, column->def.description));
  remove_record(*table, position);
  if (table->num_cols == 0) {
    drop_all_rows(*table);
  } else {
    compact_rows(row_at(*table, 0), table->num_rows, table->row_wid, layout.row_wid, runs.get(),
                 num_runs);
    compact_row(table->dft_row, runs.get(), num_runs);
    set_layout(*table, layout);
  }
  give_up_spare_rows(*table);
  return TEV8R1_make_table_format(table);
}

TEVPF_STATUS TEV8R1_PF_move_col(const char* table_name, const char* column_name,
                                const char* before_name) noexcept {
  TEVPF_TABLE* table = nullptr;
  TEVPF_COLUMN *column = nullptr, *before = nullptr;
  PF_TRY(find_settled_table(table_name, table));
  PF_TRY(find_column(*table, column_name, column));
  if (before_name != nullptr) PF_TRY(find_column(*table, before_name, before));
  if (table->num_cols < 2) return PF_NORMAL;

  // In front of a later column the moved one's own place closes up.
  const std::int32_t from = column_position(*table, column);
  std::int32_t to = before == nullptr ? table->num_cols : column_position(*table, before);
  if (to > from) --to;
  Reordered next;
  if (!lay_out_moved(*table, from, to, next)) return fail_empty(PF_NOMEM);
  if (next.layout.row_wid > kMaxRowWidth) {
    return row_too_wide(column->def);
  }
  if (library.debug_value != nullptr) print_move(*table, from, to);
  if (!relay_storage(*table, next)) return fail_empty(PF_NOMEM);
  adopt_order(*table, std::move(next), from, to);
  return PF_NORMAL;
}
