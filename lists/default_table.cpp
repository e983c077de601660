#include "lists/default_table.h"

#include <cstring>
#include <limits>

#include "core/base/heap.h"
#include "core/base/status.h"
#include "lists/param_record.h"
#include "values/value_type.h"

namespace tevpf {
namespace {

constexpr std::int32_t kPrecision = 6;

// The initial definition of a number: any value of the type.
template <class T>
void initialise(TEVPF_PARAM_DEF& slot) noexcept {
  auto& part = number_part<T>(slot);
  part.max = std::numeric_limits<T>::max();
  part.min = std::numeric_limits<T>::lowest();
  if constexpr (kIsFloating<T>) part.precision = kPrecision;
}

}  // namespace

void release_defaults(TEVPF_PARAM_DEF* table) noexcept {
  if (table == nullptr) return;
  for (std::int32_t i = 0; i < kValueTypeCount; ++i) release_texts(table[i]);
  heap_free(table);
}

bool copy_defaults(const TEVPF_PARAM_DEF* source, TEVPF_PARAM_DEF*& copy) noexcept {
  if (source == nullptr) return true;
  Owned<TEVPF_PARAM_DEF> table = new_array<TEVPF_PARAM_DEF>(kValueTypeCount);
  if (!table) return false;
  for (std::int32_t i = 0; i < kValueTypeCount; ++i) {
    table[i] = source[i];
    if (own_texts(table[i])) continue;
    while (i-- > 0) release_texts(table[i]);
    return false;
  }
  copy = table.release();
  return true;
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_load_param_dft(TEVPF_PARAM_DEF** table_out) noexcept {
  Owned<TEVPF_PARAM_DEF> table = new_zeroed<TEVPF_PARAM_DEF>(kValueTypeCount);
  if (!table) return fail_empty(PF_NOMEM);
  for (std::int32_t i = 0; i < kValueTypeCount; ++i) {
    TEVPF_PARAM_DEF& slot = table[i];
    slot.type = PF_TYPE_INT + i;
    if (slot.type == PF_TYPE_STRING) {
      slot.part.str.value = heap_copy("");
      if (slot.part.str.value == nullptr) return fail_empty(PF_NOMEM);
    } else {
      with_number(slot.type, [&](auto tag) { initialise<decltype(tag)>(slot); });
    }
  }
  *table_out = table.release();
  return PF_NORMAL;
}
