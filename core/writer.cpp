#include "core/writer.h"

#include <cstring>

#include "core/base/status.h"
#include "core/file.h"
#include "core/io/sink.h"
#include "core/stored_form.h"
#include "tables/column_index.h"
#include "tables/row_store.h"

namespace tevpf {

namespace {

template <const auto& Fields>
void put_fields(Sink& sink, const void* record) noexcept {
  pack<Fields>(record, sink.record(stored_size(Fields)));
}

void put_text(Sink& sink, const char* text) noexcept { sink.put(text, std::strlen(text) + 1); }

void put_index(Sink& sink, const std::int32_t* entries, std::int32_t count) noexcept {
  sink.put(entries, static_cast<std::uint64_t>(count) * sizeof *entries);
}

TEVPF_STATUS put_param(Sink& sink, const TEVPF_PARAM& param) noexcept {
  const TEVPF_PARAM_DEF& def = param.def;
  TEVPF_STATUS status = PF_NORMAL;
  std::int32_t part_bytes = 0;
  if (is_value_type(def.type)) {
    part_bytes = value_type(def.type).param_part;
  } else {
    status = fail(PF_BADTYPE, "parameter", Text(def.type));
  }
  constexpr std::size_t kHead = stored_size(kParamFields);
  static_assert(sizeof def.part <= Sink::kSlack);
  unsigned char* const place =
      sink.record(std::size_t{kHead} + static_cast<std::size_t>(part_bytes));
  pack<kParamFields>(&param, place);
  std::memcpy(place + kHead, &def.part, sizeof def.part);
  if (def.type == PF_TYPE_STRING) {
    sink.put(def.part.str.value, static_cast<std::uint64_t>(def.part.str.length) + 1);
  }
  if (def.description != nullptr) put_text(sink, def.description);
  return status;
}

TEVPF_STATUS put_list(Sink& sink, const TEVPF_LIST& list) noexcept {
  sink.put(&list.header, sizeof list.header);
  put_fields<kListFields>(sink, &list);
  TEVPF_STATUS status = PF_NORMAL;
  for (std::int32_t i = 0; i < list.num_params; ++i) {
    const TEVPF_STATUS noted = put_param(sink, list.param_ptr[i]);
    if (noted != PF_NORMAL) status = noted;
  }
  if (status == PF_NORMAL) put_index(sink, list.index_ptr, list.num_params);
  return status;
}

TEVPF_STATUS put_column(Sink& sink, const TEVPF_COLUMN& column) noexcept {
  const TEVPF_COL_DEF& def = column.def;
  put_fields<kColumnFields>(sink, &column);
  if (!is_value_type(def.type)) return fail(PF_BADTYPE, "column", Text(def.type));
  sink.put(&def.limits, static_cast<std::uint64_t>(value_type(def.type).column_part));
  if (def.description != nullptr) put_text(sink, def.description);
  return PF_NORMAL;
}

TEVPF_STATUS put_table(Sink& sink, const TEVPF_TABLE& table) noexcept {
  sink.put(&table.header, sizeof table.header);
  put_fields<kTableFields>(sink, &table);
  for (std::int32_t i = 0; i < table.num_cols; ++i) PF_TRY(put_column(sink, table.col_array[i]));
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    const TEVPF_COLUMN& column = table.col_array[i];
    if (is_indexed(column)) put_index(sink, index_entries(column), table.num_rows);
  }
  const auto rows = static_cast<std::uint64_t>(table.num_rows);
  if (rows != 0) sink.put(row_at(table, 0), rows * static_cast<std::uint64_t>(table.row_wid));
  return PF_NORMAL;
}

TEVPF_STATUS put_elements(Sink& sink, const TEVPF_FILE& file) noexcept {
  for (std::int32_t i = 0; i < file.num_lists; ++i) PF_TRY(put_list(sink, *file.list_ptr[i]));
  for (std::int32_t i = 0; i < file.num_tables; ++i) PF_TRY(put_table(sink, *file.table_ptr[i]));
  return PF_NORMAL;
}

// Writes by `put` and empties the sink, also behind a record that could not be stored.
template <class Put>
TEVPF_STATUS write_through_sink(std::FILE* stream, const char* name, Put put) noexcept {
  Sink sink(stream);
  const TEVPF_STATUS status = put(sink);
  const bool written = sink.finish() && std::fflush(stream) == 0;
  return status == PF_NORMAL && !written ? fail(PF_OPENFAIL, name) : status;
}

}  // namespace

TEVPF_STATUS write_elements(const TEVPF_FILE& file, std::FILE* stream, const char* name) noexcept {
  return write_through_sink(stream, name, [&](Sink& sink) { return put_elements(sink, file); });
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_store_file(TEVPF_FILE* file) noexcept {
  if (file->fp == nullptr) return fail(PF_OPENFAIL, file->file_name);
  return write_elements(*file, file->fp, file->file_name);
}

TEVPF_STATUS TEV8R1_store_list(std::FILE* stream, const TEVPF_LIST* list) noexcept {
  return write_through_sink(stream, list->header.elem_name,
                            [&](Sink& sink) { return put_list(sink, *list); });
}

TEVPF_STATUS TEV8R1_store_table(std::FILE* stream, const TEVPF_TABLE* table) noexcept {
  return write_through_sink(stream, table->header.elem_name,
                            [&](Sink& sink) { return put_table(sink, *table); });
}
