#include "tables/row_store.h"

#include <algorithm>
#include <cstring>
#include <type_traits>

#include "tables/layout.h"
#include "values/value_type.h"

namespace tevpf {
namespace {

// Zeroes the same bytes of many rows in one pass over them, or in one for each kMost. A gap is a
// few bytes, so each is a word of the row with a mask over it: a call to memset costs more than the
// rest.
class Eraser {
 public:
  // cppcheck-suppress uninitMemberVar; add fills the words that are counted
  Eraser(unsigned char* rows, std::int64_t count, std::int64_t row_wid) noexcept
      : rows_(rows), count_(count), row_wid_(row_wid) {}

  void zero(std::int64_t from, std::int64_t to) noexcept {
    for (; from < to; from = std::min(from + kWord, to)) add(from, std::min(to - from, kWord));
  }

  void finish() noexcept {
    if (!is_clean()) erase();
    used_ = 0;
  }

 private:
  static constexpr int kMost = 4;
  static constexpr std::int64_t kWord = 8;
  struct Word {
    std::int64_t offset;
    std::uint64_t kept;
  };

  // Rows of a file mostly are clean, and reading them only is twice as fast as writing them.
  bool is_clean() const noexcept {
    switch (used_) {
      case 0:
        return true;
      case 1:
        return has_zeros<1>();
      case 2:
        return has_zeros<2>();
      case 3:
        return has_zeros<3>();
      default:
        static_assert(kMost == 4);
        return has_zeros<kMost>();
    }
  }

  template <int kWords>
  bool has_zeros() const noexcept {
    std::uint64_t stray = 0;
    const unsigned char* row = rows_;
    for (std::int64_t i = 0; i < count_; ++i, row += row_wid_) {
      for (int w = 0; w < kWords; ++w) {
        stray |= load<std::uint64_t>(row + words_[w].offset) & ~words_[w].kept;
      }
    }
    return stray == 0;
  }

  void erase() noexcept {
    for (std::int64_t row = 0; row < count_; ++row) {
      unsigned char* const bytes = rows_ + row * row_wid_;
      for (int i = 0; i < used_; ++i) {
        unsigned char* const word = bytes + words_[i].offset;
        store(word, load<std::uint64_t>(word) & words_[i].kept);
      }
    }
  }

  // `size` bytes, 1 to 8, from `offset` on; the word around them ends within the row.
  void add(std::int64_t offset, std::int64_t size) noexcept {
    if (row_wid_ < kWord) {
      for (std::int64_t row = 0; row < count_; ++row) {
        std::memset(rows_ + row * row_wid_ + offset, 0, static_cast<std::size_t>(size));
      }
      return;
    }
    const std::int64_t start = std::min(offset, row_wid_ - kWord);
    const std::uint64_t gone = ~std::uint64_t{0} >> (8 * (kWord - size));
    words_[used_++] = {start, ~(gone << (8 * (offset - start)))};
    if (used_ == kMost) finish();
  }

  unsigned char* rows_;
  std::int64_t count_;
  std::int64_t row_wid_;
  Word words_[kMost];
  int used_ = 0;
};

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

void clean_rows(const TEVPF_TABLE& table, unsigned char* rows, std::int64_t count) noexcept {
  Eraser eraser(rows, count, table.row_wid);
  // From the last byte of a string, or the end of a number, to the next value or the row's end.
  std::int64_t zero_from = 0;
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    const TEVPF_COLUMN& column = table.col_array[i];
    eraser.zero(zero_from, column.offset);
    zero_from = column.offset + column_size(column) - (column.def.type == PF_TYPE_STRING ? 1 : 0);
  }
  eraser.zero(zero_from, table.row_wid);
  eraser.finish();
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
