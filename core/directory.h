// The directory of the current file: its lists and tables by name and in order.
#pragma once

#include "core/element.h"

extern "C" {

TEVPF_API TEVPF_STATUS TEV8R1_create_list(TEVPF_ELEM_HEADER header, TEVPF_LIST** list_out) noexcept;
TEVPF_API TEVPF_STATUS TEV8R1_create_table(TEVPF_ELEM_HEADER header,
                                           TEVPF_TABLE** table_out) noexcept;
TEVPF_API TEVPF_STATUS TEV8R1_insert_list(TEVPF_LIST** list_out) noexcept;
TEVPF_API TEVPF_STATUS TEV8R1_insert_table(TEVPF_TABLE** table_out) noexcept;

// Find an element of the current file by its exact name.
//   PF_NOFILE  no file is current; texts empty
//   PF_NOELEM  no such element; texts: "list" or "table", the name
TEVPF_API TEVPF_STATUS TEV8R1_get_list_ptr(const char* name, TEVPF_LIST** list_out) noexcept;
TEVPF_API TEVPF_STATUS TEV8R1_get_table_ptr(const char* name, TEVPF_TABLE** table_out) noexcept;

TEVPF_API TEVPF_STATUS TEV8R1_get_list_array_pos(const TEVPF_LIST* list,
                                                 std::int32_t* pos_out) noexcept;
TEVPF_API TEVPF_STATUS TEV8R1_get_table_array_pos(const TEVPF_TABLE* table,
                                                  std::int32_t* pos_out) noexcept;
TEVPF_API TEVPF_STATUS TEV8R1_free_list(TEVPF_LIST* list) noexcept;
TEVPF_API TEVPF_STATUS TEV8R1_free_table(TEVPF_TABLE* table) noexcept;
}

namespace tevpf {

// The element that was found last if it has this name, of fewer than 8 characters; else null, and the
// operations above find it.
TEVPF_LIST* last_list(const char* name) noexcept;
TEVPF_TABLE* last_table(const char* name) noexcept;

}  // namespace tevpf
