// The text of a table with all its columns and rows.
#pragma once

#include <cstdio>

#include "reports/text_out.h"
#include "tables/table.h"

extern "C" {

// Writes the table's dump; makes its formats first when a column has none.
//   PF_NOMEM  what was written stays
TEVPF_API TEVPF_STATUS TEV8R1_table_dump(TEVPF_TABLE* table, std::FILE* stream) noexcept;
}

namespace tevpf {

// What TEV8R1_table_dump does.
[[nodiscard]] TEVPF_STATUS write_table(TextOut& out, TEVPF_TABLE& table) noexcept;

// ---- What dumps and listings of tables have in common

// Makes all formats, and with them the display width, when any column has none.
void ensure_formats(TEVPF_TABLE& table) noexcept;

void write_table_head(TextOut& out, const TEVPF_TABLE& table, std::int32_t columns,
                      std::int64_t rows) noexcept;
void write_data_heading(TextOut& out) noexcept;

}  // namespace tevpf
