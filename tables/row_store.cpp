#include "tables/row_store.h"

#include <algorithm>
#include <cstring>
#include <type_traits>

#include "core/base/short_copy.h"
#include "tables/layout.h"
#include "values/value_type.h"

namespace tevpf {
namespace {

// Terminates `count` fields of `size` bytes, one per row, in their last byte if they have no
// terminator.
void end_texts(unsigned char* field, std::int64_t size, std::int64_t count,
               std::int64_t row_wid) noexcept {
  const auto bytes = static_cast<std::size_t>(size);
  for (; count > 0; --count, field += row_wid) {
    if (field[size - 1] != 0 && std::memchr(field, 0, bytes) == nullptr) field[size - 1] = 0;
  }
}

void put_value(unsigned char* place, const void* value, std::size_t size) noexcept {
  if (value != nullptr) {
    std::memcpy(place, value, size);
  } else {
    std::memset(place, 0, size);
  }
}

}  // namespace

bool reserve_rows(TEVPF_TABLE& table, std::int64_t spare) noexcept {
  return reserve_rows(table, spare, table.row_wid);
}

bool reserve_rows(TEVPF_TABLE& table, std::int64_t spare, std::int64_t row_wid) noexcept {
  const std::int64_t needed = (table.num_rows + spare) * row_wid;
  std::int64_t& bytes = table.slots.bytes;
  if (table.row_data != nullptr && needed <= bytes) return true;
  const std::int64_t room = grown_room(bytes, needed);
  void* block = heap_resize(table.row_data, static_cast<std::uint64_t>(room), 1);
  if (block == nullptr) return false;
  table.row_data = static_cast<unsigned char*>(block);
  bytes = room;
  return true;
}

bool ready_to_insert_row(TEVPF_TABLE& table, std::int32_t row_number) noexcept {
  return table.slots.order.make_ready_to_insert(table.num_rows, row_number, next_slot(table));
}

bool ready_to_erase_row(TEVPF_TABLE& table, std::int32_t row_number) noexcept {
  RowSlots& slots = table.slots;
  if (!slots.order.make_ready_to_erase(table.num_rows, row_number)) return false;
  if (slots.order.is_identity() || slots.num_free < slots.free_room) return true;
  const std::int64_t room = grown_room(slots.free_room, std::int64_t{slots.num_free} + 16);
  void* const block = heap_resize(slots.free, static_cast<std::uint64_t>(room), sizeof *slots.free);
  if (block == nullptr) return false;
  slots.free = static_cast<std::int32_t*>(block);
  slots.free_room = static_cast<std::int32_t>(std::min<std::int64_t>(room, INT32_MAX));
  return true;
}

void insert_row(TEVPF_TABLE& table, std::int32_t row_number, const void* row) noexcept {
  RowSlots& slots = table.slots;
  const std::int32_t slot = next_slot(table);
  if (slots.num_free > 0) --slots.num_free;
  slots.order.insert(table.num_rows, slots.order.place_at(row_number), slot);
  if (table.row_wid > 0) {
    std::memmove(row_at(table, slot), row, static_cast<std::size_t>(table.row_wid));
  }
}

void erase_row(TEVPF_TABLE& table, std::int32_t row_number) noexcept {
  RowSlots& slots = table.slots;
  // The last row of an identity order: the slot after the rows is the next one anyway.
  if (slots.order.is_identity()) return;
  slots.free[slots.num_free++] = slot_of(table, row_number);
  slots.order.erase(table.num_rows, slots.order.place_at(row_number));
  if (table.num_rows > 1) return;
  slots.order.clear();
  slots.num_free = 0;
}

void end_texts(const TEVPF_TABLE& table, unsigned char* rows, std::int64_t count) noexcept {
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    const TEVPF_COLUMN& column = table.col_array[i];
    if (column.def.type != PF_TYPE_STRING) continue;
    end_texts(rows + column.offset, column_size(column), count, table.row_wid);
  }
}

void release_rows(TEVPF_TABLE& table) noexcept { adopt_rows(table, nullptr, 0); }

void adopt_rows(TEVPF_TABLE& table, Owned<unsigned char> rows, std::int64_t bytes) noexcept {
  heap_free(table.row_data);
  heap_free(table.slots.free);
  table.slots.order.clear();
  table.row_data = rows.release();
  table.slots = {};
  table.slots.bytes = bytes;
}

// Reading rows out of slot order causes cache misses, so later rows are prefetched while one is
// copied.
void copy_rows_to(const TEVPF_TABLE& table, unsigned char* out) noexcept {
  constexpr std::int32_t kAhead = 8;
  const std::int64_t row_wid = table.row_wid;
  table.slots.order.for_each_chunk(table.num_rows, [&](const SequenceChunk& chunk) {
    const auto bytes = static_cast<std::size_t>(chunk.count * row_wid);
    if (chunk.items == nullptr) {
      if (bytes != 0) std::memcpy(out, row_at(table, chunk.first), bytes);
    } else {
      for (std::int32_t i = 0; i < chunk.count; ++i) {
        __builtin_prefetch(row_at(table, chunk[std::min(i + kAhead, chunk.count - 1)]));
        copy_short(out + i * row_wid, row_at(table, chunk[i]), row_wid);
      }
    }
    out += bytes;
  });
}

bool copy_rows(const TEVPF_TABLE& source, TEVPF_TABLE& copy) noexcept {
  const std::int64_t bytes = std::int64_t{source.num_rows} * source.row_wid;
  auto rows = new_array<unsigned char>(static_cast<std::uint64_t>(bytes));
  if (!rows) return false;
  copy_rows_to(source, rows.get());
  adopt_rows(copy, std::move(rows), bytes);
  return true;
}

void copy_values(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                 unsigned char* out) noexcept {
  const Values values = values_of(table, column);
  const auto copy = [&](auto size) {  // a constant for numbers, so that each copy is a plain move
    for_each_slot(table, [&](std::int32_t slot) {
      std::memcpy(out, values.of(slot), size);
      out += size;
    });
  };
  if (column.def.type == PF_TYPE_STRING) return copy(static_cast<std::size_t>(column_size(column)));
  with_number(column.def.type,
              [&](auto tag) { copy(std::integral_constant<std::size_t, sizeof tag>{}); });
}

void widen_rows(TEVPF_TABLE& table, std::int64_t new_wid, std::int64_t offset, const void* value,
                std::int64_t size) noexcept {
  const auto old_wid = static_cast<std::size_t>(table.row_wid);
  const auto added = static_cast<std::size_t>(new_wid - table.row_wid);
  for (std::int64_t n = table.num_rows - std::int64_t{1}; n >= 0; --n) {
    unsigned char* row = table.row_data + n * new_wid;
    std::memmove(row, row_at(table, n), old_wid);
    std::memset(row + old_wid, 0, added);
    put_value(row + offset, value, static_cast<std::size_t>(size));
  }
}

std::int32_t add_run(Run* runs, std::int32_t count, Run value) noexcept {
  if (count > 0) {
    Run& last = runs[count - 1];
    if (last.from + last.size == value.from && last.to + last.size == value.to) {
      last.size += value.size;
      return count;
    }
  }
  runs[count] = value;
  return count + 1;
}

void compact_rows(unsigned char* rows, std::int64_t num_rows, std::int64_t old_wid,
                  std::int64_t new_wid, const Run* runs, std::int32_t num_runs) noexcept {
  // Every byte is written at or before the position of the next byte to be read.
  for (std::int64_t n = 0; n < num_rows; ++n) {
    const unsigned char* from = rows + n * old_wid;
    unsigned char* to = rows + n * new_wid;
    std::int64_t end = 0;
    for (const Run* run = runs; run != runs + num_runs; ++run) {
      std::memset(to + end, 0, static_cast<std::size_t>(run->to - end));
      std::memmove(to + run->to, from + run->from, static_cast<std::size_t>(run->size));
      end = std::int64_t{run->to} + run->size;
    }
    std::memset(to + end, 0, static_cast<std::size_t>(new_wid - end));
  }
}

void compact_row(unsigned char* row, const Run* runs, std::int32_t num_runs) noexcept {
  for (const Run* run = runs; run != runs + num_runs; ++run) {
    std::memmove(row + run->to, row + run->from, static_cast<std::size_t>(run->size));
  }
}

void relay_rows(const unsigned char* rows, std::int64_t num_rows, std::int64_t old_wid,
                unsigned char* target, std::int64_t new_wid, const Run* runs,
                std::int32_t num_runs) noexcept {
  for (std::int64_t n = 0; n < num_rows; ++n, rows += old_wid, target += new_wid) {
    for (const Run* run = runs; run != runs + num_runs; ++run) {
      std::memcpy(target + run->to, rows + run->from, static_cast<std::size_t>(run->size));
    }
  }
}

}  // namespace tevpf
