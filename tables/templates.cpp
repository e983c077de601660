#include "tables/templates.h"

#include <limits>
#include <utility>

#include "core/directory.h"
#include "core/heap.h"
#include "core/status.h"
#include "tables/column_record.h"
#include "values/value_type.h"

namespace tevpf {
namespace {

constexpr std::int32_t kTemplates = PF_TYPE_SHORT - PF_TYPE_INT + 1;
constexpr std::int32_t kInitialWidths[kTemplates] = {11, 13, 1, 23, 6};
constexpr std::int32_t kInitialPrecision = 6;

TEVPF_COL_DEF initial_template(std::int32_t type) noexcept {
  TEVPF_COL_DEF def{};
  def.type = type;
  def.width = kInitialWidths[type - PF_TYPE_INT];
  if (type == PF_TYPE_STRING) return def;
  with_number(type, [&](auto tag) {
    using T = decltype(tag);
    auto& limits = limits_of<T>(def);
    limits.max = std::numeric_limits<T>::max();
    limits.min = std::numeric_limits<T>::lowest();
    if constexpr (kIsFloating<T>) limits.precision = kInitialPrecision;
  });
  return def;
}

// The table's template of a type; makes the templates where there are none yet.
TEVPF_STATUS find_template(const char* table_name, std::int32_t type,
                           TEVPF_COL_DEF*& found) noexcept {
  TEVPF_TABLE* table = nullptr;
  PF_TRY(TEV8R1_get_table_ptr(table_name, &table));
  if (table->col_dft == nullptr) PF_TRY(TEV8R1_load_col_dft(table));
  if (!is_value_type(type)) return fail(PF_BADTYPE, "function call", Text(type));
  found = &table->col_dft[type - PF_TYPE_INT];
  return PF_NORMAL;
}

}  // namespace

void release_templates(TEVPF_TABLE& table) noexcept {
  TEVPF_COL_DEF* templates = std::exchange(table.col_dft, nullptr);
  for (std::int32_t i = 0; templates != nullptr && i < kTemplates; ++i) {
    heap_free(templates[i].description);
  }
  heap_free(templates);
}

bool copy_templates(const TEVPF_TABLE& source, TEVPF_TABLE& copy) noexcept {
  if (source.col_dft == nullptr) return true;
  copy.col_dft = new_array<TEVPF_COL_DEF>(kTemplates).release();
  if (copy.col_dft == nullptr) return false;

  bool whole = true;
  for (std::int32_t i = 0; i < kTemplates; ++i) {
    const char* text = source.col_dft[i].description;
    copy.col_dft[i] = source.col_dft[i];
    copy.col_dft[i].description = text == nullptr ? nullptr : heap_copy(text);
    whole = whole && (text == nullptr || copy.col_dft[i].description != nullptr);
  }
  if (!whole) release_templates(copy);
  return whole;
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_load_col_dft(TEVPF_TABLE* table) noexcept {
  auto templates = new_zeroed<TEVPF_COL_DEF>(kTemplates);
  if (!templates) return fail_empty(PF_NOMEM);
  for (std::int32_t i = 0; i < kTemplates; ++i) {
    templates[static_cast<std::size_t>(i)] = initial_template(PF_TYPE_INT + i);
  }
  release_templates(*table);
  table->col_dft = templates.release();
  return PF_NORMAL;
}

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
