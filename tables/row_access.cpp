// Row access for callers that share a table. Rows are read through the table's cursor and search
// column, which are restored afterwards.
#include <algorithm>
#include <cstring>
#include <numeric>

#include "core/base/status.h"
#include "include/tevpf_access.h"
#include "tables/column_index.h"
#include "tables/column_record.h"
#include "tables/cursor.h"
#include "tables/directory.h"
#include "tables/row_store.h"

using namespace tevpf;

namespace {

// Saves a table's cursor and search column, and restores them at the end of the scope.
class BorrowedCursor {
 public:
  BorrowedCursor(TEVPF_TABLE& table, TEVPF_COLUMN* order) noexcept
      : table_(table), column_(table.cur_col), row_(table.cur_row), next_(table.next_row) {
    table.cur_col = order;
  }
  ~BorrowedCursor() {
    table_.cur_col = column_;
    table_.cur_row = row_;
    table_.next_row = next_;
  }
  BorrowedCursor(const BorrowedCursor&) = delete;
  BorrowedCursor& operator=(const BorrowedCursor&) = delete;

 private:
  TEVPF_TABLE& table_;
  TEVPF_COLUMN* column_;
  std::int32_t row_, next_;
};

TEVPF_STATUS check_request(const TEVPF_TABLE& table, std::int32_t first, std::int32_t row_size) {
  if (first < 0) return fail(PF_BADPOS, Text(first), Text(table.num_rows));
  return row_size == table.row_wid ? PF_NORMAL
                                   : fail(PF_BADARG, Text(row_size), Text(table.row_wid));
}

// The column that determines the requested order; null for a null name.
TEVPF_STATUS find_order(const TEVPF_TABLE& table, const char* name, TEVPF_COLUMN*& column) {
  column = nullptr;
  if (name == nullptr) return PF_NORMAL;
  PF_TRY(find_column(table, name, column));
  return is_indexed(*column) ? PF_NORMAL : fail(PF_BADSEARCH, name);
}

// Copies rows that lie in storage order at once; gives how many there were.
std::int32_t copy_neighbours(const TEVPF_TABLE& table, std::int32_t first, std::int32_t wanted,
                             void* rows_out, std::int32_t* numbers_out) noexcept {
  const std::int32_t count = std::clamp(table.num_rows - first, 0, wanted);
  const auto bytes = static_cast<std::size_t>(std::int64_t{count} * table.row_wid);
  if (bytes > 0) std::memcpy(rows_out, row_at(table, first), bytes);
  if (numbers_out != nullptr) std::iota(numbers_out, numbers_out + count, first);
  return count;
}

}  // namespace

TEVPF_STATUS tevpf_get_rows(const char* table_name, const char* order_name, std::int32_t first,
                            std::int32_t* count, std::int32_t row_size, void* rows_out,
                            std::int32_t* numbers_out) noexcept {
  TEVPF_TABLE* table;
  TEVPF_COLUMN* order;
  PF_TRY(find_table(table_name, table));
  PF_TRY(find_order(*table, order_name, order));
  if (*count < 0) return fail(PF_BADPOS, Text(*count), Text(table->num_rows));
  PF_TRY(check_request(*table, first, row_size));

  if (order == nullptr && table->slots.order.is_identity()) {
    *count = copy_neighbours(*table, first, *count, rows_out, numbers_out);
    return PF_NORMAL;
  }
  const BorrowedCursor borrowed(*table, order);
  const std::int32_t last = first + std::clamp(table->num_rows - first, 0, *count);
  auto* out = static_cast<unsigned char*>(rows_out);
  for (std::int32_t position = first; position < last; ++position, out += row_size) {
    fetch_ahead(*table, position);
    deliver_row(*table, position, out);
    if (numbers_out != nullptr) *numbers_out++ = row_number_at(*table, position);
  }
  *count = last - first;
  return PF_NORMAL;
}

TEVPF_STATUS tevpf_find_row(const char* table_name, const char* column_name, std::int8_t mode,
                            const void* key, std::int32_t first, std::int32_t row_size,
                            void* row_out, std::int32_t* position_out,
                            std::int32_t* number_out) noexcept {
  TEVPF_TABLE* table;
  TEVPF_COLUMN* column;
  PF_TRY(find_table(table_name, table));
  PF_TRY(find_column(*table, column_name, column));
  PF_TRY(check_request(*table, first, row_size));

  const BorrowedCursor borrowed(*table, is_indexed(*column) ? column : nullptr);
  table->next_row = first;
  PF_TRY(TEV8R1_PF_get_row_by_value(table_name, mode, column_name, key, row_out));
  *position_out = table->cur_row;
  *number_out = row_number_at(*table, table->cur_row);
  return PF_NORMAL;
}
