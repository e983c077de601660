// A column's index: the slots of the rows in ascending order of the column's value, as a sequence. The only
// file that changes it.
//
// Values are ordered by the comparison of values/compare; among rows of equal value a row inserted later
// stands in front. A file's index is taken in whatever order it is; searches of it end, stay in bounds and
// change nothing.
#pragma once

#include <cstdint>

#include "core/base/heap.h"
#include "tables/table.h"

namespace tevpf {

// An index that no column owns yet.
struct NewIndex {
  Owned<std::int32_t> entries;
  std::int32_t room = 0;  // entries that the block holds
};

// ---- Whole indexes ------------------------------------------------------------------------------

// Builds the index of a column of that type, tolerance and offset over the rows of a settled table, with
// room for `room` entries (at least num_rows; 0: no block is made); O(n log n). False when memory runs
// out. The order is total: by exact value, what is not a number last, ties by row number.
[[nodiscard]] bool build_index(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                               std::int64_t room, NewIndex& out) noexcept;

// Lets TEV8R1_sort_comp speak of this column.
void sort_from_now_on(const TEVPF_TABLE& table, const TEVPF_COLUMN& column) noexcept;

// Entries 0, 1, 2 ... `count` - 1: the index of a column of a settled table whose values are all equal.
[[nodiscard]] bool make_identity_index(std::int32_t count, std::int64_t room,
                                       NewIndex& out) noexcept;

// A copy of the index of a settled table, with room for just its rows.
[[nodiscard]] bool copy_index(const TEVPF_COLUMN& column, std::int32_t count,
                              NewIndex& out) noexcept;

// Gives the column this index in place of the one it has; release_index leaves it with none.
void adopt_index(TEVPF_COLUMN& column, NewIndex index) noexcept;
void release_index(TEVPF_COLUMN& column) noexcept;

// Of a settled table: whether no entry's value is greater than its follower's, by the column's type and this tolerance.
[[nodiscard]] bool is_index_in_order(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                                     double tolerance) noexcept;

// Of a settled table: whether two neighbours of the index hold equal values, by the column's type and tolerance.
[[nodiscard]] bool has_equal_neighbours(const TEVPF_TABLE& table, const std::int32_t* entries,
                                        const TEVPF_COLUMN& column) noexcept;

// ---- Reading ------------------------------------------------------------------------------------

// The slots in order of value, of a settled table; null when there are no entries.
inline const std::int32_t* index_entries(const TEVPF_COLUMN& column) noexcept {
  return column.idx_ptr;
}

// The sequence that positions go through: the search column's index, or else storage order.
inline const Sequence& traversal_of(const TEVPF_TABLE& table) noexcept {
  const TEVPF_COLUMN* const search = table.cur_col;
  return search != nullptr && is_indexed(*search) ? search->index : table.slots.order;
}

// ---- Searching ----------------------------------------------------------------------------------

// What a search comes to: whether a value equals the key, and the place of the first that does, else of
// the first greater one.
struct IndexPlace {
  SequencePlace place;
  bool found;
};

// Searches all entries for a key.
[[nodiscard]] IndexPlace search_index(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                                      const void* key) noexcept;

// Searches all entries but the one at position `without`; places count as if it were not there.
[[nodiscard]] IndexPlace search_others(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                                       std::int32_t without, const void* key) noexcept;

// Searches the entries from position `first` on, for searches that callers ask for: a column that is
// searched often gets search keys, with which steps cost a quarter in a table that is larger than the cache.
[[nodiscard]] IndexPlace find_in_index(const TEVPF_TABLE& table, TEVPF_COLUMN& column,
                                       std::int32_t first, const void* key) noexcept;

// The place of a stored row's entry.
[[nodiscard]] SequencePlace entry_of(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                                     std::int32_t slot) noexcept;

// ---- Entries, as rows come and go ---------------------------------------------------------------
// num_rows is the count before the change. Allocate first by column.index.make_ready_to_...; what follows
// cannot fail.

// Inserts the slot of a row with that value.
void insert_entry(const TEVPF_TABLE& table, TEVPF_COLUMN& column, SequencePlace place,
                  std::int32_t slot, const void* value) noexcept;

void erase_entry(const TEVPF_TABLE& table, TEVPF_COLUMN& column, SequencePlace place) noexcept;

// Moves an entry to position `to` among the others, with its row's new value.
void move_entry(TEVPF_COLUMN& column, std::int32_t from, std::int32_t to,
                const void* value) noexcept;

// To be called when the value of a row changes and its entry stays.
void note_value(const TEVPF_TABLE& table, TEVPF_COLUMN& column, std::int32_t slot,
                const void* value) noexcept;

// To be called when values may have changed without notice: drops what is kept of them.
void forget_values(TEVPF_TABLE& table) noexcept;

}  // namespace tevpf
