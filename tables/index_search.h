// Searching a column's index (tables/column_index) for a value.
#pragma once

#include <cstdint>

#include "tables/column_index.h"
#include "tables/table.h"

namespace tevpf {

// The result of a search: whether a value equals the key, and the place of the first equal value,
// or else of the first greater one.
struct IndexPlace {
  SequencePlace place;
  bool found;
};

// The same for callers that only read: a position and no place.
struct Found {
  std::int32_t position;
  bool equal;
};

// Searches all entries for a key.
[[nodiscard]] IndexPlace search_index(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                                      const void* key) noexcept;

// Searches all entries except the one at position `without`; positions count as if it were absent.
[[nodiscard]] Found search_others(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                                  std::int32_t without, const void* key) noexcept;
// The position alone, which spares reading a value to compare it.
[[nodiscard]] std::int32_t position_among_others(const TEVPF_TABLE& table,
                                                 const TEVPF_COLUMN& column, std::int32_t without,
                                                 const void* key) noexcept;

// Searches the entries from position `first` on, for searches that callers request. A column that
// is searched often gets search keys, which make each step about four times cheaper in a table
// larger than the cache.
[[nodiscard]] Found find_in_index(const TEVPF_TABLE& table, TEVPF_COLUMN& column,
                                  std::int32_t first, const void* key) noexcept;

// The place of a stored row's entry.
[[nodiscard]] SequencePlace entry_of(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                                     std::int32_t slot) noexcept;

}  // namespace tevpf
