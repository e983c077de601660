// Whether a value may be stored in a column: inside its bounds, and new to a unique column.
#pragma once

#include <cstdint>

#include "tables/table.h"

extern "C" {

// Checks one value of the column's type. PF_DUPLICATE leaves the row that holds it in
// library.dup_row.
TEVPF_API TEVPF_STATUS TEV8R1_validate_value(const TEVPF_TABLE* table, const TEVPF_COLUMN* column,
                                             const void* value) noexcept;
}

namespace tevpf {

// Where the checks of a row found that its values belong in the indexes of the unique columns, in
// column order, so that inserting the row need not search there again. Valid until an index changes.
struct InsertionPoints {
  static constexpr std::int32_t kMost = 16;  // columns beyond are searched again
  std::int32_t count = 0;
  SequencePlace place[kMost];
};

// Whose equal values a check of a row accepts.
inline constexpr std::int32_t kNobody = -1;
inline constexpr std::int32_t kAnybody = -2;

// Checks every value of a row, in column order. A unique value that `holder` holds already (a slot, kNobody
// or kAnybody) passes; the error context of the duplicate stays.
[[nodiscard]] TEVPF_STATUS check_row(const TEVPF_TABLE& table, const unsigned char* row,
                                     std::int32_t holder, InsertionPoints& points) noexcept;

// The same as if the row in a slot were not in the table. `positions`: of its entry in each column's index.
[[nodiscard]] TEVPF_STATUS check_row_without(const TEVPF_TABLE& table, const unsigned char* row,
                                             std::int32_t slot,
                                             const std::int32_t* positions) noexcept;

}  // namespace tevpf
