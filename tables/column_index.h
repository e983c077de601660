// A column's index: a sequence of row slots in ascending order of the column's value. Only
// column_index changes it.
//
// Values are ordered by the comparison of values/compare. Among rows of equal value, a row inserted
// later comes first. An index read from a file is accepted in any order; searches of it terminate,
// stay in bounds and change nothing.
#pragma once

#include <cstdint>

#include "core/base/heap.h"
#include "tables/table.h"

namespace tevpf {

// An index that does not yet belong to a column.
struct NewIndex {
  Owned<std::int32_t> entries;
  std::int32_t room = 0;      // entries that the block holds
  Owned<unsigned char> keys;  // search keys, or null
};

// ---- Whole indexes ------------------------------------------------------------------------------

// Builds the index of a column of that type, tolerance and offset over the rows of a settled table,
// with room for `room` entries (at least num_rows; 0: no block is allocated). O(n log n). Returns
// false when out of memory. The order is total: by exact value, NaN last, ties by row number.
[[nodiscard]] bool build_index(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                               std::int64_t room, NewIndex& out) noexcept;

// Makes TEV8R1_sort_comp compare by this column.
void sort_from_now_on(const TEVPF_TABLE& table, const TEVPF_COLUMN& column) noexcept;

// The entries 0, 1, 2 ... `count` - 1: the index of a column of a settled table whose values are
// all equal.
[[nodiscard]] bool make_identity_index(std::int32_t count, std::int64_t room,
                                       NewIndex& out) noexcept;

// Copies the index of a settled table; the copy has room for exactly its rows.
[[nodiscard]] bool copy_index(const TEVPF_COLUMN& column, std::int32_t count,
                              NewIndex& out) noexcept;

// Replaces the column's index with this one. release_index leaves the column without an index.
void adopt_index(TEVPF_COLUMN& column, NewIndex index) noexcept;
void release_index(TEVPF_COLUMN& column) noexcept;

// For a settled table: whether no entry's value is greater than that of the next entry, by the
// column's type and this tolerance.
[[nodiscard]] bool is_index_in_order(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                                     double tolerance) noexcept;

// For a settled table: whether two neighbouring entries hold equal values, by the column's type and
// tolerance.
[[nodiscard]] bool has_equal_neighbours(const TEVPF_TABLE& table, const std::int32_t* entries,
                                        const TEVPF_COLUMN& column) noexcept;

// ---- Reading ------------------------------------------------------------------------------------

// The slots of a settled table in order of value; null when there are no entries.
inline const std::int32_t* index_entries(const TEVPF_COLUMN& column) noexcept {
  return column.idx_ptr;
}

// The sequence that positions refer to: the search column's index if there is one, else storage
// order.
inline const Sequence& traversal_of(const TEVPF_TABLE& table) noexcept {
  const TEVPF_COLUMN* const search = table.cur_col;
  return search != nullptr && is_indexed(*search) ? search->index : table.slots.order;
}

// ---- Entries, as rows are inserted, moved and deleted -------------------------------------------
// num_rows is the count before the change.

// Where an entry is, and where it moves to, counted without the entry itself.
struct EntryMove {
  std::int32_t from;
  std::int32_t to;
};

// Each allocates whatever the corresponding change may need; false when out of memory, and the
// entries are as they were. An index that becomes blocks takes its search keys along.
[[nodiscard]] bool ready_to_insert_entry(const TEVPF_TABLE& table, TEVPF_COLUMN& column,
                                         const SequencePlace& place, std::int32_t slot) noexcept;
[[nodiscard]] bool ready_to_erase_entry(const TEVPF_TABLE& table, TEVPF_COLUMN& column,
                                        const SequencePlace& place) noexcept;
[[nodiscard]] bool ready_to_move_entry(const TEVPF_TABLE& table, TEVPF_COLUMN& column,
                                       EntryMove move) noexcept;

// The functions below cannot fail afterwards.

// Inserts the slot of a row with that value.
void insert_entry(const TEVPF_TABLE& table, TEVPF_COLUMN& column, SequencePlace place,
                  std::int32_t slot, const void* value) noexcept;

void erase_entry(const TEVPF_TABLE& table, TEVPF_COLUMN& column, SequencePlace place) noexcept;

// Moves an entry, whose row gets this value. An entry that stays in place needs no call: blocks
// keep only integers beside their slots, and equal integers are the same.
void move_entry(TEVPF_COLUMN& column, EntryMove move, const void* value) noexcept;

// Call this when values may have changed without notice: drops everything derived from them.
void forget_values(TEVPF_TABLE& table) noexcept;

}  // namespace tevpf
