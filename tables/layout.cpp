#include "tables/layout.h"

#include <algorithm>

namespace tevpf {
namespace {

constexpr std::int64_t aligned(std::int64_t place, std::int64_t unit) noexcept {
  return (place + unit - 1) / unit * unit;
}

}  // namespace

std::int64_t place_column(Layout& layout, std::int32_t type, std::int64_t size) noexcept {
  const std::int32_t unit = is_number_type(type) ? value_type(type).alignment : 1;
  if (unit > 1) layout.mod = std::max(layout.mod, static_cast<std::int16_t>(unit));

  // Take back the padding after the last value, so that a small value may fit into it.
  const std::int64_t offset =
      aligned(layout.row_wid - std::max<std::int16_t>(layout.extra_bytes, 0), unit);
  const std::int64_t end = offset + size;
  layout.row_wid = layout.mod > 0 ? aligned(end, layout.mod) : end;
  layout.extra_bytes = static_cast<std::int16_t>(layout.row_wid - end);
  return offset;
}

Layout layout_of(const TEVPF_TABLE& table) noexcept {
  return {table.row_wid, table.mod, table.extra_bytes};
}

void set_layout(TEVPF_TABLE& table, const Layout& layout) noexcept {
  table.row_wid = static_cast<std::int32_t>(layout.row_wid);
  table.mod = layout.mod;
  table.extra_bytes = layout.extra_bytes;
}

bool lay_out_columns(TEVPF_TABLE& table) noexcept {
  Layout layout;
  bool changed = false;
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    TEVPF_COLUMN& column = table.col_array[i];
    const auto offset = static_cast<std::int32_t>(place_column(layout, column.def));
    changed |= offset != column.offset;
    column.offset = offset;
  }
  changed |= layout.row_wid != table.row_wid;
  set_layout(table, layout);
  return changed;
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_adjust_col(std::int32_t row_wid, std::int32_t type, std::int32_t size,
                               std::int16_t* extra_bytes, std::int16_t* mod, TEVPF_COLUMN* column,
                               std::int32_t* pad_out) noexcept {
  Layout layout{row_wid, *mod, *extra_bytes};
  column->offset = static_cast<std::int32_t>(place_column(layout, type, size));
  *mod = layout.mod;
  *extra_bytes = layout.extra_bytes;
  *pad_out = static_cast<std::int32_t>(layout.row_wid - row_wid - size);
  return PF_NORMAL;
}
