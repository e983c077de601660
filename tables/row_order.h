// Sorts rows by a column's values, in the order of a new index.
#pragma once

#include <cstdint>

#include "tables/table.h"

namespace tevpf {

// Writes all row numbers to `out`, ordered by a column of that type and offset; O(n log n). The
// order is total: by exact value, NaN last, ties by row number. For a column of integers, writes the
// values in that order to `sorted` unless it is null. Returns false when out of memory.
[[nodiscard]] bool sort_rows(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                             std::int32_t* out, unsigned char* sorted) noexcept;

}  // namespace tevpf
