// The start of operations that read or change parameters where they are: find the list in the
// current file by name, then find its parameter.
#pragma once

#include "core/base/status.h"
#include "lists/directory.h"
#include "lists/list.h"
#include "lists/name_index.h"
#include "lists/param_store.h"
#include "lists/settle.h"

namespace tevpf {

// Finds the list and notes that one of its parameters is read. Slots and positions may have changed
// afterwards.
//   PF_NOFILE, PF_NOELEM
[[nodiscard]] inline TEVPF_STATUS find_list_to_read(const char* list_name,
                                                    TEVPF_LIST*& list) noexcept {
  PF_TRY(find_list(list_name, list));
  if (!is_in_place(*list)) count_read(*list);
  return PF_NORMAL;
}

// Finds the list and the slot of the parameter that matches the name or pattern.
//   PF_NOFILE, PF_NOELEM, PF_NOPARAM
[[nodiscard]] inline TEVPF_STATUS find_param_of(const char* list_name, const char* param_name,
                                                TEVPF_LIST*& list, std::int32_t& slot) noexcept {
  PF_TRY(find_list_to_read(list_name, list));
  return find_param(*list, param_name, slot);
}

// Finds the list and checks that it has a parameter at that position.
//   PF_NOFILE, PF_NOELEM
//   PF_BADPOS  it has none; texts: the position, the number of parameters
[[nodiscard]] inline TEVPF_STATUS find_list_with(const char* list_name, std::int32_t position,
                                                 TEVPF_LIST*& list) noexcept {
  PF_TRY(find_list_to_read(list_name, list));
  if (position >= 0 && position < list->num_params) return PF_NORMAL;
  return fail(PF_BADPOS, Text(position), Text(list->num_params));
}

}  // namespace tevpf
