// Adding parameters and replacing their definitions. Each operation allocates every block it needs
// before it changes the list.
#include <algorithm>
#include <cstring>
#include <limits>

#include "core/base/heap.h"
#include "core/base/status.h"
#include "core/library.h"
#include "lists/directory.h"
#include "lists/list.h"
#include "lists/name_index.h"
#include "lists/param_check.h"
#include "lists/param_record.h"
#include "values/text_compare.h"

namespace tevpf {
namespace {

constexpr std::int64_t kMostSlots = std::numeric_limits<std::int32_t>::max();

// Gives both arrays at least `slots` slots; when out of memory, the list remains valid.
bool make_room(TEVPF_LIST& list, std::int64_t slots) noexcept {
  if (slots <= list.param_room) return true;
  if (slots > kMostSlots) return false;
  const std::int64_t room = std::min(grown_room(list.param_room, slots), kMostSlots);
  const auto entries = static_cast<std::uint64_t>(room);
  void* const params = heap_resize(list.param_ptr, entries, sizeof(TEVPF_PARAM));
  if (params == nullptr) return false;
  list.param_ptr = static_cast<TEVPF_PARAM*>(params);
  void* const index = heap_resize(list.index_ptr, entries, sizeof(std::int32_t));
  if (index == nullptr) return false;
  list.index_ptr = static_cast<std::int32_t*>(index);
  list.param_room = static_cast<std::int32_t>(room);
  return true;
}

// Full arrays get the documented number of spare slots; the count does not depend on how many slots
// are allocated.
TEVPF_STATUS ensure_free_slot(TEVPF_LIST& list) noexcept {
  if (list.free_params > 0) return PF_NORMAL;
  const std::int32_t increment = library.alloc_increment;
  if (!make_room(list, std::int64_t{list.num_params} + increment)) return fail_empty(PF_NOMEM);
  list.free_params = increment;
  return PF_NORMAL;
}

// Stores a record that owns its texts at a position, and its index entry at a place.
void insert_param(TEVPF_LIST& list, const TEVPF_PARAM& param, std::int32_t position,
                  std::int32_t place) noexcept {
  TEVPF_PARAM* const slot = list.param_ptr + position;
  const auto behind = static_cast<std::size_t>(list.num_params - position);
  std::memmove(slot + 1, slot, behind * sizeof *slot);
  *slot = param;
  index_param(list, position, place);
  ++list.num_params;
  --list.free_params;
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
  TEVPF_PARAM* other;
  std::int32_t place;
  if (TEV8R1_get_param_ptr(list, name, &other, &place) == PF_NORMAL) {
    return fail(PF_DUPLICATE, {"parameter ", name}, {"list ", list->header.elem_name});
  }
  PF_TRY(TEV8R1_validate_param_def(list, param.def));
  const std::int64_t bytes = stored_size(param.def);
  if (!btf_can_change(*list, bytes) || !own_texts(param.def)) return fail_empty(PF_NOMEM);

  param.desc_loc = description_place(param.def);
  insert_param(*list, param, std::clamp(position, 0, list->num_params), place);
  list->header.btf += static_cast<std::int32_t>(bytes);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_modify_param_def(const char* list_name,
                                        TEVPF_PARAM_DEF definition) noexcept {
  TEVPF_LIST* list;
  std::int32_t position;
  PF_TRY(find_list(list_name, list));
  PF_TRY(normalise(definition));
  PF_TRY(find_param(*list, definition.name, position));
  PF_TRY(TEV8R1_validate_param_def(list, definition));

  TEVPF_PARAM& param = list->param_ptr[position];
  Redefinition change;
  PF_TRY(prepare(*list, param.def, definition, change));
  redefine(*list, param, definition, change);
  list->header.btf += static_cast<std::int32_t>(change.growth);
  return PF_NORMAL;
}
