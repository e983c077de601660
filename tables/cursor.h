// The table's cursor: the positions of the current row and of the next one.
#pragma once

#include <cstdint>

#include "core/base/short_copy.h"
#include "tables/column_index.h"
#include "tables/row_store.h"
#include "tables/table.h"

extern "C" {

// The row at position next_row, and its row number. If there is no next row: null, and the
// position. Always PF_NORMAL. Through the pointers returned by both operations, callers may write
// values that no index covers, until the next search of the table.
TEVPF_API TEVPF_STATUS TEV8R1_get_next_row_ptr(TEVPF_TABLE* table, void** row_ptr_out,
                                               std::int32_t* row_number_out) noexcept;

// The row at position cur_row, and its row number.
//   PF_NOCURROW  no row is current; texts empty
TEVPF_API TEVPF_STATUS TEV8R1_get_cur_row_ptr(TEVPF_TABLE* table, void** row_ptr_out,
                                              std::int32_t* row_number_out) noexcept;
}

namespace tevpf {

inline bool has_position(const TEVPF_TABLE& table, std::int32_t position) noexcept {
  return position >= 0 && position < table.num_rows;
}

// The row number at a position of the traversal.
inline std::int32_t row_number_at(const TEVPF_TABLE& table, std::int32_t position) noexcept {
  const Sequence& traversal = traversal_of(table);
  if (&traversal == &table.slots.order) return position;
  return row_number_of(table, traversal.at(position));
}

// How many positions ahead rows are prefetched when they are not read in storage order.
inline constexpr std::int32_t kRowsAhead = 12;

// Prefetches a row some positions ahead. Must be inlined: as a separate function it would have no
// effect known to the compiler, which would drop the call.
[[gnu::always_inline]] inline void fetch_ahead(const TEVPF_TABLE& table,
                                               std::int32_t position) noexcept {
  const Sequence& traversal = traversal_of(table);
  if (traversal.items == nullptr || table.num_rows - position <= kRowsAhead) return;
  const unsigned char* const row = row_at(table, traversal.items[position + kRowsAhead]);
  __builtin_prefetch(row);
  __builtin_prefetch(row + table.row_wid - 1);
}

// The slot at a position in a sequence of blocks; counts the read. Out of line to keep the usual
// case short.
std::int32_t slot_in_blocks(TEVPF_TABLE& table, std::int32_t position) noexcept;

// The slot at a position, for reading its row.
inline std::int32_t read_slot(TEVPF_TABLE& table, std::int32_t position) noexcept {
  const Sequence& traversal = traversal_of(table);
  if (traversal.items != nullptr) return traversal.items[position];
  return traversal.blocks == nullptr ? position : slot_in_blocks(table, position);
}

// Copies the row at a position to row_out and makes it the current one.
inline void deliver_row(TEVPF_TABLE& table, std::int32_t position, void* row_out) noexcept {
  const unsigned char* const row = row_at(table, read_slot(table, position));
  table.cur_row = position;
  table.next_row = position + 1;
  copy_short(row_out, row, table.row_wid);
}

}  // namespace tevpf
