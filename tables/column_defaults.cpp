// The operations on a table's column templates.
#include "core/base/heap.h"
#include "core/base/status.h"
#include "tables/column_record.h"
#include "tables/directory.h"
#include "tables/templates.h"
#include "values/value_type.h"

namespace tevpf {
namespace {

// The table's template of a type; creates the templates if there are none.
TEVPF_STATUS find_template(const char* table_name, std::int32_t type,
                           TEVPF_COL_DEF*& found) noexcept {
  TEVPF_TABLE* table = nullptr;
  PF_TRY(find_table(table_name, table));
  if (table->col_dft == nullptr) PF_TRY(TEV8R1_load_col_dft(table));
  if (!is_value_type(type)) return fail(PF_BADTYPE, "function call", Text(type));
  found = &table->col_dft[type - PF_TYPE_INT];
  return PF_NORMAL;
}

}  // namespace
}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_PF_set_col_dft(const char* table_name, TEVPF_COL_DEF def) noexcept {
  TEVPF_COL_DEF* slot = nullptr;
  PF_TRY(find_template(table_name, def.type, slot));
  terminate_texts(def);
  if (def.description != nullptr) {
    def.description = heap_copy(def.description);
    if (def.description == nullptr) return fail_empty(PF_NOMEM);
  }
  heap_free(slot->description);
  *slot = def;
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_inq_col_dft(const char* table_name, std::int32_t type,
                                   TEVPF_COL_DEF* def_out) noexcept {
  TEVPF_COL_DEF* slot = nullptr;
  PF_TRY(find_template(table_name, type, slot));
  return copy_definition(*slot, *def_out);
}
