#include "tables/default_row.h"

#include <cstring>

#include "core/base/status.h"
#include "tables/layout.h"
#include "values/value_type.h"

namespace tevpf {

void put_min(unsigned char* place, const TEVPF_COL_DEF& definition) noexcept {
  if (definition.type == PF_TYPE_STRING) {
    *place = '\0';
    return;
  }
  with_number(definition.type, [&](auto tag) {
    using T = decltype(tag);
    const T min = limits_of<T>(definition).min;
    store(place, min);
  });
}

bool make_default_row(TEVPF_TABLE& table) noexcept {
  auto row = new_zeroed<unsigned char>(static_cast<std::uint64_t>(table.row_wid));
  if (!row) return false;
  adopt_minimums(table, std::move(row));
  return true;
}

bool ensure_default_row(TEVPF_TABLE& table) noexcept {
  return table.dft_row != nullptr || make_default_row(table);
}

bool widen_default_row(TEVPF_TABLE& table, std::int64_t new_wid, std::int64_t offset,
                       const TEVPF_COL_DEF& definition) noexcept {
  if (table.num_cols > 0 && !ensure_default_row(table)) return false;
  auto row = new_zeroed<unsigned char>(static_cast<std::uint64_t>(new_wid));
  if (!row) return false;
  if (table.dft_row != nullptr) {
    std::memcpy(row.get(), table.dft_row, static_cast<std::size_t>(table.row_wid));
  }
  put_min(row.get() + offset, definition);
  adopt_default_row(table, std::move(row));
  return true;
}

void adopt_minimums(TEVPF_TABLE& table, Owned<unsigned char> zeroed) noexcept {
  adopt_default_row(table, std::move(zeroed));
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    const TEVPF_COLUMN& column = table.col_array[i];
    put_min(table.dft_row + column.offset, column.def);
  }
}

void adopt_default_row(TEVPF_TABLE& table, Owned<unsigned char> row) noexcept {
  heap_free(table.dft_row);
  table.dft_row = row.release();
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_init_row_defaults(TEVPF_TABLE* table) noexcept {
  TEVPF_STATUS status = PF_NORMAL;
  for (std::int32_t i = 0; i < table->num_cols; ++i) {
    const TEVPF_COLUMN& column = table->col_array[i];
    unsigned char* place = table->dft_row + column.offset;
    if (!is_value_type(column.def.type)) {
      status = fail(PF_BADTYPE, "column", Text(column.def.type));
    } else if (column.def.type == PF_TYPE_STRING) {
      std::memset(place, 0, static_cast<std::size_t>(column_size(column)));
    } else {
      put_min(place, column.def);
    }
  }
  return status;
}

TEVPF_STATUS TEV8R1_adjust_default(void** dft_row, std::int32_t row_wid,
                                   const TEVPF_COL_DEF* definition, std::int32_t size,
                                   std::int32_t offset) noexcept {
  (void)size;  // implied by the definition
  const auto bytes = static_cast<std::uint64_t>(row_wid);
  void* row = *dft_row == nullptr ? heap_zeroed(bytes, 1) : heap_resize(*dft_row, bytes, 1);
  if (row == nullptr) return fail_empty(PF_NOMEM);
  *dft_row = row;
  if (is_value_type(definition->type)) {
    put_min(static_cast<unsigned char*>(row) + offset, *definition);
  }
  return PF_NORMAL;
}
