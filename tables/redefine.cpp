// Redefines a column: all checks first, then the allocation of every block needed, then the change.
#include <cstring>
#include <utility>

#include "core/base/heap.h"
#include "core/base/status.h"
#include "core/base/text_field.h"
#include "core/library.h"
#include "tables/column_index.h"
#include "tables/column_record.h"
#include "tables/columns.h"
#include "tables/default_row.h"
#include "tables/directory.h"
#include "tables/formats.h"
#include "tables/layout.h"
#include "tables/row_store.h"
#include "tables/settle.h"
#include "values/compare.h"
#include "values/value_text.h"
#include "values/value_type.h"

namespace tevpf {
namespace {

// What a redefinition replaces in the column.
struct Redefinition {
  TEVPF_COLUMN record;  // the redefined column, without its blocks
  Owned<char> description;
  bool new_index = false;  // whether `index` replaces the column's index
  NewIndex index;
  Owned<unsigned char> default_row;
  std::int64_t btf;
};

bool has_flag(std::int8_t flag) noexcept { return flag != 0; }

TEVPF_STATUS check_new_name(const TEVPF_TABLE& table, const char* old_name,
                            const char* new_name) noexcept {
  if (std::strcmp(old_name, new_name) == 0) return PF_NORMAL;
  if (starts_with_blank(new_name)) return fail_empty(PF_BADNAME);
  return TEV8R1_check_unique_column(&table, new_name);
}

TEVPF_STATUS check_string_width(const TEVPF_TABLE& table, std::int32_t old_width,
                                std::int32_t new_width) noexcept {
  if (new_width != old_width && table.num_rows > 0) return fail_empty(PF_BADCOLCHG);
  return new_width < 1 ? PF_BADWIDTH : PF_NORMAL;
}

// The row width after redefining the column at `position`.
std::int64_t redefined_row_width(const TEVPF_TABLE& table, std::int32_t position,
                                 const TEVPF_COL_DEF& definition) noexcept {
  Layout layout;
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    place_column(layout, i == position ? definition : table.col_array[i].def);
  }
  return layout.row_wid;
}

// Whether the definition may replace the column's; returns the resulting row width.
TEVPF_STATUS check_redefinition(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                                const TEVPF_COL_DEF& definition, std::int64_t& row_wid) noexcept {
  PF_TRY(check_new_name(table, column.def.name, definition.name));
  if (definition.type != column.def.type && table.num_rows > 0) return PF_TYPECHG;
  PF_TRY(TEV8R1_validate_col_range(&definition));
  if (definition.type == PF_TYPE_STRING) {
    PF_TRY(check_string_width(table, column.def.width, definition.width));
  } else {
    const TEVPF_STATUS status =
        TEV8R1_check_column_values(&table, column.offset, definition, column.tolerance);
    if (definition.width < 1) return PF_BADWIDTH;  // overrides PF_RANGE, whose texts stay
    PF_TRY(status);
  }
  row_wid = redefined_row_width(table, column_position(table, &column), definition);
  return row_wid > kMaxRowWidth ? row_too_wide(definition) : PF_NORMAL;
}

// The index after the redefinition: built when indexing is switched on, and rebuilt when a finer
// tolerance puts entries out of order. Uniqueness is checked under the old tolerance.
TEVPF_STATUS prepare_index(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                           Redefinition& next) noexcept {
  const TEVPF_COL_DEF& def = next.record.def;
  if (!has_flag(def.idx_flag)) return PF_NORMAL;
  const auto build = [&] {
    next.new_index = true;
    return build_index(table, next.record, std::int64_t{table.num_rows} + table.free_rows,
                       next.index);
  };
  const bool switched_on = !has_flag(column.def.idx_flag);
  if (switched_on && !build()) return fail_empty(PF_NOMEM);

  if (has_flag(def.unq_flag) && !has_flag(column.def.unq_flag) && table.num_rows > 1) {
    const std::int32_t* entries = switched_on ? next.index.entries.get() : index_entries(column);
    if (has_equal_neighbours(table, entries, column)) return fail_empty(PF_NOTUNIQUE);
  }
  if (!switched_on && next.record.tolerance < column.tolerance &&
      !is_index_in_order(table, column, next.record.tolerance) && !build()) {
    return fail_empty(PF_NOMEM);
  }
  return PF_NORMAL;
}

TEVPF_STATUS prepare(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                     const TEVPF_COL_DEF& definition, std::int64_t row_wid,
                     Redefinition& next) noexcept {
  next.record = column;
  next.record.def = definition;
  next.record.def.desc_byte = 0;
  next.record.desc_flag = description_flag(definition);
  if (is_floating_type(definition.type)) next.record.tolerance = tolerance_of(definition);
  if (definition.type != column.def.type) next.record.format[0] = '\0';

  next.btf = table.header.btf - stored_column_size(column.def.type, column.def.description) +
             stored_column_size(definition.type, definition.description);
  if (next.btf > INT32_MAX) return fail_empty(PF_NOMEM);
  PF_TRY(prepare_index(table, column, next));

  if (definition.description != nullptr) {
    next.description.reset(heap_copy(definition.description));
    if (!next.description) return fail_empty(PF_NOMEM);
  }
  next.default_row = new_zeroed<unsigned char>(static_cast<std::uint64_t>(row_wid));
  return next.default_row ? PF_NORMAL : fail_empty(PF_NOMEM);
}

void apply(TEVPF_TABLE& table, TEVPF_COLUMN& column, Redefinition next) noexcept {
  const bool width_changed = next.record.def.width != column.def.width;
  heap_free(column.def.description);
  next.record.def.description = next.description.release();
  column = next.record;
  if (next.new_index) adopt_index(column, std::move(next.index));
  if (!has_flag(column.def.idx_flag)) {
    release_index(column);
    if (table.cur_col == &column) table.cur_col = nullptr;
  }
  table.header.btf = static_cast<std::int32_t>(next.btf);

  // In a table with rows the offsets never change here.
  if (lay_out_columns(table)) give_up_spare_rows(table);
  adopt_minimums(table, std::move(next.default_row));
  if (width_changed && library.interactive != 0) (void)TEV8R1_make_table_format(&table);
}

}  // namespace
}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_check_column_values(const TEVPF_TABLE* table, std::int32_t offset,
                                        TEVPF_COL_DEF definition, double tolerance) noexcept {
  if (!is_number_type(definition.type)) return PF_NORMAL;
  return with_number(definition.type, [&](auto tag) -> TEVPF_STATUS {
    using T = decltype(tag);
    const T min = limits_of<T>(definition).min, max = limits_of<T>(definition).max;
    for (std::int32_t i = 0; i < table->num_rows; ++i) {
      const T value = load<T>(row_at(*table, slot_of(*table, i)) + offset);
      if (compare_numbers(value, max, tolerance) > 0 ||
          compare_numbers(value, min, tolerance) < 0) {
        return fail(PF_RANGE, number_text(value));
      }
    }
    return PF_NORMAL;
  });
}

TEVPF_STATUS TEV8R1_PF_modify_col_def(const char* table_name, const char* column_name,
                                      TEVPF_COL_DEF definition) noexcept {
  TEVPF_TABLE* table = nullptr;
  TEVPF_COLUMN* column = nullptr;
  PF_TRY(find_settled_table(table_name, table));
  PF_TRY(find_column(*table, column_name, column));
  terminate_texts(definition);
  std::int64_t row_wid = 0;
  PF_TRY(check_redefinition(*table, *column, definition, row_wid));

  Redefinition next;
  PF_TRY(prepare(*table, *column, definition, row_wid, next));
  apply(*table, *column, std::move(next));
  return PF_NORMAL;
}
