// The table's cursor: the position of the current row and of the next one.
#pragma once

#include <cstdint>

#include "core/base/short_copy.h"
#include "tables/column_index.h"
#include "tables/row_store.h"
#include "tables/table.h"

extern "C" {

// The row at position next_row, and its row number. Without a next row: null, and the position.
// Always PF_NORMAL. Values that no index covers may be written through the pointer, of both
// operations, until the table is searched again.
TEVPF_API TEVPF_STATUS TEV8R1_get_next_row_ptr(TEVPF_TABLE* table, void** row_ptr_out,
                                               std::int32_t* row_number_out) noexcept;

// The row at position cur_row, and its row number.
//   PF_NOCURROW  no row is current; texts empty
TEVPF_API TEVPF_STATUS TEV8R1_get_cur_row_ptr(TEVPF_TABLE* table, void** row_ptr_out,
                                              std::int32_t* row_number_out) noexcept;
}

namespace tevpf {

// How many positions ahead rows are fetched into the cache while they are read in search order.
inline constexpr std::int32_t kRowsAhead = 12;

// In search order rows lie anywhere: ask for one some positions ahead, so that it is there in time.
// As a function of its own it would have no effect that the compiler knows of, and be left out.
[[gnu::always_inline]] inline void fetch_ahead(const TEVPF_TABLE& table,
                                               std::int32_t position) noexcept {
  if (table.cur_col == nullptr || table.num_rows - position <= kRowsAhead) return;
  const unsigned char* const row = row_at(table, row_at_position(table, position + kRowsAhead));
  __builtin_prefetch(row);
  __builtin_prefetch(row + table.row_wid - 1);
}

// Copies the row at a position to row_out and makes it the current one.
inline void deliver_row(TEVPF_TABLE& table, std::int32_t position, void* row_out) noexcept {
  const unsigned char* const row = row_at(table, row_at_position(table, position));
  table.cur_row = position;
  table.next_row = position + 1;
  copy_short(row_out, row, table.row_wid);
}

}  // namespace tevpf
