// Whether a value may be stored in a column: within its bounds, and unique in a unique column.
#pragma once

#include <cstdint>

#include "tables/column_index.h"
#include "tables/table.h"

extern "C" {

// Checks one value of the column's type. On PF_DUPLICATE, library.dup_row is the row that holds the
// value.
TEVPF_API TEVPF_STATUS TEV8R1_validate_value(const TEVPF_TABLE* table, const TEVPF_COLUMN* column,
                                             const void* value) noexcept;
}

namespace tevpf {

// The places of a row's values in the indexes of the unique columns, in column order, as found by
// the checks, so that inserting the row need not search again. Valid until an index changes.
struct InsertionPoints {
  static constexpr std::int32_t kMost = 16;  // columns beyond these are searched again
  std::int32_t count = 0;
  SequencePlace place[kMost];
};

// Holders for check_row: no row, or any row.
inline constexpr std::int32_t kNobody = -1;
inline constexpr std::int32_t kAnybody = -2;

// Checks every value of a row, in column order. A duplicate value passes if `holder` holds it (a
// slot, kNobody or kAnybody), but leaves the error context of the duplicate set.
[[nodiscard]] TEVPF_STATUS check_row(const TEVPF_TABLE& table, const unsigned char* row,
                                     std::int32_t holder, InsertionPoints& points) noexcept;

// The same for a stored row that moves, ignoring the row itself; own_number is its row number.
// `moves` has the position of its entry in each column's index.
[[nodiscard]] TEVPF_STATUS check_moved_row(const TEVPF_TABLE& table, std::int32_t slot,
                                           std::int32_t own_number,
                                           const EntryMove* moves) noexcept;

}  // namespace tevpf
