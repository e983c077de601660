// Table properties, the check of a single value, and interactive mode.
#include "core/base/status.h"
#include "core/library.h"
#include "tables/column_record.h"
#include "tables/directory.h"
#include "tables/validate.h"

using namespace tevpf;

TEVPF_STATUS TEV8R1_PF_inq_num_rows(const char* table_name, int32_t* num_rows_out) noexcept {
  TEVPF_TABLE* table;
  PF_TRY(find_table(table_name, table));
  *num_rows_out = table->num_rows;
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_inq_table_info(const char* table_name, int32_t* num_cols_out,
                                      int32_t* num_rows_out, int32_t* row_wid_out,
                                      int32_t* dsp_wid_out, int32_t* cur_row_out) noexcept {
  TEVPF_TABLE* table;
  PF_TRY(find_table(table_name, table));
  *num_cols_out = table->num_cols;
  *num_rows_out = table->num_rows;
  *row_wid_out = table->row_wid;
  *dsp_wid_out = table->dsp_wid;
  *cur_row_out = table->cur_row;
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_validate_row_value(const char* table_name, const char* column_name,
                                       const void* value) noexcept {
  TEVPF_TABLE* table;
  TEVPF_COLUMN* column;
  PF_TRY(find_table(table_name, table));
  PF_TRY(find_column(*table, column_name, column));
  return TEV8R1_validate_value(table, column, value);
}

TEVPF_STATUS TEV8R1_set_interactive_table(const char* table_name) noexcept {
  TEVPF_TABLE* table;
  PF_TRY(find_table(table_name, table));
  library.interactive = 1;
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_turn_off_interactive(void) noexcept {
  library.interactive = 0;
  return PF_NORMAL;
}
