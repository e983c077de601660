// The start of operations on a list: find it in the current file by name, then find its parameter.
#pragma once

#include "core/base/status.h"
#include "lists/directory.h"
#include "lists/list.h"
#include "lists/name_index.h"

namespace tevpf {

// Finds the list and the position of the parameter that matches the name or pattern.
//   PF_NOFILE, PF_NOELEM, PF_NOPARAM
[[nodiscard]] inline TEVPF_STATUS find_param_of(const char* list_name, const char* param_name,
                                                TEVPF_LIST*& list,
                                                std::int32_t& position) noexcept {
  PF_TRY(find_list(list_name, list));
  return find_param(*list, param_name, position);
}

// Finds the list and checks that it has a parameter at that position.
//   PF_NOFILE, PF_NOELEM
//   PF_BADPOS  it has none; texts: the position, the number of parameters
[[nodiscard]] inline TEVPF_STATUS find_list_with(const char* list_name, std::int32_t position,
                                                 TEVPF_LIST*& list) noexcept {
  PF_TRY(find_list(list_name, list));
  if (position >= 0 && position < list->num_params) return PF_NORMAL;
  return fail(PF_BADPOS, Text(position), Text(list->num_params));
}

}  // namespace tevpf
