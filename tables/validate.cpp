#include "tables/validate.h"

#include "core/base/status.h"
#include "core/library.h"
#include "tables/column_index.h"
#include "values/compare.h"
#include "values/value_text.h"

namespace tevpf {
namespace {

bool is_in_range(const TEVPF_COLUMN& column, const void* value) noexcept {
  if (column.def.type == PF_TYPE_STRING) return true;
  return with_number(column.def.type, [&](auto tag) {
    using T = decltype(tag);
    const auto limits = limits_of<T>(column.def);
    const T number = load<T>(value);
    return compare_numbers<T>(number, limits.max, column.tolerance) <= 0 &&
           compare_numbers<T>(number, limits.min, column.tolerance) >= 0;
  });
}

// The check of one value; for a unique column that does not hold it, `point` is its place in the
// index.
TEVPF_STATUS check_value(const TEVPF_TABLE& table, const TEVPF_COLUMN& column, const void* value,
                         std::int32_t& point) noexcept {
  if (!is_in_range(column, value)) {
    return fail(PF_RANGE, ValueText(column.def.type, value).c_str());
  }
  if (!is_unique(column)) return PF_NORMAL;
  if (search_index(table, column, 0, table.num_rows, value, point) != PF_NORMAL) return PF_NORMAL;
  library.dup_row = index_entries(column)[point];
  return fail(PF_DUPLICATE, {"value ", ValueText(column.def.type, value).c_str()},
              {"column ", column.def.name});
}

bool puts_up_with_duplicate(std::int32_t holder) noexcept {
  return holder == kAnybody || library.dup_row == holder;
}

}  // namespace

TEVPF_STATUS check_row(const TEVPF_TABLE& table, const unsigned char* row, std::int32_t holder,
                       InsertionPoints& points) noexcept {
  points.count = 0;
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    const TEVPF_COLUMN& column = table.col_array[i];
    std::int32_t point = 0;
    const TEVPF_STATUS status = check_value(table, column, row + column.offset, point);
    if (status == PF_DUPLICATE && puts_up_with_duplicate(holder)) continue;
    PF_TRY(status);
    if (is_unique(column) && points.count < InsertionPoints::kMost) {
      points.position[points.count++] = point;
    }
  }
  return PF_NORMAL;
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_validate_value(const TEVPF_TABLE* table, const TEVPF_COLUMN* column,
                                   const void* value) noexcept {
  std::int32_t point = 0;
  return check_value(*table, *column, value, point);
}
