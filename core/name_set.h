// Element names of one kind in one file, hashed by the 19 characters that are kept of a name: an
// accelerator beside the directory, which stays the truth. It may be dropped at any time and is
// built again when it is needed; without memory for it, callers walk the directory.
#pragma once

#include <cstdint>

#include "core/element.h"

namespace tevpf {

struct NameSet {
  TEVPF_ELEM_HEADER** slots;  // open addressing; null while not built
  std::uint32_t mask;         // slots - 1, a power of two - 1
  std::int32_t count;         // names in the set
};

// The element whose name has the same first 19 characters, or null. `elements` are the `count`
// element records of the directory; a set that does not hold exactly these is built anew first.
TEVPF_ELEM_HEADER* find_name(NameSet& set, TEVPF_ELEM_HEADER* const* elements, std::int32_t count,
                             const char* name) noexcept;

// Keeps the set in step with an element that was appended to the directory; drops the set when it
// cannot.
void add_name(NameSet& set, TEVPF_ELEM_HEADER* element) noexcept;

// Before a name is changed or an element taken out.
void drop_names(NameSet& set) noexcept;

}  // namespace tevpf
