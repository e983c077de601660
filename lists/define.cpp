// Adding parameters and replacing their definitions. Each operation allocates every block it needs
// before it changes the list.
#include <algorithm>
#include <cstring>

#include "core/base/heap.h"
#include "core/base/status.h"
#include "core/library.h"
#include "lists/directory.h"
#include "lists/list.h"
#include "lists/name_index.h"
#include "lists/param_check.h"
#include "lists/param_record.h"
#include "lists/param_store.h"
#include "values/text_compare.h"

namespace tevpf {
namespace {

// A full list gets the documented number of spare slots; the count does not depend on how many
// slots are allocated.
TEVPF_STATUS ensure_free_slot(TEVPF_LIST& list) noexcept {
  if (list.free_params > 0) return PF_NORMAL;
  const std::int32_t increment = library.alloc_increment;
  if (!reserve_params(list, std::int64_t{list.num_params} + increment)) return fail_empty(PF_NOMEM);
  list.free_params = increment;
  return PF_NORMAL;
}

// Allocates what adding the parameter there can need, copies of its texts last.
bool ready_to_add(TEVPF_LIST& list, TEVPF_PARAM_DEF& definition, std::int32_t position,
                  std::int32_t place) noexcept {
  return ready_to_insert_name(list, place, next_slot(list)) &&
         ready_to_insert_param(list, position) && own_texts(definition);
}

// The new texts and the change in size of a parameter, prepared before it is redefined.
struct Redefinition {
  NewText value;
  NewText description;
  std::int64_t growth;  // of btf
};

std::size_t text_capacity(const char* text) noexcept {
  return text == nullptr ? 0 : std::strlen(text) + 1;
}

TEVPF_STATUS prepare(const TEVPF_LIST& list, const TEVPF_PARAM_DEF& old,
                     const TEVPF_PARAM_DEF& definition, Redefinition& change) noexcept {
  change.growth = stored_size(definition) - stored_size(old);
  if (!btf_can_change(list, change.growth)) return fail_empty(PF_NOMEM);

  if (definition.type == PF_TYPE_STRING) {
    const std::size_t capacity =
        old.type == PF_TYPE_STRING ? static_cast<std::size_t>(old.part.str.length) + 1 : 0;
    const auto length = static_cast<std::size_t>(definition.part.str.length);
    if (!change.value.prepare(definition.part.str.value, length, capacity)) {
      return fail_empty(PF_NOMEM);
    }
  }
  const char* const text = definition.description;
  const std::size_t length = text == nullptr ? 0 : std::strlen(text);
  const bool prepared = change.description.prepare(text, length, text_capacity(old.description));
  return prepared ? TEVPF_STATUS{PF_NORMAL} : fail_empty(PF_NOMEM);
}

void redefine(const TEVPF_LIST& list, TEVPF_PARAM& param, TEVPF_PARAM_DEF definition,
              Redefinition& change) noexcept {
  TEVPF_PARAM_DEF& old = param.def;
  char* const old_value = old.type == PF_TYPE_STRING ? old.part.str.value : nullptr;
  char* const value = change.value.commit(old_value, list.texts);
  if (definition.type == PF_TYPE_STRING) definition.part.str.value = value;
  definition.description = change.description.commit(old.description, list.texts);
  // A pattern only selects: the parameter keeps its name.
  if (make_pattern(definition.name).prefix) {
    std::memcpy(definition.name, old.name, sizeof definition.name);
  }
  old = definition;
  param.desc_loc = description_place(definition);
}

}  // namespace
}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_PF_add_param(const char* list_name, const TEVPF_PARAM_DEF* definition,
                                 std::int32_t position) noexcept {
  TEVPF_LIST* list;
  PF_TRY(find_list(list_name, list));
  PF_TRY(ensure_free_slot(*list));

  TEVPF_PARAM param{};
  param.def = *definition;
  PF_TRY(normalise(param.def));
  const char* const name = param.def.name;
  const NamePlace wanted = search_names(*list, name);
  if (wanted.found) {
    return fail(PF_DUPLICATE, {"parameter ", name}, {"list ", list->header.elem_name});
  }
  // The look-up of an absent name always sets the error context, even here, where absence is
  // success.
  static_cast<void>(fail(PF_NOPARAM, name));
  PF_TRY(TEV8R1_validate_param_def(list, param.def));
  const std::int64_t bytes = stored_size(param.def);
  const std::int32_t target = std::clamp(position, 0, list->num_params);
  if (!btf_can_change(*list, bytes) ||
      !ready_to_add(*list, param.def, target, wanted.place.position)) {
    return fail_empty(PF_NOMEM);
  }

  param.desc_loc = description_place(param.def);
  const std::int32_t slot = next_slot(*list);
  insert_param(*list, target, param);
  insert_name(*list, wanted.place, slot);
  ++list->num_params;
  --list->free_params;
  list->header.btf += static_cast<std::int32_t>(bytes);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_modify_param_def(const char* list_name,
                                        TEVPF_PARAM_DEF definition) noexcept {
  TEVPF_LIST* list;
  std::int32_t slot;
  PF_TRY(find_list(list_name, list));
  PF_TRY(normalise(definition));
  PF_TRY(find_param(*list, definition.name, slot));
  PF_TRY(TEV8R1_validate_param_def(list, definition));

  TEVPF_PARAM& param = param_in(*list, slot);
  Redefinition change;
  PF_TRY(prepare(*list, param.def, definition, change));
  redefine(*list, param, definition, change);
  list->header.btf += static_cast<std::int32_t>(change.growth);
  return PF_NORMAL;
}
