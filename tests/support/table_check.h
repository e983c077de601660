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

using tevpf::row_at;
using tevpf::row_number_of;
using tevpf::slot_of;

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
    const int slot = column.idx_ptr != nullptr ? column.idx_ptr[i] : slot_of(table, i);
    if (std::memcmp(key(i), row_at(table, slot) + column.offset, size) != 0) return false;
  }
  const bool fenced = column.idx_ptr != nullptr && !tevpf::is_floating_type(column.def.type);
  for (int i = fenced ? count / tevpf::kFenceStep : 0; i > 0; --i) {
    if (std::memcmp(key(count + i - 1), key(i * tevpf::kFenceStep - 1), size) != 0) return false;
  }
  return true;
}

// The keys that blocks of an index keep beside their items.
inline bool are_block_keys_true(const TEVPF_TABLE& table, const TEVPF_COLUMN& column) {
  const tevpf::SequenceBlocks* const blocks = column.index.blocks;
  if (blocks == nullptr || blocks->key_size == 0) return true;
  const auto is_true = [&](const void* key, int slot) {
    return std::memcmp(key, row_at(table, slot) + column.offset, blocks->key_size) == 0;
  };
  for (const tevpf::SequenceGroup* group : std::span(blocks->groups, blocks->num_groups)) {
    for (int b = 0; b < group->count; ++b) {
      const tevpf::SequenceChunk chunk = group->chunk(b);
      const auto* const keys = static_cast<const char*>(group->block[b].keys);
      for (int i = 0; keys != nullptr && i < chunk.count; ++i) {
        if (!is_true(keys + std::ptrdiff_t{i} * blocks->key_size, chunk[i])) return false;
      }
      if (group->has_last_keys && !is_true(&group->last_key[b], group->last[b])) return false;
    }
  }
  return true;
}

// Every slot is in the order or free.
inline const char* broken_slots(const TEVPF_TABLE& table) {
  const tevpf::RowSlots& slots = table.slots;
  if (slots.order.is_identity() && slots.num_free != 0) return "free slots among rows in order";
  const std::int64_t used = std::int64_t{table.num_rows} + slots.num_free;
  const std::int64_t room = std::max(used, std::int64_t{table.num_rows} + table.free_rows);
  if (slots.bytes < room * table.row_wid) return "no room for the rows";
  std::vector<bool> seen(static_cast<std::size_t>(used));
  const auto is_new = [&](int slot) {
    const bool fits = slot >= 0 && slot < used && !seen[slot];
    if (fits) seen[slot] = true;
    return fits;
  };
  for (int i = 0; i < slots.num_free; ++i) {
    if (!is_new(slots.free[i])) return "free slots are distinct";
  }
  for (int i = 0; i < table.num_rows; ++i) {
    const int slot = slot_of(table, i);
    if (!is_new(slot)) return "slots in order are distinct";
    if (row_number_of(table, slot) != i) return "a slot's row number";
    if (const char* rule = broken_row(table, row_at(table, slot))) return rule;
  }
  return nullptr;
}

inline const char* broken_index(const TEVPF_TABLE& table, const TEVPF_COLUMN& column) {
  const tevpf::Sequence& index = column.index;
  if (column.def.idx_flag == 0) return index.is_identity() ? nullptr : "index without flag";
  if (index.items != nullptr && index.room < table.num_rows) return "no index room";
  std::vector<int> slots(table.num_rows), expected;
  index.copy_items(table.num_rows, slots.data());
  tevpf::for_each_slot(table, [&](int slot) { expected.push_back(slot); });
  std::sort(slots.begin(), slots.end());
  std::sort(expected.begin(), expected.end());
  if (slots != expected) return "index entries are all slots";
  return are_block_keys_true(table, column) ? nullptr : "keys of blocks are not the values";
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
  if (const char* rule = broken_slots(table)) return rule;
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
