#include "tables/validate.h"

#include "core/base/status.h"
#include "core/library.h"
#include "tables/column_index.h"
#include "tables/index_search.h"
#include "tables/row_store.h"
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

TEVPF_STATUS check_range(const TEVPF_COLUMN& column, const void* value) noexcept {
  if (is_in_range(column, value)) return PF_NORMAL;
  return fail(PF_RANGE, ValueText(column.def.type, value).c_str());
}

// The refusal of a duplicate value; `row_number` names the row that holds it.
TEVPF_STATUS duplicate(const TEVPF_COLUMN& column, const void* value,
                       std::int32_t row_number) noexcept {
  library.dup_row = row_number;
  return fail(PF_DUPLICATE, {"value ", ValueText(column.def.type, value).c_str()},
              {"column ", column.def.name});
}

// Checks one value. For a unique column, `place` is where the value belongs or already stands; in
// the latter case `holder` is the slot of its row.
TEVPF_STATUS check_value(const TEVPF_TABLE& table, const TEVPF_COLUMN& column, const void* value,
                         SequencePlace& place, std::int32_t& holder) noexcept {
  PF_TRY(check_range(column, value));
  if (!is_unique(column)) return PF_NORMAL;
  const IndexPlace found = search_index(table, column, value);
  place = found.place;
  if (!found.found) return PF_NORMAL;
  holder = column.index.at(place);
  return duplicate(column, value, row_number_of(table, holder));
}

}  // namespace

TEVPF_STATUS check_row(const TEVPF_TABLE& table, const unsigned char* row, std::int32_t holder,
                       InsertionPoints& points) noexcept {
  points.count = 0;
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    const TEVPF_COLUMN& column = table.col_array[i];
    SequencePlace place{0};
    std::int32_t found = kNobody;
    const TEVPF_STATUS status = check_value(table, column, row + column.offset, place, found);
    if (status == PF_DUPLICATE && (holder == kAnybody || holder == found)) continue;
    PF_TRY(status);
    if (is_unique(column) && points.count < InsertionPoints::kMost) {
      points.place[points.count++] = place;
    }
  }
  return PF_NORMAL;
}

TEVPF_STATUS check_moved_row(const TEVPF_TABLE& table, std::int32_t slot, std::int32_t own_number,
                             const EntryMove* moves) noexcept {
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    const TEVPF_COLUMN& column = table.col_array[i];
    const unsigned char* const value = row_at(table, slot) + column.offset;
    PF_TRY(check_range(column, value));
    if (!is_unique(column)) continue;
    const std::int32_t own = moves[i].from;
    const Found found = search_others(table, column, own, value);
    if (!found.equal) continue;
    const std::int32_t at = found.position;
    const std::int32_t number = row_number_of(table, column.index.at(at < own ? at : at + 1));
    // Row numbers count as if the row had been taken out.
    return duplicate(column, value, number > own_number ? number - 1 : number);
  }
  return PF_NORMAL;
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_validate_value(const TEVPF_TABLE* table, const TEVPF_COLUMN* column,
                                   const void* value) noexcept {
  SequencePlace place{0};
  std::int32_t holder = kNobody;
  return check_value(*table, *column, value, place, holder);
}
