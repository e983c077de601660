#include "lists/defaults.h"

#include <cstring>
#include <limits>

#include "core/directory.h"
#include "core/heap.h"
#include "core/status.h"
#include "core/text_field.h"
#include "lists/param_check.h"
#include "lists/param_record.h"
#include "values/value_type.h"

namespace tevpf {
namespace {

constexpr std::int32_t kSlots = 5;
constexpr std::int32_t kPrecision = 6;

// The initial definition of a number: any value of the type.
template <class T>
void initialise(TEVPF_PARAM_DEF& slot) noexcept {
  auto& part = number_part<T>(slot);
  part.max = std::numeric_limits<T>::max();
  part.min = std::numeric_limits<T>::lowest();
  if constexpr (kIsFloating<T>) part.precision = kPrecision;
}

// The list's table, made by the first operation that needs it; null when memory runs out.
TEVPF_PARAM_DEF* defaults_of(TEVPF_LIST& list) noexcept {
  if (list.dft_ptr == nullptr && TEV8R1_load_param_dft(&list.dft_ptr) != PF_NORMAL) return nullptr;
  return list.dft_ptr;
}

}  // namespace

void release_defaults(TEVPF_PARAM_DEF* table) noexcept {
  if (table == nullptr) return;
  for (std::int32_t i = 0; i < kSlots; ++i) release_texts(table[i]);
  heap_free(table);
}

bool copy_defaults(const TEVPF_PARAM_DEF* source, TEVPF_PARAM_DEF*& copy) noexcept {
  if (source == nullptr) return true;
  Owned<TEVPF_PARAM_DEF> table = new_array<TEVPF_PARAM_DEF>(kSlots);
  if (!table) return false;
  for (std::int32_t i = 0; i < kSlots; ++i) {
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
  Owned<TEVPF_PARAM_DEF> table = new_zeroed<TEVPF_PARAM_DEF>(kSlots);
  if (!table) return fail_empty(PF_NOMEM);
  for (std::int32_t i = 0; i < kSlots; ++i) {
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

TEVPF_STATUS TEV8R1_PF_inq_param_dft(const char* list_name, std::int32_t type,
                                     TEVPF_PARAM_DEF* definition_out) noexcept {
  TEVPF_LIST* list;
  PF_TRY(TEV8R1_get_list_ptr(list_name, &list));
  const TEVPF_PARAM_DEF* const defaults = defaults_of(*list);
  if (defaults == nullptr) return fail_empty(PF_NOMEM);
  if (!is_value_type(type)) return fail(PF_BADTYPE, "function call", Text(type));

  TEVPF_PARAM_DEF copy = defaults[type - PF_TYPE_INT];
  if (!own_texts(copy)) return fail_empty(PF_NOMEM);
  *definition_out = copy;
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_set_param_dft(const char* list_name, TEVPF_PARAM_DEF definition) noexcept {
  TEVPF_LIST* list;
  PF_TRY(TEV8R1_get_list_ptr(list_name, &list));
  PF_TRY(TEV8R1_validate_param_def(list, definition));
  // Unlike in a parameter, the length of a string is kept as the caller gave it.
  const std::int32_t length = definition.part.str.length;
  PF_TRY(normalise(definition));
  if (definition.type == PF_TYPE_STRING) definition.part.str.length = length;

  TEVPF_PARAM_DEF* const defaults = defaults_of(*list);
  if (defaults == nullptr || !own_texts(definition)) return fail_empty(PF_NOMEM);
  TEVPF_PARAM_DEF& slot = defaults[definition.type - PF_TYPE_INT];
  release_texts(slot);
  slot = definition;
  return PF_NORMAL;
}
