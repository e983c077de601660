// Finding rows by value, and reading one column's values of all rows.
#include <algorithm>
#include <cstring>

#include "core/base/fetch.h"
#include "core/base/status.h"
#include "tables/column_index.h"
#include "tables/column_record.h"
#include "tables/cursor.h"
#include "tables/directory.h"
#include "tables/index_search.h"
#include "tables/layout.h"
#include "tables/row_store.h"
#include "tables/search_keys.h"
#include "tables/settle.h"
#include "tables/validate.h"
#include "values/compare.h"
#include "values/value_text.h"

using namespace tevpf;

namespace {

constexpr std::int8_t kExact = 0;
constexpr std::int8_t kNearest = 1;

// The first position from `first` on whose row has a value equal to the key, by a linear scan
// through a sequence; `count` if there is none. The scan runs at memory speed.
template <class Key>
std::int32_t walk(const Values& values, std::int32_t count, const Sequence& through,
                  std::int32_t first, const Key& key) noexcept {
  if (through.is_identity()) {
    return find_first(first, count, key, [&](std::int32_t at) {
      const unsigned char* const value = values.of(at);
      fetch_along(value);
      return value;
    });
  }
  if (through.items == nullptr) {
    return find_first(first, count, key,
                      [&](std::int32_t at) { return values.of(through.at(at)); });
  }
  const std::int32_t* const slots = through.items;
  return find_first(first, count, key, [&](std::int32_t at) {
    __builtin_prefetch(values.of(slots[std::min(at, count - 1 - kRowsAhead) + kRowsAhead]));
    return values.of(slots[at]);
  });
}

// Scans search keys, which are in storage order.
std::int32_t walk_along_keys(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                             const unsigned char* keys, const Sequence& traversal,
                             std::int32_t first, const void* key) noexcept {
  return with_number(column.def.type, [&](auto tag) {
    using T = decltype(tag);
    const NumberKey<T> prepared(key, column.tolerance);
    if (&traversal == &table.slots.order) {
      return find_in_line(keys, table.num_rows, first, prepared);
    }
    return walk(Values{keys, sizeof(T)}, table.num_rows, traversal, first, prepared);
  });
}

std::int32_t walk_for_key(TEVPF_TABLE& table, TEVPF_COLUMN& column, std::int32_t first,
                          const void* key) noexcept {
  const Sequence& order = table.slots.order;
  const Sequence& traversal = traversal_of(table);
  // An indexed column's keys follow its own index, not the traversal; other columns' keys are
  // ordered by row number.
  const bool may_have_keys = is_number_type(column.def.type) && !is_indexed(column) &&
                             (order.is_identity() || &traversal == &order);
  if (may_have_keys) {
    const unsigned char* const keys = search_keys(table, column, nullptr);
    if (keys != nullptr) return walk_along_keys(table, column, keys, traversal, first, key);
  }
  const std::int32_t position =
      with_key(column.def.type, column.tolerance, key, readable_bytes(table, column),
               [&](const auto& prepared) {
                 return walk(values_of(table, column), table.num_rows, traversal, first, prepared);
               });
  const std::int64_t walked = std::int64_t{position} - first + 1;
  if (may_have_keys) count_search(column, walked);
  if (traversal.blocks != nullptr) count_reads(table, walked);
  return position;
}

// The position from `first` on whose row has the key. In nearest mode, which affects only the
// search column, the next greater value also matches.
TEVPF_STATUS find_position(TEVPF_TABLE& table, TEVPF_COLUMN& column, std::int8_t mode,
                           const void* key, std::int32_t first, std::int32_t& position) noexcept {
  bool found = false;
  if (first < table.num_rows && is_indexed(column) && &column == table.cur_col) {
    const Found place = find_in_index(table, column, first, key);
    position = place.position;
    found = place.equal || (mode == kNearest && position < table.num_rows);
  } else if (first < table.num_rows) {
    position = walk_for_key(table, column, first, key);
    found = position < table.num_rows;
  }
  return found ? PF_NORMAL : fail(PF_NOTFOUND, ValueText(column.def.type, key).c_str());
}

}  // namespace

TEVPF_STATUS TEV8R1_PF_define_table_search(const char* table_name,
                                           const char* column_name) noexcept {
  TEVPF_TABLE* table;
  PF_TRY(find_table(table_name, table));
  TEVPF_COLUMN* column = nullptr;
  if (column_name != nullptr) {
    PF_TRY(find_column(*table, column_name, column));
    if (!is_indexed(*column)) return fail(PF_BADSEARCH, column_name);
  }
  table->cur_col = column;
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_get_row_by_value(const char* table_name, int8_t mode,
                                        const char* column_name, const void* key,
                                        void* row_out) noexcept {
  TEVPF_TABLE* table;
  TEVPF_COLUMN* column;
  int32_t position = 0;
  PF_TRY(find_table(table_name, table));
  if (table->num_rows == 0) return fail_empty(PF_NOTFOUND);
  PF_TRY(find_column(*table, column_name, column));
  PF_TRY(find_position(*table, *column, mode, key, table->next_row, position));
  deliver_row(*table, position, row_out);
  return PF_NORMAL;
}

// The value is copied from where it is stored: no row is returned, so the cursor does not move.
TEVPF_STATUS TEV8R1_PF_get_value(const char* table_name, const char* column_name, const void* key,
                                 void* value_out) noexcept {
  TEVPF_TABLE* table;
  TEVPF_COLUMN* column;
  int32_t position = 0;
  PF_TRY(find_table(table_name, table));
  if (table->num_cols == 0) return PF_NORMAL;
  if (table->num_rows == 0) return fail_empty(PF_NOTFOUND);
  PF_TRY(find_position(*table, table->col_array[0], kExact, key, 0, position));
  PF_TRY(find_column(*table, column_name, column));
  std::memcpy(value_out, row_at(*table, traversal_of(*table).at(position)) + column->offset,
              static_cast<std::size_t>(column_size(*column)));
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_get_col_values(const char* table_name, const char* column_name,
                                      void* values_out) noexcept {
  TEVPF_TABLE* table;
  TEVPF_COLUMN* column;
  PF_TRY(find_table(table_name, table));
  if (table->num_rows == 0) return PF_NOMORE;
  PF_TRY(find_column(*table, column_name, column));
  copy_values(*table, *column, static_cast<unsigned char*>(values_out));
  return PF_NORMAL;
}
