// Deleting, renaming and moving parameters. Nothing here allocates, so nothing fails after the
// checks.
#include <algorithm>
#include <cstring>

#include "core/base/status.h"
#include "core/base/text_field.h"
#include "lists/directory.h"
#include "lists/list.h"
#include "lists/name_index.h"
#include "lists/param_record.h"

using namespace tevpf;

namespace {

// Finds the list and the place of the parameter in its name index.
TEVPF_STATUS find(const char* list_name, const char* param_name, TEVPF_LIST*& list,
                  std::int32_t& place) noexcept {
  PF_TRY(find_list(list_name, list));
  TEVPF_PARAM* param;
  return TEV8R1_get_param_ptr(list, param_name, &param, &place);
}

}  // namespace

TEVPF_STATUS TEV8R1_PF_delete_param(const char* list_name, const char* param_name) noexcept {
  TEVPF_LIST* list;
  std::int32_t place;
  PF_TRY(find(list_name, param_name, list, place));

  const std::int32_t position = list->index_ptr[place];
  TEVPF_PARAM* const param = list->param_ptr + position;
  const std::int64_t bytes = stored_size(param->def);
  release_texts(param->def, list->texts);
  const auto behind = static_cast<std::size_t>(list->num_params - position - 1);
  std::memmove(param, param + 1, behind * sizeof *param);
  TEV8R1_remove_param_from_index(list, place);
  --list->num_params;
  ++list->free_params;
  list->header.btf -= static_cast<std::int32_t>(bytes);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_modify_param_name(const char* list_name, const char* old_name,
                                         const char* new_name) noexcept {
  TEVPF_LIST* list;
  std::int32_t place;
  PF_TRY(find(list_name, old_name, list, place));

  char kept[TEVPF_NAME_SIZE];
  set_field(kept, new_name);
  const NamePlace wanted = search_others(*list, place, kept);
  if (wanted.found) return fail(PF_DUPLICATE, {"parameter ", new_name}, {"list ", list_name});
  // The look-up of an absent name always sets the error context, even here, where absence is
  // success.
  static_cast<void>(fail(PF_NOPARAM, new_name));

  TEVPF_PARAM& param = list->param_ptr[list->index_ptr[place]];
  move_place(*list, place, wanted.place);
  std::memcpy(param.def.name, kept, sizeof kept);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_move_param(const char* list_name, const char* param_name,
                                  std::int32_t new_position) noexcept {
  TEVPF_LIST* list;
  std::int32_t place;
  PF_TRY(find(list_name, param_name, list, place));
  const std::int32_t last = list->num_params - 1;
  if (new_position == PF_END_POS) new_position = last;
  if (new_position < 0 || new_position > last) return PF_BADPOS;

  const std::int32_t old_position = list->index_ptr[place];
  TEVPF_PARAM* const from = list->param_ptr + old_position;
  TEVPF_PARAM* const to = list->param_ptr + new_position;
  if (from < to) {
    std::rotate(from, from + 1, to + 1);
  } else {
    std::rotate(to, from, from + 1);
  }
  move_position(*list, old_position, new_position);
  return PF_NORMAL;
}
