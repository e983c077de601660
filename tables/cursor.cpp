#include "tables/cursor.h"

#include "core/base/status.h"
#include "tables/directory.h"
#include "tables/search_keys.h"

namespace tevpf {
namespace {

bool has_position(const TEVPF_TABLE& table, std::int32_t position) noexcept {
  return position >= 0 && position < table.num_rows;
}

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
}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_get_next_row_ptr(TEVPF_TABLE* table, void** row_ptr_out,
                                     int32_t* row_number_out) noexcept {
  drop_search_keys(*table);  // the row can be written through the pointer
  const bool exists = has_position(*table, table->next_row);
  *row_number_out = exists ? row_at_position(*table, table->next_row) : table->next_row;
  *row_ptr_out = exists ? row_at(*table, *row_number_out) : nullptr;
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_get_cur_row_ptr(TEVPF_TABLE* table, void** row_ptr_out,
                                    int32_t* row_number_out) noexcept {
  if (!has_position(*table, table->cur_row)) return fail_empty(PF_NOCURROW);
  drop_search_keys(*table);
  *row_number_out = row_at_position(*table, table->cur_row);
  *row_ptr_out = row_at(*table, *row_number_out);
  return PF_NORMAL;
}

// Rows are read by the million, one call each. The usual case calls nothing, so that nothing has to be
// kept across a call.
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
  return has_position(*table, pos) ? row_at_position(*table, pos) : pos;
}
