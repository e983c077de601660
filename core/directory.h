// The directory of the current file: its elements by name and in order. Elements of every kind
// follow the same rules; each function takes the kind's type code.
#pragma once

#include <cstdint>

#include "core/base/text_field.h"
#include "core/file.h"
#include "core/library.h"

namespace tevpf {

// The element found last if it has this name and the name has fewer than 8 characters; otherwise
// null, and find_element must search. Every operation starts here, usually with a short name and
// the same element as the previous operation; that case makes no call.
inline TEVPF_ELEM_HEADER* last_element(std::int32_t elem_type, const char* name) noexcept {
  if (library.current_file == nullptr) return nullptr;
  TEVPF_ELEM_HEADER* const last = directory_of(*library.current_file, elem_type).last;
  return last != nullptr && holds_short_text(last->elem_name, name) ? last : nullptr;
}

// Finds an element of the current file by its exact name.
//   PF_NOFILE  no file is current; texts empty
//   PF_NOELEM  no such element; texts: the word for the kind, the name
[[nodiscard]] TEVPF_STATUS find_element(std::int32_t elem_type, const char* name,
                                        TEVPF_ELEM_HEADER*& element) noexcept;

// The position of this record, compared by address.
//   PF_NOELEM  it is not there; the texts stay as they were
[[nodiscard]] TEVPF_STATUS element_position(std::int32_t elem_type,
                                            const TEVPF_ELEM_HEADER* element,
                                            std::int32_t& position) noexcept;

// Checks that no element has a name with the same first 19 characters.
//   PF_NOFILE, PF_DUPLICATE  texts: the word and the name, "the file"
[[nodiscard]] TEVPF_STATUS check_name_unique(std::int32_t elem_type, const char* name) noexcept;

// Appends a new element with the given header.
//   PF_NOFILE, PF_DUPLICATE, PF_NOMEM
[[nodiscard]] TEVPF_STATUS create_element(TEVPF_ELEM_HEADER header, std::int32_t elem_type,
                                          TEVPF_ELEM_HEADER*& element) noexcept;

// Appends a record that the library's caller fills in, including its name.
//   PF_NOFILE, PF_NOMEM
[[nodiscard]] TEVPF_STATUS insert_unnamed(std::int32_t elem_type,
                                          TEVPF_ELEM_HEADER*& element) noexcept;

//   PF_NOFILE, PF_NOELEM
[[nodiscard]] TEVPF_STATUS delete_element(std::int32_t elem_type, const char* name) noexcept;

// Appends a copy under another name.
//   PF_NOFILE, PF_NOELEM, PF_DUPLICATE, PF_NOMEM
//   PF_BADNAME  the new name starts with a blank; the texts stay as they were
[[nodiscard]] TEVPF_STATUS copy_element(std::int32_t elem_type, const char* source_name,
                                        const char* new_name) noexcept;

}  // namespace tevpf
