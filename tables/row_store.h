// The rows of a table in storage order: the only file that knows how they lie in row_data.
//
// The block behind row_data holds row_room bytes, at least (num_rows + free_rows) * row_wid, and
// grows geometrically; free_rows counts what the documented increments gave, and is the callers'
// business, like num_rows. The block as a whole may exceed 31 bits. Rows are kept as they are handed in,
// padding included.
#pragma once

#include <cstdint>

#include "core/base/heap.h"
#include "tables/table.h"

namespace tevpf {

// A row by its number, 0 .. num_rows + free_rows - 1.
inline unsigned char* row_at(TEVPF_TABLE& table, std::int64_t row) noexcept {
  return table.row_data + row * table.row_wid;
}
inline const unsigned char* row_at(const TEVPF_TABLE& table, std::int64_t row) noexcept {
  return table.row_data + row * table.row_wid;
}

// The values of one column: the column's value in row number 0, and row_wid bytes further on the
// next.
inline const unsigned char* column_base(const TEVPF_TABLE& table,
                                        const TEVPF_COLUMN& column) noexcept {
  return table.row_data == nullptr ? nullptr : table.row_data + column.offset;
}

// These values by row number.
struct Values {
  const unsigned char* base;
  std::int64_t stride;

  const unsigned char* of(std::int32_t row) const noexcept { return base + row * stride; }
};

inline Values values_of(const TEVPF_TABLE& table, const TEVPF_COLUMN& column) noexcept {
  return {column_base(table, column), table.row_wid};
}

// Bytes that can be read from the start of a column's value in every row.
inline std::int64_t readable_bytes(const TEVPF_TABLE& table, const TEVPF_COLUMN& column) noexcept {
  return std::int64_t{table.row_wid} - column.offset;
}

// Makes room for num_rows + spare rows of row_wid bytes; only row_data and row_room change. False
// when memory runs out: the block is as it was. Row bytes that are new are not zeroed. Afterwards
// row_data is not null, even where rows have no bytes.
[[nodiscard]] bool reserve_rows(TEVPF_TABLE& table, std::int64_t spare) noexcept;

// The same for rows of another width, before a change of layout.
[[nodiscard]] bool reserve_rows(TEVPF_TABLE& table, std::int64_t spare,
                                std::int64_t row_wid) noexcept;

// Move the rows from number `row` to the last one up by one slot (there is a spare one), and the
// rows behind `row` down over it. num_rows is the count before the change in both, and stays.
void open_row_gap(TEVPF_TABLE& table, std::int32_t row) noexcept;
void close_row_gap(TEVPF_TABLE& table, std::int32_t row) noexcept;

// Gives every string value of `count` rows of this table's layout that has no terminator one in its
// last byte: for rows that callers or files hand in. They may lie anywhere.
void end_texts(const TEVPF_TABLE& table, unsigned char* rows, std::int64_t count) noexcept;

// Give the row block back, or replace it by one of `room` bytes; num_rows and free_rows stay.
void release_rows(TEVPF_TABLE& table) noexcept;
void adopt_rows(TEVPF_TABLE& table, Owned<unsigned char> rows, std::int64_t room) noexcept;

// Gives `copy`, which has no row block and the same row_wid and num_rows, a block with the same
// rows.
[[nodiscard]] bool copy_rows(const TEVPF_TABLE& source, TEVPF_TABLE& copy) noexcept;

// Copies one column's values of all rows, side by side in storage order.
void copy_values(const TEVPF_TABLE& table, const TEVPF_COLUMN& column, unsigned char* out) noexcept;

// ---- Changes of layout --------------------------------------------------------------------------

// Widens all rows in place from row_wid to new_wid, which have room for it, and puts `value` (size
// bytes) at `offset` of each, zeros where it is null. Other bytes that are new are zero.
void widen_rows(TEVPF_TABLE& table, std::int64_t new_wid, std::int64_t offset, const void* value,
                std::int64_t size) noexcept;

// Some neighbouring values that stay neighbours: bytes of an old row and where they go in a new
// one.
struct Run {
  std::int32_t from;
  std::int32_t to;
  std::int32_t size;
};

// Adds one value to `count` runs, growing the last one where the value continues it both in the old
// and in the new row; returns the new count.
std::int32_t add_run(Run* runs, std::int32_t count, Run value) noexcept;

// Rows re-laid in place, where no value moves up and no row grows; runs in ascending order.
void compact_rows(unsigned char* rows, std::int64_t num_rows, std::int64_t old_wid,
                  std::int64_t new_wid, const Run* runs, std::int32_t num_runs) noexcept;

// The same for a single row, whose bytes between the values stay what they are.
void compact_row(unsigned char* row, const Run* runs, std::int32_t num_runs) noexcept;

// Rows re-laid into `target`, num_rows * new_wid zeroed bytes.
void relay_rows(const unsigned char* rows, std::int64_t num_rows, std::int64_t old_wid,
                unsigned char* target, std::int64_t new_wid, const Run* runs,
                std::int32_t num_runs) noexcept;

}  // namespace tevpf
