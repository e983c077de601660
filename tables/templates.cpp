#include "tables/templates.h"

#include <iterator>
#include <limits>
#include <utility>

#include "core/base/heap.h"
#include "core/base/status.h"
#include "tables/column_record.h"
#include "values/value_type.h"

namespace tevpf {
namespace {

constexpr std::int32_t kInitialWidths[] = {11, 13, 1, 23, 6};  // in type order
static_assert(std::size(kInitialWidths) == kValueTypeCount);
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

}  // namespace

void release_templates(TEVPF_TABLE& table) noexcept {
  TEVPF_COL_DEF* templates = std::exchange(table.col_dft, nullptr);
  for (std::int32_t i = 0; templates != nullptr && i < kValueTypeCount; ++i) {
    heap_free(templates[i].description);
  }
  heap_free(templates);
}

bool copy_templates(const TEVPF_TABLE& source, TEVPF_TABLE& copy) noexcept {
  if (source.col_dft == nullptr) return true;
  copy.col_dft = new_array<TEVPF_COL_DEF>(kValueTypeCount).release();
  if (copy.col_dft == nullptr) return false;

  bool whole = true;
  for (std::int32_t i = 0; i < kValueTypeCount; ++i) {
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
  auto templates = new_zeroed<TEVPF_COL_DEF>(kValueTypeCount);
  if (!templates) return fail_empty(PF_NOMEM);
  for (std::int32_t i = 0; i < kValueTypeCount; ++i) {
    templates[static_cast<std::size_t>(i)] = initial_template(PF_TYPE_INT + i);
  }
  release_templates(*table);
  table->col_dft = templates.release();
  return PF_NORMAL;
}
