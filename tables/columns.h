// Steps of the column operations that are also exported individually.
#pragma once

#include <cstdint>

#include "tables/table.h"

extern "C" {

// Widens all rows for a value of `size` bytes at `offset`, to row_wid + pad + size bytes, and
// stores the definition's min in each row. Sets free_rows to 0. Does not change row_wid. Does
// nothing without rows.
TEVPF_API TEVPF_STATUS TEV8R1_adjust_data(TEVPF_TABLE* table, std::int32_t size,
                                          std::int32_t offset, std::int32_t pad,
                                          const TEVPF_COL_DEF* definition) noexcept;

// Compares the number at `offset` of every row, in storage order, with the definition's bounds.
//   PF_RANGE  texts: the first value out of bounds, empty
TEVPF_API TEVPF_STATUS TEV8R1_check_column_values(const TEVPF_TABLE* table, std::int32_t offset,
                                                  TEVPF_COL_DEF definition,
                                                  double tolerance) noexcept;

// PF_NOTUNIQUE when two neighbouring entries of the column's index hold equal values; PF_NOMEM.
TEVPF_API TEVPF_STATUS TEV8R1_check_unique_values(TEVPF_TABLE* table,
                                                  TEVPF_COLUMN* column) noexcept;

// Builds the column's index from the rows; does nothing without row slots. PF_NOMEM.
TEVPF_API TEVPF_STATUS TEV8R1_create_index(TEVPF_TABLE* table, TEVPF_COLUMN* column) noexcept;
}

namespace tevpf {

// Drops the spare row slots after a change of layout; without rows, frees their blocks too.
void give_up_spare_rows(TEVPF_TABLE& table) noexcept;

}  // namespace tevpf
