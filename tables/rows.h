// Insertion, changes and deletion of rows, including their index entries.
#pragma once

#include "tables/table.h"

extern "C" {

// Makes slots for more rows, in the row block and in every index: the initial increment for a table
// without rows, else the later one; at most 32767, the limit of free_rows.
//   PF_NOMEM  texts empty; the table is unchanged
TEVPF_API TEVPF_STATUS TEV8R1_get_space(TEVPF_TABLE* table) noexcept;

// Adds entries to all indexes for a row that num_rows does not count yet; the indexes have room for
// them. Always PF_NORMAL.
TEVPF_API TEVPF_STATUS TEV8R1_update_indexes(TEVPF_TABLE* table, const void* row,
                                             std::int32_t row_number) noexcept;
}
