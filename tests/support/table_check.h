// Invariants of a table record, checked from the record alone. Whether an index is in order is not
// among them: a file says what order it has.
#pragma once

#include <algorithm>
#include <cstring>
#include <span>
#include <vector>

#include "core/element.h"
#include "tables/layout.h"
#include "tables/row_store.h"
#include "tables/search_keys.h"

namespace tevpf_test {

inline const char* broken_layout(const TEVPF_TABLE& table) {
  tevpf::Layout fresh;
  for (const TEVPF_COLUMN& column : std::span(table.col_array, table.num_cols)) {
    if (column.offset != place_column(fresh, column.def)) return "offset of a fresh layout";
  }
  const bool same = table.row_wid == fresh.row_wid && table.mod == fresh.mod;
  return same && table.extra_bytes == fresh.extra_bytes ? nullptr : "row of a fresh layout";
}

inline const char* broken_row(const TEVPF_TABLE& table, const unsigned char* row) {
  for (const TEVPF_COLUMN& column : std::span(table.col_array, table.num_cols)) {
    if (column.def.type != PF_TYPE_STRING) continue;
    const unsigned char* const text = row + column.offset;
    if (std::count(text, text + tevpf::column_size(column), 0) == 0) return "text without end";
  }
  return nullptr;
}

// In the order of the index, or without one of the rows; integers with an index have fences behind.
inline bool are_search_keys_true(const TEVPF_TABLE& table, const TEVPF_COLUMN& column) {
  if (column.keys.values == nullptr) return true;
  const std::int32_t size = tevpf::column_size(column), count = table.num_rows;
  const auto key = [&](int i) { return column.keys.values + std::int64_t{i} * size; };
  for (int i = 0; i < count; ++i) {
    const int row = column.idx_ptr != nullptr ? column.idx_ptr[i] : i;
    if (std::memcmp(key(i), tevpf::row_at(table, row) + column.offset, size) != 0) return false;
  }
  const bool fenced = column.idx_ptr != nullptr && !tevpf::is_floating_type(column.def.type);
  for (int i = fenced ? count / tevpf::kFenceStep : 0; i > 0; --i) {
    if (std::memcmp(key(count + i - 1), key(i * tevpf::kFenceStep - 1), size) != 0) return false;
  }
  return true;
}

inline const char* broken_index(const TEVPF_TABLE& table, const TEVPF_COLUMN& column) {
  const int room = table.num_rows + table.free_rows;
  if (column.def.idx_flag == 0) return column.idx_ptr != nullptr ? "index without flag" : nullptr;
  if (room > 0 && (column.idx_ptr == nullptr || column.index_room < room)) return "no index room";
  std::vector<bool> seen(table.num_rows);
  for (int i = 0; i < table.num_rows; ++i) {
    const int row = column.idx_ptr[i];
    if (row < 0 || row >= table.num_rows || seen[row]) return "index entries are all row numbers";
    seen[row] = true;
  }
  return nullptr;
}

// The first broken rule, or null.
inline const char* broken_rule(const TEVPF_TABLE& table) {
  if (table.num_rows < 0 || table.num_cols < 0) return "negative count";
  if (table.free_rows < 0 || table.free_cols < 0) return "negative number of free slots";
  std::int64_t stored = tevpf::kTableHead;
  for (const TEVPF_COLUMN& column : std::span(table.col_array, table.num_cols)) {
    std::int32_t bytes = 0;
    const TEVPF_COL_DEF& def = column.def;
    if (TEV8R1_calc_col_bytes(def.type, def.description, &bytes) != PF_NORMAL) return "bad type";
    stored += bytes;
  }
  if (table.header.btf != stored) return "btf is not the stored size";
  if (const char* rule = broken_layout(table)) return rule;
  if (table.row_room < (std::int64_t{table.num_rows} + table.free_rows) * table.row_wid) {
    return "no room for the rows";
  }
  for (int i = 0; i < table.num_rows; ++i) {
    if (const char* rule = broken_row(table, tevpf::row_at(table, i))) return rule;
  }
  // There is none yet where loading has failed.
  if (const char* rule = table.dft_row ? broken_row(table, table.dft_row) : nullptr) return rule;
  for (const TEVPF_COLUMN& column : std::span(table.col_array, table.num_cols)) {
    if (const char* rule = broken_index(table, column)) return rule;
    if (!are_search_keys_true(table, column)) return "search keys are not the values";
  }
  if (table.cur_col != nullptr) {
    const auto place = table.cur_col - table.col_array;
    if (place < 0 || place >= table.num_cols) return "search column outside the table";
    if (table.cur_col->def.idx_flag == 0) return "search column without index";
  }
  if (table.cur_row < -1 || table.cur_row >= table.num_rows) return "cur_row outside the table";
  if (table.next_row < 0 || table.next_row > table.num_rows) return "next_row outside the table";
  return nullptr;
}

}  // namespace tevpf_test
