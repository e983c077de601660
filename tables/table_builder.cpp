#include "tables/table_builder.h"

#include <algorithm>
#include <cstring>
#include <optional>
#include <utility>

#include "core/base/permutation.h"
#include "core/base/status.h"
#include "core/base/text_field.h"
#include "core/reader.h"
#include "tables/column_index.h"
#include "tables/column_record.h"
#include "tables/default_row.h"
#include "tables/directory.h"
#include "tables/layout.h"
#include "tables/row_store.h"
#include "tables/table_fields.h"

namespace tevpf {

namespace {

// Rows are read in chunks that fit the cache while their texts are checked.
constexpr std::int64_t kBatchBytes = std::int64_t{256} * 1024;

// Parses one stored column of the body. Its description stays in the body.
Parsed parse_column(ByteReader& body, TEVPF_COLUMN& column) noexcept {
  column = {};
  const unsigned char* fields = body.take(stored_size(kColumnFields));
  if (fields == nullptr) return Parsed::kBroken;
  unpack<kColumnFields>(fields, &column);
  TEVPF_COL_DEF& def = column.def;
  if (!is_value_type(def.type)) return Parsed::kUnknownType;
  terminate_texts(def);

  const std::int32_t limit_bytes = value_type(def.type).column_part;
  const unsigned char* limits = body.take(limit_bytes);
  if (limits == nullptr) return Parsed::kBroken;
  std::memcpy(&def.limits, limits, static_cast<std::size_t>(limit_bytes));
  const bool has_description = column.desc_flag > 0;
  if (!has_description) {
    column.desc_flag = 0;
    return Parsed::kWhole;
  }
  def.description = const_cast<char*>(body.take_text());
  const bool found = def.description != nullptr && column.desc_flag == description_flag(def);
  return found ? Parsed::kWhole : Parsed::kBroken;
}

// Places a column in the row and returns whether its offset matches the file.
bool lies_as_stated(Layout& layout, const TEVPF_COLUMN& column) noexcept {
  if (column.def.type == PF_TYPE_STRING && column.def.width < 0) return false;
  return place_column(layout, column.def) == column.offset && layout.row_wid <= kMaxRowWidth;
}

// Whether the columns fill the body and the row. The check stops at the first column of an unknown
// type, because the sizes from there on are unknown.
bool is_well_formed(ByteReader body, std::int32_t num_cols, std::int32_t row_wid) noexcept {
  if (num_cols > body.left() / stored_size(kColumnFields)) return false;  // whatever their types
  Layout layout;
  TEVPF_COLUMN column;
  for (std::int32_t i = 0; i < num_cols; ++i) {
    const Parsed parsed = parse_column(body, column);
    if (parsed == Parsed::kUnknownType) return true;
    if (parsed == Parsed::kBroken || !lies_as_stated(layout, column)) return false;
  }
  return body.left() == 0 && (num_cols == 0 || layout.row_wid == row_wid);
}

TEVPF_STATUS build_column(TEVPF_TABLE& table, ByteReader& body, Layout& layout) noexcept {
  TEVPF_COLUMN& column = table.col_array[table.num_cols];
  if (parse_column(body, column) == Parsed::kUnknownType) {
    return fail(PF_BADTYPE, "column", Text(column.def.type));
  }
  std::int32_t stored_bytes = 0;
  std::int32_t value_bytes = 0;
  const TEVPF_STATUS status =
      TEV8R1_construct_column(&column, &stored_bytes, &value_bytes, &table.mod);
  if (status != PF_NORMAL) {
    release_column(column);
    return status;
  }
  place_column(layout, column.def);
  table.header.btf += stored_bytes;
  ++table.num_cols;
  return PF_NORMAL;
}

// Builds the columns. After a failure the table has the columns built so far.
TEVPF_STATUS build_columns(TEVPF_TABLE& table, ByteReader body, std::int32_t num_cols) noexcept {
  Owned<TEVPF_COLUMN> columns = new_array<TEVPF_COLUMN>(static_cast<std::uint64_t>(num_cols));
  if (!columns) return fail_empty(PF_NOMEM);
  table.col_array = columns.release();
  Layout layout;
  TEVPF_STATUS status = PF_NORMAL;
  while (status == PF_NORMAL && table.num_cols < num_cols) {
    status = build_column(table, body, layout);
  }
  set_layout(table, layout);
  if (table.num_cols == 0) heap_free(std::exchange(table.col_array, nullptr));
  return status;
}

// Reads a column's index of `count` entries. An index that is not a permutation of the rows is
// dropped; it is built from the rows later.
TEVPF_STATUS read_index(TEVPF_COLUMN& column, std::int32_t count, Input& input) noexcept {
  Owned<unsigned char> block;
  const auto bytes = static_cast<std::uint64_t>(count) * sizeof(std::int32_t);
  switch (input.read_block(bytes, block)) {
    case Input::Got::kPart:
      return fail(PF_BADFORMAT, {column.def.name, " index"});
    case Input::Got::kNoMemory:
      return fail_empty(PF_NOMEM);
    case Input::Got::kAll:
      break;
  }
  NewIndex index{Owned<std::int32_t>(reinterpret_cast<std::int32_t*>(block.release())), count,
                 nullptr};
  const std::optional<bool> usable = is_permutation(index.entries.get(), count);
  if (!usable) return fail_empty(PF_NOMEM);
  if (*usable) adopt_index(column, std::move(index));
  return PF_NORMAL;
}

TEVPF_STATUS read_indexes(TEVPF_TABLE& table, std::int32_t num_rows, Input& input) noexcept {
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    TEVPF_COLUMN& column = table.col_array[i];
    if (is_indexed(column)) PF_TRY(read_index(column, num_rows, input));
  }
  return PF_NORMAL;
}

// Reads the rows directly into their storage.
TEVPF_STATUS read_rows(TEVPF_TABLE& table, std::int32_t num_rows, Input& input) noexcept {
  const std::int64_t bytes = std::int64_t{num_rows} * table.row_wid;
  const Input::Claim claim = input.weigh(static_cast<std::uint64_t>(bytes));
  if (claim == Input::Claim::kTooLarge) return fail(PF_BADFORMAT, "table data");
  if (claim == Input::Claim::kFits && !reserve_rows(table, num_rows)) return fail_empty(PF_NOMEM);

  const std::int64_t batch = std::max<std::int64_t>(kBatchBytes / table.row_wid, 1);
  while (table.num_rows < num_rows) {
    const std::int64_t rows = std::min<std::int64_t>(batch, num_rows - table.num_rows);
    if (!reserve_rows(table, rows)) return fail_empty(PF_NOMEM);
    unsigned char* place = row_at(table, table.num_rows);
    const auto wanted = static_cast<std::uint64_t>(rows * table.row_wid);
    if (input.read(place, wanted) != wanted) return fail(PF_BADFORMAT, "table data");
    end_texts(table, place, rows);
    table.num_rows += static_cast<std::int32_t>(rows);
  }
  return PF_NORMAL;
}

TEVPF_STATUS build_missing_indexes(TEVPF_TABLE& table) noexcept {
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    TEVPF_COLUMN& column = table.col_array[i];
    if (!is_indexed(column) || index_entries(column) != nullptr) continue;
    NewIndex index;
    if (!build_index(table, column, table.num_rows, index)) return fail_empty(PF_NOMEM);
    adopt_index(column, std::move(index));
  }
  return PF_NORMAL;
}

// Reads what follows the body. After a failure the table has no rows.
TEVPF_STATUS read_contents(TEVPF_TABLE& table, std::int32_t num_rows, Input& input) noexcept {
  TEVPF_STATUS status = read_indexes(table, num_rows, input);
  if (status == PF_NORMAL) status = read_rows(table, num_rows, input);
  if (status == PF_NORMAL) status = build_missing_indexes(table);
  if (status == PF_NORMAL) return status;
  table.num_rows = 0;
  release_rows(table);
  for (std::int32_t i = 0; i < table.num_cols; ++i) release_index(table.col_array[i]);
  return status;
}

}  // namespace

TEVPF_STATUS build_table(const TEVPF_ELEM_HEADER& header, Body in_memory, Input& input) noexcept {
  if (header.btf < kTableHead) return fail(PF_BADFORMAT, header.elem_name);
  ByteReader body = in_memory.at_hand();
  TEVPF_TABLE head;
  unpack<kTableFields>(body.take(kTableHead), &head);
  const std::int32_t num_cols = std::max(head.num_cols, 0);
  if (!is_well_formed(body, num_cols, head.row_wid)) return fail(PF_BADFORMAT, header.elem_name);

  TEVPF_TABLE* table = nullptr;
  PF_TRY(TEV8R1_create_table(header, &table));
  table->header.btf = kTableHead;
  table->dsp_wid = head.dsp_wid;
  std::memcpy(table->RESERVED, head.RESERVED, sizeof table->RESERVED);
  if (num_cols == 0) return PF_NORMAL;
  PF_TRY(build_columns(*table, body, num_cols));
  if (head.num_rows > 0) PF_TRY(read_contents(*table, head.num_rows, input));
  // Last, because only this block may be larger than the file: a refused file must not cause an
  // allocation of that size.
  return make_default_row(*table) ? TEVPF_STATUS{PF_NORMAL} : fail_empty(PF_NOMEM);
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_format_table(TEVPF_ELEM_HEADER header, const void* body,
                                 std::FILE* stream) noexcept {
  Input input(stream);
  terminate_texts(header);
  return build_table(header, Body(body, header.btf), input);
}
