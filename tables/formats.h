// Display formats: how wide a column and a row are shown, and the printf format of a column's
// values.
#pragma once

#include <cstdint>

#include "tables/table.h"

extern "C" {

// Writes the column's display width, and its format.
//   PF_BADTYPE  no such value type: the format stays
TEVPF_API TEVPF_STATUS TEV8R1_make_col_format(TEVPF_COLUMN* column,
                                              std::int32_t* width_out) noexcept;

// Remakes the formats of all columns and the table's display width; the status is the last
// column's.
TEVPF_API TEVPF_STATUS TEV8R1_make_table_format(TEVPF_TABLE* table) noexcept;
}

namespace tevpf {

inline constexpr std::int32_t kColumnGap = 2;  // blanks between neighbouring columns

// The display width of a column.
std::int32_t display_width(const TEVPF_COLUMN& column) noexcept;

}  // namespace tevpf
