// Returns a table to the state in which a file loads it: rows in storage order, every index one
// array of row numbers. Operations on whole tables (saving, dumps, changes of columns) settle the
// table first, as does every operation that gives an outside caller a pointer to a record.
#pragma once

#include "core/base/status.h"
#include "tables/table.h"

extern "C" {

// Finds a table of the current file by its exact name, and settles it.
//   PF_NOFILE  no file is current; texts empty
//   PF_NOELEM  no such table; texts: "table", the name
//   PF_NOMEM   out of memory while settling it; texts empty
TEVPF_API TEVPF_STATUS TEV8R1_get_table_ptr(const char* name, TEVPF_TABLE** table_out) noexcept;

// Finds a column by its exact name. The table is settled.
//   PF_NOCOLUMN  texts: the name, empty
//   PF_NOMEM     out of memory while settling it; texts empty
TEVPF_API TEVPF_STATUS TEV8R1_get_col_ptr(TEVPF_TABLE* table, const char* name,
                                          TEVPF_COLUMN** column_out) noexcept;
}

namespace tevpf {

// O(n) if the table is not settled. Returns false when out of memory; the table's contents do not
// change.
[[nodiscard]] bool settle(TEVPF_TABLE& table) noexcept;

// What TEV8R1_get_table_ptr does.
[[nodiscard]] TEVPF_STATUS find_settled_table(const char* name, TEVPF_TABLE*& table) noexcept;

// Counts reads since the last change, and settles the table once they have cost as much as
// settling.
void count_reads(TEVPF_TABLE& table, std::int64_t rows) noexcept;

}  // namespace tevpf
