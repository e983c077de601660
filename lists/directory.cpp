#include "lists/directory.h"

#include "core/base/status.h"

namespace tevpf {

TEVPF_STATUS find_list(const char* name, TEVPF_LIST*& list) noexcept {
  TEVPF_ELEM_HEADER* element = last_element(PF_ELEM_LIST, name);
  if (element == nullptr) PF_TRY(find_element(PF_ELEM_LIST, name, element));
  list = as_list(element);
  return PF_NORMAL;
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_get_list_array_pos(const TEVPF_LIST* list, std::int32_t* pos_out) noexcept {
  return element_position(PF_ELEM_LIST, reinterpret_cast<const TEVPF_ELEM_HEADER*>(list), *pos_out);
}

TEVPF_STATUS TEV8R1_create_list(TEVPF_ELEM_HEADER header, TEVPF_LIST** list_out) noexcept {
  TEVPF_ELEM_HEADER* element;
  PF_TRY(create_element(header, PF_ELEM_LIST, element));
  *list_out = as_list(element);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_insert_list(TEVPF_LIST** list_out) noexcept {
  TEVPF_ELEM_HEADER* element;
  PF_TRY(insert_unnamed(PF_ELEM_LIST, element));
  *list_out = as_list(element);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_check_list_unique(const char* name) noexcept {
  return check_name_unique(PF_ELEM_LIST, name);
}

TEVPF_STATUS TEV8R1_PF_delete_list(const char* name) noexcept {
  return delete_element(PF_ELEM_LIST, name);
}

TEVPF_STATUS TEV8R1_free_list(TEVPF_LIST* list) noexcept {
  release_list(list);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_copy_list(const char* source_name, const char* new_name) noexcept {
  return copy_element(PF_ELEM_LIST, source_name, new_name);
}
