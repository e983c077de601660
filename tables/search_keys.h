// A contiguous copy of a column's values, kept while the column is searched often: in index order,
// or in row order if the column has no index. A search then reads contiguous memory and does not go
// through the index at each probe. For number columns only.
#pragma once

#include <cstdint>

#include "core/base/heap.h"
#include "tables/table.h"

namespace tevpf {

// For integers in index order, the last of every kFenceStep values is repeated after all the
// values. These fences fit the cache where the values do not, and narrow a search to one or two
// cache lines of values.
#ifdef TEVPF_TEST_HOOKS
inline constexpr std::int32_t kFenceStep = 3;  // small enough that small tables have fences too
#else
inline constexpr std::int32_t kFenceStep = 16;
#endif
constexpr std::int32_t fence_count(std::int32_t values) noexcept { return values / kFenceStep; }

// The values, if they exist or should now be gathered: that is, once searches since the last change
// have cost about as much as gathering. Otherwise null, also when out of memory. `index` is the
// column's index, null if it has none.
[[nodiscard]] const unsigned char* search_keys(const TEVPF_TABLE& table, TEVPF_COLUMN& column,
                                               const std::int32_t* index) noexcept;

// Sorting rows by integers brings the values in index order at no further cost. new_search_keys
// allocates a block for these values and their fences; null if the table is too small to need
// search keys, if the column is not one of integers, or when out of memory.
[[nodiscard]] Owned<unsigned char> new_search_keys(const TEVPF_COLUMN& column,
                                                   std::int32_t count) noexcept;
void add_fences(const TEVPF_COLUMN& column, std::int32_t count, unsigned char* values) noexcept;

// Counts a search that cost as much as scanning this many rows.
inline void count_search(TEVPF_COLUMN& column, std::int64_t rows) noexcept {
  if (column.keys.values == nullptr) column.keys.effort += rows;
}

// Call this when the column's values, its index or the table's rows change.
inline void drop_search_keys(TEVPF_COLUMN& column) noexcept {
  if (column.keys.values != nullptr) heap_free(column.keys.values);
  column.keys = {};
}
inline void drop_search_keys(TEVPF_TABLE& table) noexcept {
  for (std::int32_t i = 0; i < table.num_cols; ++i) drop_search_keys(table.col_array[i]);
}

}  // namespace tevpf
