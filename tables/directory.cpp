#include "tables/directory.h"

#include "core/base/status.h"

namespace tevpf {

TEVPF_STATUS find_table(const char* name, TEVPF_TABLE*& table) noexcept {
  TEVPF_ELEM_HEADER* element = last_element(PF_ELEM_TABLE, name);
  if (element == nullptr) PF_TRY(find_element(PF_ELEM_TABLE, name, element));
  table = as_table(element);
  return PF_NORMAL;
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_get_table_ptr(const char* name, TEVPF_TABLE** table_out) noexcept {
  return find_table(name, *table_out);
}

TEVPF_STATUS TEV8R1_get_table_array_pos(const TEVPF_TABLE* table, std::int32_t* pos_out) noexcept {
  return element_position(PF_ELEM_TABLE, reinterpret_cast<const TEVPF_ELEM_HEADER*>(table),
                          *pos_out);
}

TEVPF_STATUS TEV8R1_create_table(TEVPF_ELEM_HEADER header, TEVPF_TABLE** table_out) noexcept {
  TEVPF_ELEM_HEADER* element;
  PF_TRY(create_element(header, PF_ELEM_TABLE, element));
  *table_out = as_table(element);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_insert_table(TEVPF_TABLE** table_out) noexcept {
  TEVPF_ELEM_HEADER* element;
  PF_TRY(insert_unnamed(PF_ELEM_TABLE, element));
  *table_out = as_table(element);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_check_table_unique(const char* name) noexcept {
  return check_name_unique(PF_ELEM_TABLE, name);
}

TEVPF_STATUS TEV8R1_PF_delete_table(const char* name) noexcept {
  return delete_element(PF_ELEM_TABLE, name);
}

TEVPF_STATUS TEV8R1_free_table(TEVPF_TABLE* table) noexcept {
  release_table(table);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_copy_table(const char* source_name, const char* new_name) noexcept {
  return copy_element(PF_ELEM_TABLE, source_name, new_name);
}
