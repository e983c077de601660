// Inquiries about a list that do not move its cursor.
#include <cstring>

#include "core/library.h"
#include "lists/find.h"

namespace tevpf {
namespace {

// The sizes fit, because they are part of btf.
TEVPF_STATUS sizes_of(const TEVPF_PARAM_DEF& definition, std::int32_t* type_out,
                      std::int32_t* value_size_out, std::int32_t* desc_size_out) noexcept {
  const std::int32_t width = definition.type == PF_TYPE_STRING ? definition.part.str.length : 0;
  PF_TRY(TEV8R1_compute_size(definition.type, width, value_size_out));
  *type_out = definition.type;
  const char* const description = definition.description;
  *desc_size_out =
      description == nullptr ? 1 : static_cast<std::int32_t>(std::strlen(description) + 1);
  return PF_NORMAL;
}

}  // namespace
}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_PF_inq_param_size(const char* list_name, const char* param_name,
                                      std::int32_t* type_out, std::int32_t* value_size_out,
                                      std::int32_t* desc_size_out) noexcept {
  TEVPF_LIST* list;
  std::int32_t slot;
  PF_TRY(find_param_of(list_name, param_name, list, slot));
  return sizes_of(param_in(*list, slot).def, type_out, value_size_out, desc_size_out);
}

TEVPF_STATUS TEV8R1_PF_inq_param_size_by_pos(const char* list_name, std::int32_t position,
                                             std::int32_t* type_out, std::int32_t* value_size_out,
                                             std::int32_t* desc_size_out) noexcept {
  TEVPF_LIST* list;
  PF_TRY(find_list_with(list_name, position, list));
  return sizes_of(param_at(*list, position).def, type_out, value_size_out, desc_size_out);
}

TEVPF_STATUS TEV8R1_PF_inq_next_param_size(const char* list_name, std::int32_t* type_out,
                                           std::int32_t* value_size_out,
                                           std::int32_t* desc_size_out) noexcept {
  TEVPF_LIST* list;
  PF_TRY(find_list_to_read(list_name, list));
  if (list->cur_param >= list->num_params - 1) return PF_NOMORE;
  const TEVPF_PARAM_DEF& definition = param_at(*list, list->cur_param + 1).def;
  return sizes_of(definition, type_out, value_size_out, desc_size_out);
}

TEVPF_STATUS TEV8R1_PF_inq_num_params(const char* list_name, std::int32_t* count_out) noexcept {
  TEVPF_LIST* list;
  PF_TRY(find_list(list_name, list));
  *count_out = list->num_params;
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_inq_param_pos(const char* list_name, const char* param_name,
                                  std::int32_t* position_out) noexcept {
  TEVPF_LIST* list;
  std::int32_t slot;
  PF_TRY(find_param_of(list_name, param_name, list, slot));
  *position_out = position_of(*list, slot);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_inq_param_exists(const char* list_name, const char* param_name) noexcept {
  TEVPF_LIST* list;
  std::int32_t slot;
  return find_param_of(list_name, param_name, list, slot);
}

TEVPF_STATUS TEV8R1_get_param_type(const char* list_name, const char* param_name,
                                   std::int32_t* type_out) noexcept {
  TEVPF_LIST* list;
  std::int32_t slot;
  PF_TRY(find_param_of(list_name, param_name, list, slot));
  *type_out = param_in(*list, slot).def.type;
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_set_interactive_list(const char* list_name) noexcept {
  TEVPF_LIST* list;
  PF_TRY(find_list(list_name, list));
  library.interactive = 1;
  return PF_NORMAL;
}
