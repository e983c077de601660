// Dumps a table with all its columns and rows as text.
#pragma once

#include <cstdio>

#include "reports/text_out.h"
#include "tables/table.h"

extern "C" {

// Writes the table's dump. If any column has no format, makes the formats of all columns first.
//   PF_NOMEM  the output written so far remains
TEVPF_API TEVPF_STATUS TEV8R1_table_dump(TEVPF_TABLE* table, std::FILE* stream) noexcept;
}

namespace tevpf {

// What TEV8R1_table_dump does.
[[nodiscard]] TEVPF_STATUS write_table(TextOut& out, TEVPF_TABLE& table) noexcept;

// ---- Shared by dumps and listings of tables

// Makes all formats and the display width if any column has no format.
void ensure_formats(TEVPF_TABLE& table) noexcept;

void write_table_head(TextOut& out, const TEVPF_TABLE& table, std::int32_t columns,
                      std::int64_t rows) noexcept;
void write_data_heading(TextOut& out) noexcept;

}  // namespace tevpf
