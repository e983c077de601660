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
#include "tables/fetch_ahead.h"
#include "tables/index_search.h"
#include "tables/layout.h"
#include "tables/row_store.h"
#include "tables/search_keys.h"
#include "tables/settle.h"
#include "tables/validate.h"

using namespace tevpf;

namespace {

constexpr std::int32_t kMaxFreeRows = std::numeric_limits<std::int16_t>::max();

// ---- Rows from callers --------------------------------------------------------------------------

bool all_texts_end(const TEVPF_TABLE& table, const unsigned char* row) noexcept {
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    const TEVPF_COLUMN& column = table.col_array[i];
    if (column.def.type != PF_TYPE_STRING) continue;
    const auto size = static_cast<std::size_t>(column_size(column));
    if (std::memchr(row + column.offset, 0, size) == nullptr) return false;
  }
  return true;
}

// A caller's row, safe to read: the row itself if every text ends within its field, else a copy in
// which it does.
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
  const unsigned char* get() const noexcept { return row_; }  // null: out of memory

 private:
  const unsigned char* row_;
  Owned<unsigned char> copy_;
};

void copy_row(const TEVPF_TABLE& table, const void* from, void* to) noexcept {
  if (table.row_wid > 0) std::memmove(to, from, static_cast<std::size_t>(table.row_wid));
}

// ---- Slots --------------------------------------------------------------------------------------

// Makes room for the documented number of additional rows: the initial increment for a table
// without rows, else the later one; never more than free_rows can count.
TEVPF_STATUS make_space(TEVPF_TABLE& table) noexcept {
  const std::int32_t most = std::numeric_limits<std::int32_t>::max() - table.num_rows;
  const std::int32_t wanted = table.num_rows == 0 ? library.alloc_initial : library.alloc_increment;
  const std::int32_t increment = std::min({wanted, kMaxFreeRows, most});
  if (increment < 1 || !reserve_rows(table, increment)) return fail_empty(PF_NOMEM);
  table.free_rows = static_cast<std::int16_t>(increment);
  return PF_NORMAL;
}

// ---- Insertion and removal ----------------------------------------------------------------------

// What an operation found in each column's index: places or positions. The indexes do not change
// before the operation changes them. Few columns are indexed, so a small array usually suffices; a
// larger table gets a block.
template <class T>
class PerColumn {
 public:
  // cppcheck-suppress uninitMemberVar; written for each indexed column before it is read
  explicit PerColumn(const TEVPF_TABLE& table) noexcept {
    if (table.num_cols > kFew) block_ = new_array<T>(static_cast<std::uint64_t>(table.num_cols));
    values_ = table.num_cols > kFew ? block_.get() : few_;
  }
  bool exists() const noexcept { return values_ != nullptr; }  // false: out of memory
  T& operator[](std::int32_t column) noexcept { return values_[column]; }
  const T* get() const noexcept { return values_; }

 private:
  static constexpr std::int32_t kFew = 32;
  T few_[kFew];
  Owned<T> block_;
  T* values_;
};

using Places = PerColumn<SequencePlace>;

// Finds the places of a row's values in all indexes, reusing those that the value checks have
// found, and allocates what the insertions may need.
bool prepare_entries(TEVPF_TABLE& table, const unsigned char* row, const InsertionPoints& points,
                     Places& places) noexcept {
  const std::int32_t slot = next_slot(table);
  std::int32_t known = 0;
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    TEVPF_COLUMN& column = table.col_array[i];
    if (!is_indexed(column)) continue;
    const bool is_known = is_unique(column) && known < points.count;
    places[i] =
        is_known ? points.place[known++] : search_index(table, column, row + column.offset).place;
    if (!ready_to_insert_entry(table, column, places[i], slot)) return false;
  }
  return true;
}

void insert_entries(TEVPF_TABLE& table, const unsigned char* row, Places& places) noexcept {
  const std::int32_t slot = next_slot(table);
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    TEVPF_COLUMN& column = table.col_array[i];
    if (is_indexed(column)) insert_entry(table, column, places[i], slot, row + column.offset);
  }
}

void note_change(TEVPF_TABLE& table) noexcept {
  drop_search_keys(table);
  table.reads = 0;
}

// Row numbers run from 0 to num_rows: PF_END_POS and anything greater append.
TEVPF_STATUS add_row(TEVPF_TABLE& table, const void* row, std::int32_t row_number) noexcept {
  const GivenRow given(table, row);
  if (given.get() == nullptr) return fail_empty(PF_NOMEM);
  if (table.free_rows <= 0) PF_TRY(make_space(table));
  fetch_places(table, given.get());
  InsertionPoints points;
  if (library.interactive == 0) PF_TRY(check_row(table, given.get(), kNobody, points));

  const std::int32_t number = std::clamp(row_number, 0, table.num_rows);
  Places places(table);
  if (!places.exists() || !prepare_entries(table, given.get(), points, places) ||
      !ready_to_insert_row(table, number)) {
    return fail_empty(PF_NOMEM);
  }
  note_change(table);
  insert_entries(table, given.get(), places);
  insert_row(table, number, given.get());
  ++table.num_rows;
  --table.free_rows;
  return PF_NORMAL;
}

// Finds a stored row's entries in all indexes.
void find_entries(const TEVPF_TABLE& table, std::int32_t slot, Places& places) noexcept {
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    const TEVPF_COLUMN& column = table.col_array[i];
    if (is_indexed(column)) places[i] = entry_of(table, column, slot);
  }
}

TEVPF_STATUS delete_row(TEVPF_TABLE& table, std::int32_t slot, std::int32_t row_number) noexcept {
  Places places(table);
  if (!places.exists()) return fail_empty(PF_NOMEM);
  find_entries(table, slot, places);
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    TEVPF_COLUMN& column = table.col_array[i];
    if (is_indexed(column) && !ready_to_erase_entry(table, column, places[i])) {
      return fail_empty(PF_NOMEM);
    }
  }
  if (!ready_to_erase_row(table, row_number)) return fail_empty(PF_NOMEM);

  note_change(table);
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    TEVPF_COLUMN& column = table.col_array[i];
    if (is_indexed(column)) erase_entry(table, column, places[i]);
  }
  erase_row(table, row_number);
  --table.num_rows;
  if (table.free_rows < kMaxFreeRows) ++table.free_rows;
  return PF_NORMAL;
}

// ---- Moves and replacement ----------------------------------------------------------------------

using Moves = PerColumn<EntryMove>;

// Finds where a stored row's entry goes when its value becomes that of `row`, and allocates what
// the move may need.
bool prepare_move(const TEVPF_TABLE& table, TEVPF_COLUMN& column, std::int32_t slot,
                  const unsigned char* row, EntryMove& move) noexcept {
  move.from = entry_of(table, column, slot).position;
  move.to = position_among_others(table, column, move.from, row + column.offset);
  return ready_to_move_entry(table, column, move);
}

// A moved row leaves its place in every index and is reinserted before the rows of equal value,
// under the same checks as a new row.
TEVPF_STATUS move_row(TEVPF_TABLE& table, std::int32_t from, std::int32_t to) noexcept {
  Moves moves(table);
  if (!moves.exists()) return fail_empty(PF_NOMEM);
  const std::int32_t slot = slot_of(table, from);
  const unsigned char* const row = row_at(table, slot);
  fetch_places(table, row);
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    TEVPF_COLUMN& column = table.col_array[i];
    if (is_indexed(column) && !prepare_move(table, column, slot, row, moves[i])) {
      return fail_empty(PF_NOMEM);
    }
  }
  if (library.interactive == 0) PF_TRY(check_moved_row(table, slot, from, moves.get()));
  Sequence& order = table.slots.order;
  const std::int32_t target = std::clamp(to, 0, table.num_rows - 1);
  if (!order.make_ready_to_move(table.num_rows, from, target)) return fail_empty(PF_NOMEM);

  note_change(table);
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    TEVPF_COLUMN& column = table.col_array[i];
    if (is_indexed(column)) move_entry(column, moves[i], row + column.offset);
  }
  order.move(from, target);
  return PF_NORMAL;
}

bool values_differ(const TEVPF_COLUMN& column, const unsigned char* stored_row,
                   const unsigned char* new_row) noexcept {
  return TEV8R1_compare(column.def.type, stored_row + column.offset, new_row + column.offset,
                        column.tolerance) != PF_NORMAL;
}

TEVPF_STATUS replace_row(TEVPF_TABLE& table, std::int32_t slot, const unsigned char* row) noexcept {
  Moves moves(table);
  if (!moves.exists()) return fail_empty(PF_NOMEM);
  unsigned char* const stored = row_at(table, slot);
  fetch_places_of_changes(table, stored, row);
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    TEVPF_COLUMN& column = table.col_array[i];
    if (!is_indexed(column)) continue;
    moves[i] = {-1, -1};
    if (values_differ(column, stored, row) && !prepare_move(table, column, slot, row, moves[i])) {
      return fail_empty(PF_NOMEM);
    }
  }
  table.reads = 0;
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    TEVPF_COLUMN& column = table.col_array[i];
    if (!has_same_bytes(column, stored, row)) drop_search_keys(column);
    const bool moves_entry = is_indexed(column) && moves[i].from >= 0;
    if (moves_entry) move_entry(column, moves[i], row + column.offset);
  }
  copy_row(table, row, stored);
  return PF_NORMAL;
}

// ---- Finding ------------------------------------------------------------------------------------

TEVPF_STATUS find_with_default_row(const char* table_name, TEVPF_TABLE*& table) noexcept {
  PF_TRY(find_table(table_name, table));
  if (table->num_cols > 0 && !ensure_default_row(*table)) return fail_empty(PF_NOMEM);
  return PF_NORMAL;
}

// The table, and the slot of its current row.
TEVPF_STATUS find_current_row(const char* table_name, TEVPF_TABLE*& table,
                              std::int32_t& slot) noexcept {
  PF_TRY(find_table(table_name, table));
  if (!has_position(*table, table->cur_row)) return fail_empty(PF_NOCURROW);
  slot = traversal_of(*table).at(table->cur_row);
  return PF_NORMAL;
}

}  // namespace

TEVPF_STATUS TEV8R1_get_space(TEVPF_TABLE* table) noexcept {
  const std::int16_t free_rows = table->free_rows;
  if (!settle(*table)) return fail_empty(PF_NOMEM);
  PF_TRY(make_space(*table));
  if (settle(*table)) return PF_NORMAL;  // including room in the indexes
  table->free_rows = free_rows;
  return fail_empty(PF_NOMEM);
}

TEVPF_STATUS TEV8R1_PF_add_row(const char* table_name, const void* row) noexcept {
  return TEV8R1_PF_add_row_by_pos(table_name, row, PF_END_POS);
}

TEVPF_STATUS TEV8R1_PF_add_row_by_pos(const char* table_name, const void* row,
                                      int32_t row_number) noexcept {
  TEVPF_TABLE* table;
  PF_TRY(find_table(table_name, table));
  return add_row(*table, row, row_number);
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
  return add_row(*table, row, PF_END_POS);
}

TEVPF_STATUS TEV8R1_PF_replace_row(const char* table_name, const void* row) noexcept {
  TEVPF_TABLE* table;
  std::int32_t slot = 0;
  PF_TRY(find_current_row(table_name, table, slot));
  const GivenRow given(*table, row);
  if (given.get() == nullptr) return fail_empty(PF_NOMEM);
  InsertionPoints points;
  PF_TRY(check_row(*table, given.get(), slot, points));
  return replace_row(*table, slot, given.get());
}

TEVPF_STATUS TEV8R1_PF_delete_row(const char* table_name) noexcept {
  TEVPF_TABLE* table;
  std::int32_t slot = 0;
  PF_TRY(find_current_row(table_name, table, slot));
  fetch_places(*table, row_at(*table, slot));
  PF_TRY(delete_row(*table, slot, row_number_at(*table, table->cur_row)));
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
