// How columns are laid out in a row: in column order, each at the first suitably aligned byte after
// the previous value. The row ends on a multiple of its alignment unit.
//
// Widths are 64-bit here: a width that does not fit the table's 32 bits is refused before anything
// changes.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>

#include "tables/table.h"
#include "values/value_type.h"

extern "C" {

// The layout step on a table's own fields: places a value of `size` bytes after a row of row_wid
// bytes; the row then has row_wid + *pad_out + size bytes. Always PF_NORMAL.
TEVPF_API TEVPF_STATUS TEV8R1_adjust_col(std::int32_t row_wid, std::int32_t type, std::int32_t size,
                                         std::int16_t* extra_bytes, std::int16_t* mod,
                                         TEVPF_COLUMN* column, std::int32_t* pad_out) noexcept;
}

namespace tevpf {

inline constexpr std::int64_t kMaxRowWidth = INT32_MAX;

// A row under construction; starts empty.
struct Layout {
  std::int64_t row_wid = 0;
  std::int16_t mod = 0;
  std::int16_t extra_bytes = 0;
};

// The layout step: places one more value and returns its offset.
std::int64_t place_column(Layout& layout, std::int32_t type, std::int64_t size) noexcept;

// The same for a column of a valid type.
inline std::int64_t place_column(Layout& layout, const TEVPF_COL_DEF& def) noexcept {
  return place_column(layout, def.type, value_size(def.type, def.width));
}

// The size in bytes of a column's value in a table's row, known to fit 32 bits.
inline std::int32_t column_size(const TEVPF_COLUMN& column) noexcept {
  return static_cast<std::int32_t>(value_size(column.def.type, column.def.width));
}

// Whether two rows hold the same bytes in a column.
inline bool has_same_bytes(const TEVPF_COLUMN& column, const unsigned char* row,
                           const unsigned char* other_row) noexcept {
  return std::memcmp(row + column.offset, other_row + column.offset,
                     static_cast<std::size_t>(column_size(column))) == 0;
}

// Converts between the table's fields and the layout that they describe.
Layout layout_of(const TEVPF_TABLE& table) noexcept;
void set_layout(TEVPF_TABLE& table, const Layout& layout) noexcept;

// Recomputes the layout of the columns: offsets, row width, mod and padding. Returns true if any
// offset or the row width has changed. The row is known to fit.
bool lay_out_columns(TEVPF_TABLE& table) noexcept;

}  // namespace tevpf
