#include "tables/row_store.h"

#include <algorithm>
#include <cstring>
#include <type_traits>

#include "tables/layout.h"
#include "values/value_type.h"

namespace tevpf {
namespace {

// Gives `count` fields of `size` bytes, a row apart, a terminator in their last byte where they have
// none.
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
  if (table.row_data != nullptr && needed <= table.row_room) return true;
  const std::int64_t room = grown_room(table.row_room, needed);
  void* block = heap_resize(table.row_data, static_cast<std::uint64_t>(room), 1);
  if (block == nullptr) return false;
  table.row_data = static_cast<unsigned char*>(block);
  table.row_room = room;
  return true;
}

void open_row_gap(TEVPF_TABLE& table, std::int32_t row) noexcept {
  std::memmove(
      row_at(table, row + std::int64_t{1}), row_at(table, row),
      static_cast<std::size_t>(table.num_rows - row) * static_cast<std::size_t>(table.row_wid));
}

void close_row_gap(TEVPF_TABLE& table, std::int32_t row) noexcept {
  std::memmove(
      row_at(table, row), row_at(table, row + std::int64_t{1}),
      static_cast<std::size_t>(table.num_rows - row - 1) * static_cast<std::size_t>(table.row_wid));
}

void end_texts(const TEVPF_TABLE& table, unsigned char* rows, std::int64_t count) noexcept {
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    const TEVPF_COLUMN& column = table.col_array[i];
    if (column.def.type != PF_TYPE_STRING) continue;
    end_texts(rows + column.offset, column_size(column), count, table.row_wid);
  }
}

void release_rows(TEVPF_TABLE& table) noexcept { adopt_rows(table, nullptr, 0); }

void adopt_rows(TEVPF_TABLE& table, Owned<unsigned char> rows, std::int64_t room) noexcept {
  heap_free(table.row_data);
  table.row_data = rows.release();
  table.row_room = room;
}

bool copy_rows(const TEVPF_TABLE& source, TEVPF_TABLE& copy) noexcept {
  const std::int64_t bytes = std::int64_t{source.num_rows} * source.row_wid;
  auto rows = new_array<unsigned char>(static_cast<std::uint64_t>(bytes));
  if (!rows) return false;
  if (bytes > 0) std::memcpy(rows.get(), source.row_data, static_cast<std::size_t>(bytes));
  adopt_rows(copy, std::move(rows), bytes);
  return true;
}

void copy_values(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                 unsigned char* out) noexcept {
  const unsigned char* value = column_base(table, column);
  const auto copy = [&](auto size) {  // a constant for numbers, so that each copy is a plain move
    for (std::int32_t row = 0; row < table.num_rows; ++row, value += table.row_wid, out += size) {
      std::memcpy(out, value, size);
    }
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
  // Every byte is written at or before the place of the next byte to be read.
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
