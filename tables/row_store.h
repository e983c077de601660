// The rows of a table. Only row_store knows how they are stored in row_data.
//
// A row occupies one slot of the row block and stays there, whatever is inserted or deleted around
// it. The sequence slots.order lists the slots in storage order. Slots of deleted rows are reused.
//
// Invariants: the slots in the order and the free slots are 0 .. num_rows + num_free - 1, each
// once. The block has room for num_rows + free_rows slots and for num_rows + num_free, and grows
// geometrically. free_rows counts what the documented increments added; callers maintain it, as
// they do num_rows. The whole block may exceed 31 bits. Rows are stored as callers pass them,
// including padding.
#pragma once

#include <cstdint>

#include "core/base/heap.h"
#include "tables/table.h"

namespace tevpf {

// ---- Rows and slots -----------------------------------------------------------------------------

// The row in a slot.
inline unsigned char* row_at(TEVPF_TABLE& table, std::int64_t slot) noexcept {
  return table.row_data + slot * table.row_wid;
}
inline const unsigned char* row_at(const TEVPF_TABLE& table, std::int64_t slot) noexcept {
  return table.row_data + slot * table.row_wid;
}

// Converts a row number to its slot, and a slot to its row number.
inline std::int32_t slot_of(const TEVPF_TABLE& table, std::int32_t row_number) noexcept {
  return table.slots.order.at(row_number);
}
inline std::int32_t row_number_of(const TEVPF_TABLE& table, std::int32_t slot) noexcept {
  const Sequence& order = table.slots.order;
  return order.is_identity() ? slot : order.position_of(table.num_rows, slot);
}

// One column's values, indexed by slot.
struct Values {
  const unsigned char* base;
  std::int64_t stride;

  const unsigned char* of(std::int32_t slot) const noexcept { return base + slot * stride; }
};

inline Values values_of(const TEVPF_TABLE& table, const TEVPF_COLUMN& column) noexcept {
  return {table.row_data == nullptr ? nullptr : table.row_data + column.offset, table.row_wid};
}

// Calls visit(slot) for every row in storage order.
template <class Visit>
void for_each_slot(const TEVPF_TABLE& table, Visit visit) {
  table.slots.order.for_each_chunk(table.num_rows, [&](const SequenceChunk& chunk) {
    for (std::int32_t i = 0; i < chunk.count; ++i) visit(chunk[i]);
  });
}

// The number of bytes that can be read from the start of a column's value in every row.
inline std::int64_t readable_bytes(const TEVPF_TABLE& table, const TEVPF_COLUMN& column) noexcept {
  return std::int64_t{table.row_wid} - column.offset;
}

// Makes room for num_rows + spare rows of row_wid bytes; changes only row_data and its size.
// Returns false when out of memory, and the block is unchanged. New row bytes are not zeroed.
// Afterwards row_data is not null, even when rows have no bytes.
[[nodiscard]] bool reserve_rows(TEVPF_TABLE& table, std::int64_t spare) noexcept;

// The same for rows of a different width, before a change of layout.
[[nodiscard]] bool reserve_rows(TEVPF_TABLE& table, std::int64_t spare,
                                std::int64_t row_wid) noexcept;

// ---- Insertion, deletion and moves; num_rows is the count before the change in all of these
// --------

// The slot for the next row; a spare slot must exist.
inline std::int32_t next_slot(const TEVPF_TABLE& table) noexcept {
  const RowSlots& slots = table.slots;
  return slots.num_free > 0 ? slots.free[slots.num_free - 1] : table.num_rows;
}

// Each allocates what the corresponding change may need. Returns false when out of memory, and
// nothing has changed.
[[nodiscard]] bool ready_to_insert_row(TEVPF_TABLE& table, std::int32_t row_number) noexcept;
[[nodiscard]] bool ready_to_erase_row(TEVPF_TABLE& table, std::int32_t row_number) noexcept;

// Inserts the next slot at a row number and copies the row into it.
void insert_row(TEVPF_TABLE& table, std::int32_t row_number, const void* row) noexcept;

// Frees the slot of a row.
void erase_row(TEVPF_TABLE& table, std::int32_t row_number) noexcept;

// Terminates every string value of `count` rows of this table's layout in its last byte if it has
// no terminator: for rows from callers or files. The rows need not be in the row block.
void end_texts(const TEVPF_TABLE& table, unsigned char* rows, std::int64_t count) noexcept;

// Free the row block, or replace it with one of `bytes` bytes whose rows are in storage order;
// num_rows and free_rows do not change.
void release_rows(TEVPF_TABLE& table) noexcept;
void adopt_rows(TEVPF_TABLE& table, Owned<unsigned char> rows, std::int64_t bytes) noexcept;

// Writes all rows, in storage order, to a block of num_rows * row_wid bytes.
void copy_rows_to(const TEVPF_TABLE& table, unsigned char* out) noexcept;

// Gives `copy`, which has no row block and the same row_wid and num_rows, a block with the same
// rows in storage order.
[[nodiscard]] bool copy_rows(const TEVPF_TABLE& source, TEVPF_TABLE& copy) noexcept;

// Copies one column's values of all rows to a contiguous array, in storage order.
void copy_values(const TEVPF_TABLE& table, const TEVPF_COLUMN& column, unsigned char* out) noexcept;

// ---- Changes of layout, of a settled table ------------------------------------------------------

// Widens all rows in place from row_wid to new_wid bytes, for which the block has room, and stores
// `value` (size bytes) at `offset` of each row, or zeros if it is null. Other new bytes are zero.
void widen_rows(TEVPF_TABLE& table, std::int64_t new_wid, std::int64_t offset, const void* value,
                std::int64_t size) noexcept;

// A run of neighbouring values that stay neighbours: its bytes in an old row and its place in a new
// one.
struct Run {
  std::int32_t from;
  std::int32_t to;
  std::int32_t size;
};

// Adds one value to `count` runs; extends the last run if the value continues it both in the old
// and in the new row. Returns the new count.
std::int32_t add_run(Run* runs, std::int32_t count, Run value) noexcept;

// Rearranges rows in place, where no value moves up and no row grows; runs are in ascending order.
void compact_rows(unsigned char* rows, std::int64_t num_rows, std::int64_t old_wid,
                  std::int64_t new_wid, const Run* runs, std::int32_t num_runs) noexcept;

// The same for a single row; bytes between the values are unchanged.
void compact_row(unsigned char* row, const Run* runs, std::int32_t num_runs) noexcept;

// Rearranges rows into `target`, a block of num_rows * new_wid zeroed bytes.
void relay_rows(const unsigned char* rows, std::int64_t num_rows, std::int64_t old_wid,
                unsigned char* target, std::int64_t new_wid, const Run* runs,
                std::int32_t num_runs) noexcept;

}  // namespace tevpf
