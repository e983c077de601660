// The lists of the current file.
#pragma once

#include "core/directory.h"
#include "lists/list.h"

extern "C" {

TEVPF_API TEVPF_STATUS TEV8R1_get_list_array_pos(const TEVPF_LIST* list,
                                                 std::int32_t* pos_out) noexcept;
TEVPF_API TEVPF_STATUS TEV8R1_create_list(TEVPF_ELEM_HEADER header, TEVPF_LIST** list_out) noexcept;

// Appends a record that the caller fills in, its name included.
TEVPF_API TEVPF_STATUS TEV8R1_insert_list(TEVPF_LIST** list_out) noexcept;
TEVPF_API TEVPF_STATUS TEV8R1_free_list(TEVPF_LIST* list) noexcept;
}

namespace tevpf {

// A record starts with its header.
inline TEVPF_LIST* as_list(TEVPF_ELEM_HEADER* element) noexcept {
  return reinterpret_cast<TEVPF_LIST*>(element);
}

// The list found last if it has this name and the name has fewer than 8 characters; otherwise null.
inline TEVPF_LIST* last_list(const char* name) noexcept {
  return as_list(last_element(PF_ELEM_LIST, name));
}

// Finds a list of the current file by its exact name, whatever state it is in.
//   PF_NOFILE  no file is current; texts empty
//   PF_NOELEM  no such list; texts: "list", the name
[[nodiscard]] TEVPF_STATUS find_list(const char* name, TEVPF_LIST*& list) noexcept;

// The list at a position of the directory.
inline TEVPF_LIST& list_at(const TEVPF_FILE& file, std::int32_t position) noexcept {
  return *as_list(directory_of(file, PF_ELEM_LIST).entries[position]);
}

}  // namespace tevpf
