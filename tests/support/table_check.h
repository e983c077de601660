// Invariants of a table record, checked from the record alone.
#pragma once

#include <algorithm>
#include <cstring>
#include <string>
#include <vector>

#include "core/element.h"
#include "tables/table.h"
#include "values/value_type.h"

namespace tevpf_test {

inline std::int64_t size_of(const TEVPF_COLUMN& column) {
  return tevpf::value_size(column.def.type, column.def.width);
}

// Offsets, width and padding: each value at the first aligned byte behind the one before it.
inline const char* broken_layout(const TEVPF_TABLE& table) {
  std::int64_t end = 0, unit = 0;
  for (int i = 0; i < table.num_cols; ++i) {
    const TEVPF_COLUMN& column = table.col_array[i];
    const std::int64_t size = size_of(column);
    const std::int64_t alignment = column.def.type == PF_TYPE_STRING ? 1 : size;
    end = (end + alignment - 1) / alignment * alignment;
    if (column.offset != end) return "offset differs from a fresh layout";
    end += size;
    if (column.def.type != PF_TYPE_STRING) unit = std::max(unit, size);
  }
  const std::int64_t width = unit > 0 ? (end + unit - 1) / unit * unit : end;
  if (table.row_wid != width) return "row_wid differs from a fresh layout";
  if (table.mod != unit) return "mod is not the largest number's size";
  if (table.extra_bytes != width - end) return "extra_bytes is not the padding at the row's end";
  return nullptr;
}

inline const char* broken_row(const TEVPF_TABLE& table, const unsigned char* row) {
  std::int64_t end = 0;
  for (int i = 0; i <= table.num_cols; ++i) {
    const std::int64_t next = i < table.num_cols ? table.col_array[i].offset : table.row_wid;
    for (; end < next; ++end) {
      if (row[end] != 0) return "padding is not zero";
    }
    if (i == table.num_cols) break;
    const TEVPF_COLUMN& column = table.col_array[i];
    end = next + size_of(column);
    if (column.def.type != PF_TYPE_STRING) continue;
    const auto size = static_cast<std::size_t>(size_of(column));
    if (std::memchr(row + next, 0, size) == nullptr) return "text without terminator";
  }
  return nullptr;
}

// Whether a may stand in front of b. Equality within a tolerance chains: reals are only judged when
// they are well apart. Stored patterns stand in front of what they match.
inline bool in_order(const TEVPF_COLUMN& column, const unsigned char* a, const unsigned char* b) {
  if (column.def.type == PF_TYPE_STRING) {
    const auto* text = reinterpret_cast<const char*>(a);
    return std::strchr(text, '*') != nullptr ||
           std::strcmp(text, reinterpret_cast<const char*>(b)) <= 0;
  }
  return tevpf::with_number(column.def.type, [&](auto tag) {
    using T = decltype(tag);
    const double slack = tevpf::kIsFloating<T> ? 10 * column.tolerance : 0;
    return !(static_cast<double>(tevpf::load<T>(a)) >
             static_cast<double>(tevpf::load<T>(b)) + slack);
  });
}

inline const char* broken_index(const TEVPF_TABLE& table, const TEVPF_COLUMN& column) {
  const int room = table.num_rows + table.free_rows;
  if (column.def.idx_flag == 0) return column.idx_ptr != nullptr ? "index without flag" : nullptr;
  if (room > 0 && (column.idx_ptr == nullptr || column.index_room < room)) return "no index room";
  std::vector<bool> seen(static_cast<std::size_t>(table.num_rows));
  const unsigned char* previous = nullptr;
  for (int i = 0; i < table.num_rows; ++i) {
    const int row = column.idx_ptr[i];
    if (row < 0 || row >= table.num_rows) return "index entry is no row number";
    if (seen[static_cast<std::size_t>(row)]) return "index entry twice";
    seen[static_cast<std::size_t>(row)] = true;
    const unsigned char* value = table.row_data + std::int64_t{row} * table.row_wid + column.offset;
    if (previous != nullptr && !in_order(column, previous, value)) return "index out of order";
    previous = value;
  }
  return nullptr;
}

// The first broken rule, or null.
inline const char* broken_rule(const TEVPF_TABLE& table) {
  if (table.num_rows < 0 || table.num_cols < 0) return "negative count";
  if (table.free_rows < 0 || table.free_cols < 0) return "negative number of free slots";
  std::int64_t stored = tevpf::kTableHead;
  for (int i = 0; i < table.num_cols; ++i) {
    std::int32_t bytes = 0;
    const TEVPF_COL_DEF& def = table.col_array[i].def;
    if (TEV8R1_calc_col_bytes(def.type, def.description, &bytes) != PF_NORMAL) return "bad type";
    stored += bytes;
  }
  if (table.header.btf != stored) return "btf is not the stored size";
  if (const char* rule = broken_layout(table)) return rule;
  if (table.row_room < (std::int64_t{table.num_rows} + table.free_rows) * table.row_wid) {
    return "no room for the rows";
  }
  for (int i = 0; i < table.num_rows; ++i) {
    if (const char* rule = broken_row(table, table.row_data + std::int64_t{i} * table.row_wid)) {
      return rule;
    }
  }
  if (table.num_cols > 0) {
    if (table.dft_row == nullptr) return "no default row";
    if (const char* rule = broken_row(table, table.dft_row)) return rule;
  }
  for (int i = 0; i < table.num_cols; ++i) {
    if (const char* rule = broken_index(table, table.col_array[i])) return rule;
  }
  if (table.cur_col != nullptr) {
    if (table.cur_col < table.col_array || table.cur_col >= table.col_array + table.num_cols) {
      return "search column outside the table";
    }
    if (table.cur_col->def.idx_flag == 0) return "search column without index";
  }
  if (table.cur_row < -1 || table.cur_row >= table.num_rows) return "cur_row outside the table";
  if (table.next_row < 0 || table.next_row > table.num_rows) return "next_row outside the table";
  return nullptr;
}

}  // namespace tevpf_test
