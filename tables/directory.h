// The tables of the current file.
#pragma once

#include "core/directory.h"
#include "tables/table.h"

extern "C" {

TEVPF_API TEVPF_STATUS TEV8R1_get_table_array_pos(const TEVPF_TABLE* table,
                                                  std::int32_t* pos_out) noexcept;
TEVPF_API TEVPF_STATUS TEV8R1_create_table(TEVPF_ELEM_HEADER header,
                                           TEVPF_TABLE** table_out) noexcept;

// Appends a record; the caller fills it in, including its name.
TEVPF_API TEVPF_STATUS TEV8R1_insert_table(TEVPF_TABLE** table_out) noexcept;
TEVPF_API TEVPF_STATUS TEV8R1_free_table(TEVPF_TABLE* table) noexcept;
}

namespace tevpf {

// A record starts with its header.
inline TEVPF_TABLE* as_table(TEVPF_ELEM_HEADER* element) noexcept {
  return reinterpret_cast<TEVPF_TABLE*>(element);
}

// The table found by the last lookup, if it has this name and the name is shorter than 8
// characters; else null.
inline TEVPF_TABLE* last_table(const char* name) noexcept {
  return as_table(last_element(PF_ELEM_TABLE, name));
}

// Finds a table of the current file by its exact name, whatever state it is in.
//   PF_NOFILE  no file is current; texts empty
//   PF_NOELEM  no such table; texts: "table", the name
[[nodiscard]] TEVPF_STATUS find_table(const char* name, TEVPF_TABLE*& table) noexcept;

// The table at a position of the directory.
inline TEVPF_TABLE& table_at(const TEVPF_FILE& file, std::int32_t position) noexcept {
  return *as_table(directory_of(file, PF_ELEM_TABLE).entries[position]);
}

}  // namespace tevpf
