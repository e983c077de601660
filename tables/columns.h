// Steps of the column operations that are exported by themselves.
#pragma once

#include <cstdint>

#include "tables/table.h"

extern "C" {

// Widens all rows for a value of `size` bytes at `offset`: to row_wid + pad + size bytes, the
// definition's min in each; free_rows becomes 0. row_wid itself stays. Nothing without rows.
TEVPF_API TEVPF_STATUS TEV8R1_adjust_data(TEVPF_TABLE* table, std::int32_t size,
                                          std::int32_t offset, std::int32_t pad,
                                          const TEVPF_COL_DEF* definition) noexcept;

// Compares the number at `offset` of every row, in storage order, with the definition's bounds.
//   PF_RANGE  texts: the first value outside, empty
TEVPF_API TEVPF_STATUS TEV8R1_check_column_values(const TEVPF_TABLE* table, std::int32_t offset,
                                                  TEVPF_COL_DEF definition,
                                                  double tolerance) noexcept;

// PF_NOTUNIQUE when two neighbours of the column's index hold equal values.
TEVPF_API TEVPF_STATUS TEV8R1_check_unique_values(const TEVPF_TABLE* table,
                                                  const TEVPF_COLUMN* column) noexcept;
}

namespace tevpf {

// After a change of layout no spare row slot is left; without rows the blocks behind them go, too.
void give_up_spare_rows(TEVPF_TABLE& table) noexcept;

}  // namespace tevpf
