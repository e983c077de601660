// A column's values side by side, kept while the column is searched often: in the order of its index,
// or without one in the order of the rows. What is searched then comes densely out of memory, and
// without a step through the index at each probe. For columns of numbers.
#pragma once

#include <cstdint>

#include "core/base/heap.h"
#include "tables/table.h"

namespace tevpf {

// Of integers in the order of an index, the last value of every so many stands once more behind all the
// values: such fences fit the cache where the values do not, and lead to one or two lines of it.
#ifdef TEVPF_TEST_HOOKS
inline constexpr std::int32_t kFenceStep = 3;  // small tables too have fences
#else
inline constexpr std::int32_t kFenceStep = 16;
#endif
constexpr std::int32_t fence_count(std::int32_t values) noexcept { return values / kFenceStep; }

// The values, if they are there or it is time for them: as soon as searches since the last change have
// cost about what gathering costs. Null else, and when memory is short. `index`: the column's, null when
// it has none.
[[nodiscard]] const unsigned char* search_keys(const TEVPF_TABLE& table, TEVPF_COLUMN& column,
                                               const std::int32_t* index) noexcept;

// Counts a search that cost as much as looking at so many rows one after the other.
inline void count_search(TEVPF_COLUMN& column, std::int64_t rows) noexcept {
  if (column.keys.values == nullptr) column.keys.effort += rows;
}

// To be called when the column's values or its index change, and when the table's rows do.
inline void drop_search_keys(TEVPF_COLUMN& column) noexcept {
  if (column.keys.values != nullptr) heap_free(column.keys.values);
  column.keys = {};
}
inline void drop_search_keys(TEVPF_TABLE& table) noexcept {
  for (std::int32_t i = 0; i < table.num_cols; ++i) drop_search_keys(table.col_array[i]);
}

}  // namespace tevpf
