// Rows in the order of a column's values, as a new index has them.
#pragma once

#include <cstdint>

#include "tables/table.h"

namespace tevpf {

// Puts the numbers of all rows into `out`, ordered by a column of that type and offset; O(n log n).
// The order is total: by exact value, what is not a number last, ties by row number. False when
// memory runs out.
[[nodiscard]] bool sort_rows(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                             std::int32_t* out) noexcept;

}  // namespace tevpf
