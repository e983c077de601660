#include "tables/rows.h"

#include <algorithm>
#include <cstring>
#include <limits>

#include "core/base/heap.h"
#include "core/base/status.h"
#include "core/library.h"
#include "tables/column_index.h"
#include "tables/cursor.h"
#include "tables/default_row.h"
#include "tables/directory.h"
#include "tables/layout.h"
#include "tables/row_store.h"
#include "tables/search_keys.h"
#include "tables/validate.h"

using namespace tevpf;

namespace {

constexpr std::int32_t kMaxFreeRows = std::numeric_limits<std::int16_t>::max();

// ---- Rows that callers hand in ------------------------------------------------------------------

bool all_texts_end(const TEVPF_TABLE& table, const unsigned char* row) noexcept {
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    const TEVPF_COLUMN& column = table.col_array[i];
    if (column.def.type != PF_TYPE_STRING) continue;
    const auto size = static_cast<std::size_t>(column_size(column));
    if (std::memchr(row + column.offset, 0, size) == nullptr) return false;
  }
  return true;
}

// A caller's row, safe to read: the row itself when all its texts end within their fields, else a
// copy in which they do.
class GivenRow {
 public:
  GivenRow(const TEVPF_TABLE& table, const void* row) noexcept
      : row_(static_cast<const unsigned char*>(row)) {
    if (all_texts_end(table, row_)) return;
    copy_.reset(
        static_cast<unsigned char*>(heap_copy(row, static_cast<std::uint64_t>(table.row_wid))));
    if (copy_) end_texts(table, copy_.get(), 1);
    row_ = copy_.get();
  }
  const unsigned char* get() const noexcept { return row_; }  // null: memory ran out

 private:
  const unsigned char* row_;
  Owned<unsigned char> copy_;
};

void copy_row(const TEVPF_TABLE& table, const void* from, void* to) noexcept {
  if (table.row_wid > 0) std::memmove(to, from, static_cast<std::size_t>(table.row_wid));
}

void store_row(TEVPF_TABLE& table, const void* row, std::int32_t row_number) noexcept {
  copy_row(table, row, row_at(table, row_number));
}

// ---- Insertion and removal ----------------------------------------------------------------------

// Puts a row into its place, for which there is a spare slot; the indexes know its number as a gap.
void open_slot(TEVPF_TABLE& table, const void* row, std::int32_t row_number) noexcept {
  if (row_number < table.num_rows) {
    open_row_gap(table, row_number);
    renumber_for_insertion(table, row_number);
  }
  store_row(table, row, row_number);
}

// Gives a row its entries in all indexes, at the points that the value checks have found.
void insert_entries(TEVPF_TABLE& table, const unsigned char* row, std::int32_t row_number,
                    const InsertionPoints& points) noexcept {
  drop_search_keys(table);
  std::int32_t known = 0;
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    TEVPF_COLUMN& column = table.col_array[i];
    if (!is_indexed(column)) continue;
    std::int32_t position = 0;
    if (is_unique(column) && known < points.count) {
      position = points.position[known++];
    } else {
      (void)search_index(table, column, 0, table.num_rows, row + column.offset, position);
    }
    insert_entry(column, table.num_rows, position, row_number);
  }
}

void count_row(TEVPF_TABLE& table) noexcept {
  ++table.num_rows;
  --table.free_rows;
}

// The numbers of rows run from 0 to num_rows: PF_END_POS and beyond append.
TEVPF_STATUS insert_row(TEVPF_TABLE& table, const void* row, std::int32_t row_number) noexcept {
  const GivenRow given(table, row);
  if (given.get() == nullptr) return fail_empty(PF_NOMEM);
  if (table.free_rows <= 0) PF_TRY(TEV8R1_get_space(&table));
  InsertionPoints points;
  if (library.interactive == 0) PF_TRY(check_row(table, given.get(), kNobody, points));

  const std::int32_t place = std::clamp(row_number, 0, table.num_rows);
  open_slot(table, given.get(), place);
  insert_entries(table, row_at(table, place), place, points);
  count_row(table);
  return PF_NORMAL;
}

// Takes a row out; positions as remove_row_from_indexes has them.
void erase_row(TEVPF_TABLE& table, std::int32_t row_number, std::int32_t* positions) noexcept {
  remove_row_from_indexes(table, row_number, positions);
  close_row_gap(table, row_number);
  --table.num_rows;
  if (table.free_rows < kMaxFreeRows) ++table.free_rows;
}

// Undoes erase_row: every index is in the same order again.
void put_row_back(TEVPF_TABLE& table, const void* row, std::int32_t row_number,
                  const std::int32_t* positions) noexcept {
  open_slot(table, row, row_number);
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    TEVPF_COLUMN& column = table.col_array[i];
    if (is_indexed(column)) insert_entry(column, table.num_rows, positions[i], row_number);
  }
  count_row(table);
}

TEVPF_STATUS move_row(TEVPF_TABLE& table, std::int32_t from, std::int32_t to) noexcept {
  const auto row = new_array<unsigned char>(static_cast<std::uint64_t>(table.row_wid));
  const auto positions = new_array<std::int32_t>(static_cast<std::uint64_t>(table.num_cols));
  if (!row || !positions) return fail_empty(PF_NOMEM);
  copy_row(table, row_at(table, from), row.get());

  const std::int16_t free_rows = table.free_rows;
  erase_row(table, from, positions.get());
  const TEVPF_STATUS status = insert_row(table, row.get(), to);
  if (status != PF_NORMAL) put_row_back(table, row.get(), from, positions.get());
  table.free_rows = free_rows;
  return status;
}

TEVPF_STATUS find_with_default_row(const char* table_name, TEVPF_TABLE*& table) noexcept {
  PF_TRY(find_table(table_name, table));
  if (table->num_cols > 0 && !ensure_default_row(*table)) return fail_empty(PF_NOMEM);
  return PF_NORMAL;
}

// ---- Replacement --------------------------------------------------------------------------------

bool values_differ(const TEVPF_COLUMN& column, const unsigned char* stored_row,
                   const unsigned char* new_row) noexcept {
  return TEV8R1_compare(column.def.type, stored_row + column.offset, new_row + column.offset,
                        column.tolerance) != PF_NORMAL;
}

void replace_row(TEVPF_TABLE& table, std::int32_t row_number, const unsigned char* row) noexcept {
  const unsigned char* const stored = row_at(table, row_number);
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    TEVPF_COLUMN& column = table.col_array[i];
    if (is_indexed(column) && values_differ(column, stored, row)) {
      move_entry(table, column, row_number, row + column.offset);
    }
  }
  store_row(table, row, row_number);
}

}  // namespace

TEVPF_STATUS TEV8R1_get_space(TEVPF_TABLE* table) noexcept {
  const std::int32_t most = std::numeric_limits<std::int32_t>::max() - table->num_rows;
  const std::int32_t wanted =
      table->num_rows == 0 ? library.alloc_initial : library.alloc_increment;
  const std::int32_t increment = std::min({wanted, kMaxFreeRows, most});
  if (increment < 1 || !reserve_rows(*table, increment) ||
      !reserve_index_entries(*table, increment)) {
    return fail_empty(PF_NOMEM);
  }
  table->free_rows = static_cast<std::int16_t>(increment);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_update_indexes(TEVPF_TABLE* table, const void* row,
                                   int32_t row_number) noexcept {
  insert_entries(*table, static_cast<const unsigned char*>(row), row_number, InsertionPoints{});
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_add_row(const char* table_name, const void* row) noexcept {
  return TEV8R1_PF_add_row_by_pos(table_name, row, PF_END_POS);
}

TEVPF_STATUS TEV8R1_PF_add_row_by_pos(const char* table_name, const void* row,
                                      int32_t row_number) noexcept {
  TEVPF_TABLE* table;
  PF_TRY(find_table(table_name, table));
  return insert_row(*table, row, row_number);
}

TEVPF_STATUS TEV8R1_PF_add_row_with_dft(const char* table_name, void* row,
                                        const int32_t* supplied) noexcept {
  TEVPF_TABLE* table;
  PF_TRY(find_with_default_row(table_name, table));
  for (int32_t i = 0; i < table->num_cols; ++i) {
    if (supplied[i] != 0) continue;
    const TEVPF_COLUMN& column = table->col_array[i];
    std::memcpy(static_cast<unsigned char*>(row) + column.offset, table->dft_row + column.offset,
                static_cast<std::size_t>(column_size(column)));
  }
  return insert_row(*table, row, PF_END_POS);
}

TEVPF_STATUS TEV8R1_PF_replace_row(const char* table_name, const void* row) noexcept {
  TEVPF_TABLE* table;
  void* stored;
  int32_t row_number;
  PF_TRY(find_table(table_name, table));
  PF_TRY(TEV8R1_get_cur_row_ptr(table, &stored, &row_number));
  const GivenRow given(*table, row);
  if (given.get() == nullptr) return fail_empty(PF_NOMEM);
  InsertionPoints points;
  PF_TRY(check_row(*table, given.get(), row_number, points));
  replace_row(*table, row_number, given.get());
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_delete_row(const char* table_name) noexcept {
  TEVPF_TABLE* table;
  void* stored;
  int32_t row_number;
  PF_TRY(find_table(table_name, table));
  PF_TRY(TEV8R1_get_cur_row_ptr(table, &stored, &row_number));
  erase_row(*table, row_number, nullptr);
  table->cur_row = -1;
  --table->next_row;
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_move_row(const char* table_name, int32_t from, int32_t to) noexcept {
  TEVPF_TABLE* table;
  PF_TRY(find_table(table_name, table));
  if (table->cur_col != nullptr) return PF_SEARCHSET;
  if (from < 0 || from >= table->num_rows || table->num_rows < 2) {
    return fail(PF_BADPOS, Text(from), Text(table->num_rows));
  }
  return move_row(*table, from, to);
}

TEVPF_STATUS TEV8R1_PF_set_dft_row(const char* table_name, const void* row) noexcept {
  TEVPF_TABLE* table;
  PF_TRY(find_with_default_row(table_name, table));
  const GivenRow given(*table, row);
  if (given.get() == nullptr) return fail_empty(PF_NOMEM);
  InsertionPoints points;
  if (library.interactive == 0) PF_TRY(check_row(*table, given.get(), kAnybody, points));
  copy_row(*table, given.get(), table->dft_row);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_inq_dft_row(const char* table_name, void* row_out) noexcept {
  TEVPF_TABLE* table;
  PF_TRY(find_with_default_row(table_name, table));
  copy_row(*table, table->dft_row, row_out);
  return PF_NORMAL;
}
