#include "tables/formats.h"

#include <algorithm>
#include <cstdio>
#include <cstring>

#include "core/base/status.h"
#include "values/value_type.h"

namespace tevpf {

std::int32_t display_width(const TEVPF_COLUMN& column) noexcept {
  return TEV8R1_calc_col_width(column.def.width,
                               static_cast<std::int32_t>(std::strlen(column.def.name)));
}

}  // namespace tevpf

using namespace tevpf;

std::int32_t TEV8R1_calc_col_width(std::int32_t width, std::int32_t name_length) noexcept {
  return std::max(width, name_length);
}

TEVPF_STATUS TEV8R1_make_col_format(TEVPF_COLUMN* column, std::int32_t* width_out) noexcept {
  const TEVPF_COL_DEF& def = column->def;
  const int width = display_width(*column);
  *width_out = width;
  char* const format = column->format;
  constexpr std::size_t kSize = sizeof column->format;
  switch (def.type) {
    case PF_TYPE_INT:
    case PF_TYPE_SHORT:
      std::snprintf(format, kSize, "%%%dd", width);
      return PF_NORMAL;
    case PF_TYPE_REAL:
      std::snprintf(format, kSize, "%%%d.%dg", width, def.limits.f32.precision);
      return PF_NORMAL;
    case PF_TYPE_DOUBLE:
      std::snprintf(format, kSize, "%%%d.%dg", width, def.limits.f64.precision);
      return PF_NORMAL;
    case PF_TYPE_STRING:
      std::snprintf(format, kSize, "%%-%ds", width);
      return PF_NORMAL;
    default:
      return fail(PF_BADTYPE, "column", Text(def.type));
  }
}

TEVPF_STATUS TEV8R1_make_table_format(TEVPF_TABLE* table) noexcept {
  TEVPF_STATUS status = PF_NORMAL;
  std::int64_t sum = 0;
  for (std::int32_t i = 0; i < table->num_cols; ++i) {
    std::int32_t width = 0;
    status = TEV8R1_make_col_format(&table->col_array[i], &width);
    sum += std::int64_t{width} + kColumnGap;
  }
  // No gap after the last column, but room for a terminator.
  if (table->num_cols > 0) sum += 1 - kColumnGap;
  table->dsp_wid = static_cast<std::int32_t>(std::clamp<std::int64_t>(sum, INT32_MIN, INT32_MAX));
  return status;
}
