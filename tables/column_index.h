// A column's index: the row numbers in ascending order of the column's value. The only file that
// knows how an index lies in memory; nothing else touches idx_ptr and index_room.
//
// A flat array of num_rows entries, with room for free_rows more at least. Without either there is
// no array (idx_ptr null) although idx_flag is set. Values are ordered by the comparison of
// values/compare; among rows of equal value a row inserted later stands in front.
#pragma once

#include <cstdint>

#include "core/base/heap.h"
#include "tables/table.h"

extern "C" {

TEVPF_API TEVPF_STATUS TEV8R1_create_index(TEVPF_TABLE* table, TEVPF_COLUMN* column) noexcept;
}

namespace tevpf {

// An index that no column owns yet.
struct NewIndex {
  Owned<std::int32_t> entries;
  std::int32_t room = 0;  // entries that the block holds
};

// ---- Whole indexes ------------------------------------------------------------------------------

// Builds the index of a column of that type, tolerance and offset over the table's rows, with room
// for `room` entries (at least num_rows; 0: no block is made); O(n log n). False when memory runs
// out. The order is total: by exact value, what is not a number last, ties by row number.
[[nodiscard]] bool build_index(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                               std::int64_t room, NewIndex& out) noexcept;

// Entries 0, 1, 2 ... `count` - 1: the index of a column whose values are all equal.
[[nodiscard]] bool make_identity_index(std::int32_t count, std::int64_t room,
                                       NewIndex& out) noexcept;

// A copy of the first `count` entries of a column's index, with room for just these.
[[nodiscard]] bool copy_index(const TEVPF_COLUMN& column, std::int32_t count,
                              NewIndex& out) noexcept;

// Gives the column this index in place of the one it has; release_index leaves it with none.
void adopt_index(TEVPF_COLUMN& column, NewIndex index) noexcept;
void release_index(TEVPF_COLUMN& column) noexcept;

// Whether no entry's value is greater than its follower's, by the column's type and this tolerance.
[[nodiscard]] bool is_index_in_order(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                                     double tolerance) noexcept;

// Whether two neighbours of the index hold equal values, by the column's type and tolerance.
[[nodiscard]] bool has_equal_neighbours(const TEVPF_TABLE& table, const std::int32_t* entries,
                                        const TEVPF_COLUMN& column) noexcept;

// Makes room for `rows` more than num_rows entries in every index of the table, growing
// geometrically; false when memory runs out, and then every index is as it was but for room.
[[nodiscard]] bool reserve_index_entries(TEVPF_TABLE& table, std::int32_t rows) noexcept;

// ---- Reading ------------------------------------------------------------------------------------

// The row numbers in order of value; null when there is no array.
inline const std::int32_t* index_entries(const TEVPF_COLUMN& column) noexcept {
  return column.idx_ptr;
}

// The row number at a position of the traversal: through the search column's index when there is
// one.
inline std::int32_t row_at_position(const TEVPF_TABLE& table, std::int32_t position) noexcept {
  const TEVPF_COLUMN* search = table.cur_col;
  return search != nullptr && is_indexed(*search) ? search->idx_ptr[position] : position;
}

// ---- Entries, as rows come and go; the table's search keys are dropped ahead of it --------------

// Searches `count` entries from position `first` on for a key; gives the status and the position
// (from `first`) that TEV8R1_binary_search gives.
[[nodiscard]] TEVPF_STATUS search_index(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                                        std::int32_t first, std::int32_t count, const void* key,
                                        std::int32_t& pos) noexcept;

// The same for searches that callers ask for: a column that is searched often gets search keys, with
// which steps cost a quarter in a table that is larger than the cache.
[[nodiscard]] TEVPF_STATUS find_in_index(const TEVPF_TABLE& table, TEVPF_COLUMN& column,
                                         std::int32_t first, std::int32_t count, const void* key,
                                         std::int32_t& pos) noexcept;

// Raises every entry from row_number on by one in all indexes, ahead of the insertion of that row.
void renumber_for_insertion(TEVPF_TABLE& table, std::int32_t row_number) noexcept;

// Inserts a row number at a position of one index of `count` entries.
void insert_entry(TEVPF_COLUMN& column, std::int32_t count, std::int32_t position,
                  std::int32_t row_number) noexcept;

// Takes a row out of all indexes and lowers every entry above it by one; num_rows still counts it.
// Unless it is null, positions[i] receives where the row stood in the index of column i.
void remove_row_from_indexes(TEVPF_TABLE& table, std::int32_t row_number,
                             std::int32_t* positions) noexcept;

// Moves the entry of a stored row, whose value is about to become `value`, to its new place.
void move_entry(const TEVPF_TABLE& table, TEVPF_COLUMN& column, std::int32_t row_number,
                const void* value) noexcept;

}  // namespace tevpf
