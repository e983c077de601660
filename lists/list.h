// The records of lists and their parameters, and operations on whole records: release and copy.
//
// Invariants: index_ptr[0 .. num_params - 1] holds each position once, ordered by name; no two
// names compare equal; header.btf = 12 + the stored sizes of all parameters; for strings, length is
// the length of value; description and string value lie in the list's text block, or are blocks
// that the record owns.
#pragma once

#include <cstddef>
#include <cstdint>

#include "core/element.h"
#include "lists/text_block.h"

namespace tevpf {

inline constexpr std::int32_t kListHead = 12;  // stored body of a list without parameters

struct NameSlot {
  std::uint32_t hash;
  std::int32_t position;  // -1: empty
};

// The state of lists/name_table.
struct NameTable {
  NameSlot* slots;        // open addressing, at most half full; null while not built
  std::uint32_t mask;     // slots - 1, a power of two - 1
  std::int32_t lookups;   // since the table was dropped
  std::uint8_t in_order;  // the index is known to be strictly ascending; a file's need not be
};

}  // namespace tevpf

extern "C" {

#pragma pack(push, 4)
struct TEVPF_PARAM {
  char RESERVED[7];      // zero in parameters added here; carried through as read
  std::int8_t desc_loc;  // 0: no description; strings: 1; else the description's stored offset - 8
  TEVPF_PARAM_DEF def;
};
#pragma pack(pop)

struct TEVPF_LIST {
  TEVPF_ELEM_HEADER header;
  std::int32_t num_params;
  char RESERVED[8];          // carried through from the file
  TEVPF_PARAM_DEF* dft_ptr;  // the five default definitions in type order, or null
  TEVPF_PARAM* param_ptr;    // in position order
  std::int32_t cur_param;    // position of the current parameter; -1: before the first
  std::int32_t* index_ptr;   // positions ordered by name
  std::int32_t free_params;  // spare slots at the end of both arrays

  std::int32_t param_room;  // allocated slots of both arrays, at least num_params + free_params
  tevpf::NameTable names;   // all zero: not built
  tevpf::TextBlock texts;
};

static_assert(sizeof(void*) != 4 || sizeof(TEVPF_PARAM_DEF) == 64);
static_assert(sizeof(void*) != 4 || sizeof(TEVPF_PARAM) == 72);
static_assert(offsetof(TEVPF_PARAM, def) == 8);
static_assert(offsetof(TEVPF_PARAM_DEF, description) == 32);
}

namespace tevpf {

// release_contents releases everything that the list owns, even if it is only partly built;
// release_list also releases the record.
void release_contents(TEVPF_LIST& list) noexcept;
void release_list(TEVPF_LIST* list) noexcept;

// Copies everything except the name from `source` to `copy`, a new empty list; false when out of
// memory, and then `copy` is still empty.
[[nodiscard]] bool copy_list_body(const TEVPF_LIST& source, TEVPF_LIST& copy) noexcept;

// Allocates the first spare slots of a new list; false when out of memory.
[[nodiscard]] bool reserve_first_params(TEVPF_LIST& list, std::int32_t slots) noexcept;

}  // namespace tevpf
