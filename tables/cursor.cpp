#include "tables/cursor.h"

#include "core/base/status.h"
#include "tables/directory.h"
#include "tables/settle.h"

namespace tevpf {
namespace {

inline TEVPF_STATUS step(TEVPF_TABLE& table, void* row_out) noexcept {
  if (!has_position(table, table.next_row)) return PF_NOMORE;
  fetch_ahead(table, table.next_row);
  deliver_row(table, table.next_row, row_out);
  return PF_NORMAL;
}

[[gnu::noinline]] TEVPF_STATUS find_and_step(const char* table_name, void* row_out) noexcept {
  TEVPF_TABLE* table;
  PF_TRY(find_table(table_name, table));
  return step(*table, row_out);
}

}  // namespace

std::int32_t slot_in_blocks(TEVPF_TABLE& table, std::int32_t position) noexcept {
  count_reads(table, 1);  // may settle the table
  return traversal_of(table).at(position);
}

}  // namespace tevpf

using namespace tevpf;

// Callers can write the row through the pointers that these two functions return.

TEVPF_STATUS TEV8R1_get_next_row_ptr(TEVPF_TABLE* table, void** row_ptr_out,
                                     int32_t* row_number_out) noexcept {
  forget_values(*table);
  const bool exists = has_position(*table, table->next_row);
  *row_number_out = exists ? row_number_at(*table, table->next_row) : table->next_row;
  *row_ptr_out = exists ? row_at(*table, traversal_of(*table).at(table->next_row)) : nullptr;
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_get_cur_row_ptr(TEVPF_TABLE* table, void** row_ptr_out,
                                    int32_t* row_number_out) noexcept {
  if (!has_position(*table, table->cur_row)) return fail_empty(PF_NOCURROW);
  forget_values(*table);
  *row_number_out = row_number_at(*table, table->cur_row);
  *row_ptr_out = row_at(*table, traversal_of(*table).at(table->cur_row));
  return PF_NORMAL;
}

// Callers read millions of rows, one call each. The usual case makes no calls, so the compiler does
// not have to save any registers.
TEVPF_STATUS TEV8R1_PF_get_next_row(const char* table_name, void* row_out) noexcept {
  TEVPF_TABLE* const table = last_table(table_name);
  return table != nullptr ? step(*table, row_out) : find_and_step(table_name, row_out);
}

TEVPF_STATUS TEV8R1_PF_get_row_by_pos(const char* table_name, int32_t pos, void* row_out) noexcept {
  TEVPF_TABLE* table;
  PF_TRY(find_table(table_name, table));
  if (!has_position(*table, pos)) return fail(PF_BADPOS, Text(pos), Text(table->num_rows));
  deliver_row(*table, pos, row_out);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_reset_table(const char* table_name) noexcept {
  TEVPF_TABLE* table;
  PF_TRY(find_table(table_name, table));
  table->cur_row = -1;
  table->next_row = 0;
  return PF_NORMAL;
}

int32_t TEV8R1_convert_row(const char* table_name, int32_t pos) noexcept {
  TEVPF_TABLE* table;
  if (find_table(table_name, table) != PF_NORMAL) return -1;
  return has_position(*table, pos) ? row_number_at(*table, pos) : pos;
}
