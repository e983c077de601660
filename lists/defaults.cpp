// The operations on a list's default definitions.
#include "core/base/status.h"
#include "lists/directory.h"
#include "lists/list.h"
#include "lists/param_check.h"
#include "lists/param_record.h"
#include "values/value_type.h"

namespace tevpf {
namespace {

// The list's table, created by the first operation that needs it; null when out of memory.
TEVPF_PARAM_DEF* defaults_of(TEVPF_LIST& list) noexcept {
  if (list.dft_ptr == nullptr && TEV8R1_load_param_dft(&list.dft_ptr) != PF_NORMAL) return nullptr;
  return list.dft_ptr;
}

}  // namespace
}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_PF_inq_param_dft(const char* list_name, std::int32_t type,
                                     TEVPF_PARAM_DEF* definition_out) noexcept {
  TEVPF_LIST* list;
  PF_TRY(find_list(list_name, list));
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
  PF_TRY(find_list(list_name, list));
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
