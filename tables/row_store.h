// The rows of a table: the only file that knows how they lie in row_data.
//
// A row lies in a slot of the row block and stays there, whatever is inserted or deleted around it; the
// sequence slots.order lists the slots in storage order. Slots of deleted rows are used again.
//
// Invariants: the slots in order and the free ones are 0 .. num_rows + num_free - 1, each once. The block
// has room for num_rows + free_rows slots and for num_rows + num_free, and grows geometrically; free_rows
// counts what the documented increments gave, and is the callers' business, like num_rows. The block as a
// whole may exceed 31 bits. Rows are kept as they are handed in, padding included.
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

// The slot of a row number, and the way back.
inline std::int32_t slot_of(const TEVPF_TABLE& table, std::int32_t row_number) noexcept {
  return table.slots.order.at(row_number);
}
inline std::int32_t row_number_of(const TEVPF_TABLE& table, std::int32_t slot) noexcept {
  const Sequence& order = table.slots.order;
  return order.is_identity() ? slot : order.position_of(table.num_rows, slot);
}

// One column's values by slot.
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

// Bytes that can be read from the start of a column's value in every row.
inline std::int64_t readable_bytes(const TEVPF_TABLE& table, const TEVPF_COLUMN& column) noexcept {
  return std::int64_t{table.row_wid} - column.offset;
}

// Makes room for num_rows + spare rows of row_wid bytes; only row_data and its size change. False when
// memory runs out: the block is as it was. Row bytes that are new are not zeroed. Afterwards row_data is
// not null, even where rows have no bytes.
[[nodiscard]] bool reserve_rows(TEVPF_TABLE& table, std::int64_t spare) noexcept;

// The same for rows of another width, before a change of layout.
[[nodiscard]] bool reserve_rows(TEVPF_TABLE& table, std::int64_t spare,
                                std::int64_t row_wid) noexcept;

// ---- Rows that come, go and move; num_rows is the count before the change in all of these -----------

// The slot that the next row gets; there is a spare one.
inline std::int32_t next_slot(const TEVPF_TABLE& table) noexcept {
  const RowSlots& slots = table.slots;
  return slots.num_free > 0 ? slots.free[slots.num_free - 1] : table.num_rows;
}

// Each allocates what the change behind it can need; false when memory runs out, and nothing has changed.
[[nodiscard]] bool ready_to_insert_row(TEVPF_TABLE& table, std::int32_t row_number) noexcept;
[[nodiscard]] bool ready_to_erase_row(TEVPF_TABLE& table, std::int32_t row_number) noexcept;

// Puts the next slot at a row number and the row into it.
void insert_row(TEVPF_TABLE& table, std::int32_t row_number, const void* row) noexcept;

// Frees the slot of a row.
void erase_row(TEVPF_TABLE& table, std::int32_t row_number) noexcept;

// Gives every string value of `count` rows of this table's layout that has no terminator one in its
// last byte: for rows that callers or files hand in. They may lie anywhere.
void end_texts(const TEVPF_TABLE& table, unsigned char* rows, std::int64_t count) noexcept;

// Give the row block back, or replace it by one of `bytes` bytes whose rows lie in storage order; num_rows
// and free_rows stay.
void release_rows(TEVPF_TABLE& table) noexcept;
void adopt_rows(TEVPF_TABLE& table, Owned<unsigned char> rows, std::int64_t bytes) noexcept;

// Writes all rows in storage order to a block of num_rows * row_wid bytes.
void copy_rows_to(const TEVPF_TABLE& table, unsigned char* out) noexcept;

// Gives `copy`, which has no row block and the same row_wid and num_rows, a block with the same rows in
// storage order.
[[nodiscard]] bool copy_rows(const TEVPF_TABLE& source, TEVPF_TABLE& copy) noexcept;

// Copies one column's values of all rows, side by side in storage order.
void copy_values(const TEVPF_TABLE& table, const TEVPF_COLUMN& column, unsigned char* out) noexcept;

// ---- Changes of layout, of a settled table ------------------------------------------------------

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
