#include "tables/row_store.h"

#include <algorithm>
#include <cstring>

#include "tables/layout.h"

namespace tevpf {

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

void clean_rows(const TEVPF_TABLE& table, unsigned char* rows, std::int64_t count) noexcept {
  struct Spot {
    std::int64_t offset, size;
  };
  constexpr int kSpots = 32;
  Spot spots[kSpots];
  int num_spots = 0;

  // As many spots as the array holds are zeroed in one pass over the rows.
  const auto zero_spots = [&] {
    for (std::int64_t row = 0; row < count; ++row) {
      for (int i = 0; i < num_spots; ++i) {
        std::memset(rows + row * table.row_wid + spots[i].offset, 0,
                    static_cast<std::size_t>(spots[i].size));
      }
    }
    num_spots = 0;
  };

  // From the last byte of a string, or the end of a number, to the next value or the row's end.
  std::int64_t zero_from = 0;
  for (std::int32_t i = 0; i <= table.num_cols; ++i) {
    const bool behind_last = i == table.num_cols;
    const std::int64_t zero_to = behind_last ? table.row_wid : table.col_array[i].offset;
    if (zero_to > zero_from) {
      spots[num_spots++] = {zero_from, zero_to - zero_from};
      if (num_spots == kSpots) zero_spots();
    }
    if (behind_last) break;
    const TEVPF_COLUMN& column = table.col_array[i];
    zero_from = zero_to + column_size(column) - (column.def.type == PF_TYPE_STRING ? 1 : 0);
  }
  zero_spots();
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

void widen_rows(TEVPF_TABLE& table, std::int64_t new_wid, std::int64_t offset, const void* value,
                std::int64_t size) noexcept {
  const auto old_wid = static_cast<std::size_t>(table.row_wid);
  // The new value may start in the old row's trailing padding, never before it.
  const std::int64_t tail = std::min<std::int64_t>(offset, table.row_wid);
  for (std::int64_t n = table.num_rows - std::int64_t{1}; n >= 0; --n) {
    unsigned char* row = table.row_data + n * new_wid;
    std::memmove(row, row_at(table, n), old_wid);
    std::memset(row + tail, 0, static_cast<std::size_t>(new_wid - tail));
    if (value != nullptr) std::memcpy(row + offset, value, static_cast<std::size_t>(size));
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
