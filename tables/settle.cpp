#include "tables/settle.h"

#include <algorithm>

#include "core/base/heap.h"
#include "tables/column_index.h"
#include "tables/column_record.h"
#include "tables/directory.h"
#include "tables/row_store.h"

namespace tevpf {
namespace {

std::int32_t wanted_room(const TEVPF_TABLE& table) noexcept {
  const std::int64_t room =
      std::int64_t{table.num_rows} + std::max<std::int16_t>(table.free_rows, 0);
  return static_cast<std::int32_t>(std::min<std::int64_t>(room, INT32_MAX));
}

bool is_settled(const TEVPF_TABLE& table, std::int32_t room) noexcept {
  if (!table.slots.order.is_identity()) return false;
  return std::all_of(table.col_array, table.col_array + table.num_cols,
                     [&](const TEVPF_COLUMN& column) {
                       if (!is_indexed(column) || room == 0) return true;
                       return column.index.items != nullptr && column.index.room >= room;
                     });
}

bool flatten_indexes(TEVPF_TABLE& table, std::int32_t room) noexcept {
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    TEVPF_COLUMN& column = table.col_array[i];
    if (is_indexed(column) && room > 0 && !column.index.flatten(table.num_rows, room)) return false;
  }
  return true;
}

// The row number of the row in each slot.
Owned<std::int32_t> number_slots(const TEVPF_TABLE& table) noexcept {
  auto numbers = new_array<std::int32_t>(static_cast<std::uint64_t>(table.num_rows) +
                                         static_cast<std::uint64_t>(table.slots.num_free));
  if (!numbers) return numbers;
  std::int32_t row_number = 0;
  for_each_slot(table,
                [&](std::int32_t slot) { numbers[static_cast<std::size_t>(slot)] = row_number++; });
  return numbers;
}

// Moves the rows into storage order; the indexes are flat.
bool order_rows(TEVPF_TABLE& table, std::int32_t room) noexcept {
  const std::int64_t bytes = std::int64_t{room} * table.row_wid;
  auto rows = new_array<unsigned char>(static_cast<std::uint64_t>(bytes));
  const Owned<std::int32_t> numbers = number_slots(table);
  if (!rows || !numbers) return false;
  copy_rows_to(table, rows.get());
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    std::int32_t* const entries = table.col_array[i].index.items;
    if (!is_indexed(table.col_array[i])) continue;
    std::transform(entries, entries + table.num_rows, entries,
                   [&](std::int32_t slot) { return numbers[static_cast<std::size_t>(slot)]; });
  }
  adopt_rows(table, std::move(rows), bytes);
  return true;
}

}  // namespace

bool settle(TEVPF_TABLE& table) noexcept {
  const std::int32_t room = wanted_room(table);
  if (is_settled(table, room)) return true;
  table.reads = 0;
  if (!flatten_indexes(table, room)) return false;
  return table.slots.order.is_identity() || order_rows(table, room);
}

TEVPF_STATUS find_settled_table(const char* name, TEVPF_TABLE*& table) noexcept {
  PF_TRY(find_table(name, table));
  return settle(*table) ? TEVPF_STATUS{PF_NORMAL} : fail_empty(PF_NOMEM);
}

// Reading a row through blocks costs some tens of nanoseconds more; settling costs about a hundred
// per row. When out of memory, the table stays unsettled until as many more reads.
void count_reads(TEVPF_TABLE& table, std::int64_t rows) noexcept {
  constexpr std::int64_t kReadsPerRow = 4;
  table.reads += rows;
  if (table.reads > kReadsPerRow * table.num_rows) (void)settle(table);
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_get_table_ptr(const char* name, TEVPF_TABLE** table_out) noexcept {
  return find_settled_table(name, *table_out);
}

TEVPF_STATUS TEV8R1_get_col_ptr(TEVPF_TABLE* table, const char* name,
                                TEVPF_COLUMN** column_out) noexcept {
  TEVPF_COLUMN* column;
  PF_TRY(find_column(*table, name, column));
  if (!settle(*table)) return fail_empty(PF_NOMEM);
  *column_out = column;
  return PF_NORMAL;
}
