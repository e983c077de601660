// Releasing and copying whole tables.
#include <cstring>
#include <utility>

#include "core/base/heap.h"
#include "tables/column_index.h"
#include "tables/column_record.h"
#include "tables/default_row.h"
#include "tables/row_store.h"
#include "tables/table.h"
#include "tables/templates.h"

namespace tevpf {
namespace {

// Releases what the table owns, except its record.
void release_body(TEVPF_TABLE& table) noexcept {
  for (std::int32_t i = 0; table.col_array != nullptr && i < table.num_cols; ++i) {
    release_column(table.col_array[i]);
  }
  heap_free(std::exchange(table.col_array, nullptr));
  release_rows(table);
  release_templates(table);
  adopt_default_row(table, nullptr);
}

// `copy` is a zeroed record of a table with the same rows.
bool copy_column(const TEVPF_COLUMN& source, std::int32_t num_rows, TEVPF_COLUMN& copy) noexcept {
  copy.offset = source.offset;
  std::memcpy(copy.RESERVED, source.RESERVED, sizeof copy.RESERVED);
  copy.def = source.def;
  std::memcpy(copy.format, source.format, sizeof copy.format);
  copy.tolerance = source.tolerance;
  copy.desc_flag = source.desc_flag;

  copy.def.description = nullptr;
  if (source.def.description != nullptr) {
    copy.def.description = heap_copy(source.def.description);
    if (copy.def.description == nullptr) return false;
  }
  if (!is_indexed(source) || num_rows == 0) return true;
  NewIndex index;
  if (!copy_index(source, num_rows, index)) return false;
  adopt_index(copy, std::move(index));
  return true;
}

bool copy_columns(const TEVPF_TABLE& source, TEVPF_TABLE& copy) noexcept {
  copy.col_array = new_zeroed<TEVPF_COLUMN>(static_cast<std::uint64_t>(source.num_cols)).release();
  if (copy.col_array == nullptr) return false;
  while (copy.num_cols < source.num_cols) {
    const std::int32_t i = copy.num_cols++;  // counted first: a half-built column is released too
    if (!copy_column(source.col_array[i], source.num_rows, copy.col_array[i])) return false;
  }
  if (source.cur_col != nullptr) {
    copy.cur_col = copy.col_array + column_position(source, source.cur_col);
  }
  return true;
}

bool copy_default_row(const TEVPF_TABLE& source, TEVPF_TABLE& copy) noexcept {
  if (source.dft_row == nullptr) return true;
  const auto bytes = static_cast<std::uint64_t>(source.row_wid);
  copy.dft_row = static_cast<unsigned char*>(heap_copy(source.dft_row, bytes));
  return copy.dft_row != nullptr;
}

// Copies the blocks of a table. A table without columns has no blocks, except for rows of zero
// bytes.
bool copy_storage(const TEVPF_TABLE& source, TEVPF_TABLE& copy) noexcept {
  if (source.num_rows > 0 && !copy_rows(source, copy)) return false;
  if (source.num_cols == 0) return true;
  return copy_columns(source, copy) && copy_templates(source, copy) &&
         copy_default_row(source, copy);
}

}  // namespace

void release_table(TEVPF_TABLE* table) noexcept {
  if (table == nullptr) return;
  release_body(*table);
  heap_free(table);
}

bool copy_table_body(const TEVPF_TABLE& source, TEVPF_TABLE& copy) noexcept {
  TEVPF_TABLE draft{};
  draft.header = source.header;
  std::memcpy(draft.header.elem_name, copy.header.elem_name, sizeof draft.header.elem_name);
  draft.num_rows = source.num_rows;
  draft.row_wid = source.row_wid;
  draft.dsp_wid = source.dsp_wid;
  std::memcpy(draft.RESERVED, source.RESERVED, sizeof draft.RESERVED);
  draft.next_row = source.next_row;
  draft.cur_row = source.cur_row;
  draft.mod = source.mod;
  draft.extra_bytes = source.extra_bytes;

  if (!copy_storage(source, draft)) {
    release_body(draft);
    return false;
  }
  copy = draft;
  return true;
}

}  // namespace tevpf
