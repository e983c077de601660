// Brings a table back to the state in which a file brings it: rows in storage order, every index one array
// of row numbers. What goes over whole tables starts so (saving, dumps, changes of columns), and whatever
// hands a record to a caller outside.
#pragma once

#include "core/base/status.h"
#include "tables/table.h"

extern "C" {

// Finds a table of the current file by its exact name, and settles it.
//   PF_NOFILE  no file is current; texts empty
//   PF_NOELEM  no such table; texts: "table", the name
//   PF_NOMEM   it could not be settled; texts empty
TEVPF_API TEVPF_STATUS TEV8R1_get_table_ptr(const char* name, TEVPF_TABLE** table_out) noexcept;

// Finds a column by its exact name. The table is settled.
//   PF_NOCOLUMN  texts: the name, empty
//   PF_NOMEM     it could not be settled; texts empty
TEVPF_API TEVPF_STATUS TEV8R1_get_col_ptr(TEVPF_TABLE* table, const char* name,
                                          TEVPF_COLUMN** column_out) noexcept;
}

namespace tevpf {

// O(n) where the table is not settled. False when memory runs out: what the table says is the same.
[[nodiscard]] bool settle(TEVPF_TABLE& table) noexcept;

// What TEV8R1_get_table_ptr does.
[[nodiscard]] TEVPF_STATUS find_settled_table(const char* name, TEVPF_TABLE*& table) noexcept;

// Counts reads since the last change; once they have cost as much as settling, the table is settled.
void count_reads(TEVPF_TABLE& table, std::int64_t rows) noexcept;

}  // namespace tevpf
