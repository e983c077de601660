// Display formats: the display widths of columns and rows, and the printf format of a column's
// values.
#pragma once

#include <cstdint>

#include "tables/table.h"

extern "C" {

// Sets the column's display width and format.
//   PF_BADTYPE  no such value type; the format is unchanged
TEVPF_API TEVPF_STATUS TEV8R1_make_col_format(TEVPF_COLUMN* column,
                                              std::int32_t* width_out) noexcept;

// Rebuilds the formats of all columns and the table's display width; returns the last column's
// status.
TEVPF_API TEVPF_STATUS TEV8R1_make_table_format(TEVPF_TABLE* table) noexcept;
}

namespace tevpf {

inline constexpr std::int32_t kColumnGap = 2;  // blanks between neighbouring columns

// The display width of a column.
std::int32_t display_width(const TEVPF_COLUMN& column) noexcept;

}  // namespace tevpf
