// Rows as they come, change and go, indexes included.
#pragma once

#include "tables/table.h"

extern "C" {

// Makes the slots for more rows, in the rows and in every index: the initial increment for a table
// without rows, else the later one; at most 32767, as free_rows counts them.
//   PF_NOMEM  texts empty; the table is as it was
TEVPF_API TEVPF_STATUS TEV8R1_get_space(TEVPF_TABLE* table) noexcept;

// Gives a row that num_rows does not count yet its entries in all indexes, which have room for
// them. Always PF_NORMAL.
TEVPF_API TEVPF_STATUS TEV8R1_update_indexes(TEVPF_TABLE* table, const void* row,
                                             std::int32_t row_number) noexcept;
}
