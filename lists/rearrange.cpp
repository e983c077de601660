// Deleting, renaming and moving parameters.
#include <cstring>

#include "core/base/status.h"
#include "core/base/text_field.h"
#include "lists/directory.h"
#include "lists/list.h"
#include "lists/name_index.h"
#include "lists/param_record.h"
#include "lists/param_store.h"

using namespace tevpf;

namespace {

// Finds the list and the place of the parameter in its name index.
TEVPF_STATUS find(const char* list_name, const char* param_name, TEVPF_LIST*& list,
                  SequencePlace& place) noexcept {
  PF_TRY(find_list(list_name, list));
  const NamePlace at = search_names(*list, param_name);
  if (!at.found) return fail(PF_NOPARAM, param_name);
  place = at.place;
  return PF_NORMAL;
}

}  // namespace

TEVPF_STATUS TEV8R1_PF_delete_param(const char* list_name, const char* param_name) noexcept {
  TEVPF_LIST* list;
  SequencePlace place;
  PF_TRY(find(list_name, param_name, list, place));

  const std::int32_t slot = list->index.order.at(place);
  TEVPF_PARAM_DEF& definition = param_in(*list, slot).def;
  __builtin_prefetch(definition.description);  // for its length
  const SequencePlace in_order = find_in_order(*list, slot);
  if (!ready_to_erase_name(*list, place.position) ||
      !ready_to_erase_param(*list, in_order.position)) {
    return fail_empty(PF_NOMEM);
  }
  erase_name(*list, place, slot);
  const std::int64_t bytes = stored_size(definition);
  release_texts(definition, list->texts);
  erase_param(*list, in_order, slot);
  --list->num_params;
  ++list->free_params;
  list->header.btf -= static_cast<std::int32_t>(bytes);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_modify_param_name(const char* list_name, const char* old_name,
                                         const char* new_name) noexcept {
  TEVPF_LIST* list;
  SequencePlace place{-1};
  PF_TRY(find(list_name, old_name, list, place));

  NameField kept;
  set_field(kept, new_name);
  const NamePlace wanted = search_others(*list, place.position, kept);
  if (wanted.found) return fail(PF_DUPLICATE, {"parameter ", new_name}, {"list ", list_name});
  if (!ready_to_move_name(*list, place.position, wanted.place.position)) {
    return fail_empty(PF_NOMEM);
  }
  // The look-up of an absent name always sets the error context, even here, where absence is
  // success.
  static_cast<void>(fail(PF_NOPARAM, new_name));
  change_name(*list, place.position, wanted.place.position, kept);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_move_param(const char* list_name, const char* param_name,
                                  std::int32_t new_position) noexcept {
  TEVPF_LIST* list;
  std::int32_t slot;
  PF_TRY(find_list(list_name, list));
  PF_TRY(find_param(*list, param_name, slot));
  const std::int32_t last = list->num_params - 1;
  if (new_position == PF_END_POS) new_position = last;
  if (new_position < 0 || new_position > last) return PF_BADPOS;

  const std::int32_t position = position_of(*list, slot);
  if (!ready_to_move_param(*list, position, new_position)) return fail_empty(PF_NOMEM);
  move_param(*list, position, new_position);
  return PF_NORMAL;
}
