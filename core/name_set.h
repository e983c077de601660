// The element names of one kind in one file, hashed by the 19 characters that are kept of a name.
// The set only speeds up searches; the directory is authoritative. It may be dropped at any time
// and is rebuilt when needed; if there is no memory for it, callers scan the directory.
#pragma once

#include <cstdint>

#include "core/element.h"

namespace tevpf {

struct NameSet {
  struct Slot {
    TEVPF_ELEM_HEADER* element;  // null: empty
    std::uint32_t hash;
  };
  Slot* slots;         // open addressing with linear probing; null while not built
  std::uint32_t mask;  // slots - 1, a power of two - 1
  std::int32_t count;  // names in the set
};

// Adds an element, whose name must not change while it is in the set. When out of memory, drops all
// names.
void add_name(NameSet& set, TEVPF_ELEM_HEADER* element) noexcept;

// The element whose name has the same first 19 characters, or null.
TEVPF_ELEM_HEADER* find_name(const NameSet& set, const char* name) noexcept;

// Removes an element. Call before its name changes or it is released. O(1).
void remove_name(NameSet& set, const TEVPF_ELEM_HEADER* element) noexcept;

void drop_names(NameSet& set) noexcept;

}  // namespace tevpf
