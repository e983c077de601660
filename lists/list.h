// The records of lists and their parameters, and operations on whole records: release and copy.
//
// Terms. A slot is a place in the parameter block; a parameter keeps its slot as long as it is in
// the list. A position counts parameters as the list presents them. A place counts them in name
// order.
//
// Invariants: the name index holds each parameter's slot once, ordered by name; no two names
// compare equal; header.btf = 12 + the stored sizes of all parameters; for strings, length is the
// length of value; description and string value lie in the list's text block, or are blocks that
// the record owns.
//
// A list is settled when its parameters are in position order, so that slots are positions, and its
// name index is one array with room for num_params + free_params entries. Outside callers may then
// read and change param_ptr and index_ptr. Changes unsettle a list; lists/settle settles it again.
#pragma once

#include <cstddef>
#include <cstdint>

#include "core/element.h"
#include "core/sequence/sequence.h"
#include "lists/text_block.h"

namespace tevpf {

inline constexpr std::int32_t kListHead = 12;  // stored body of a list without parameters

using NameField = char[TEVPF_NAME_SIZE];

// The state of lists/param_store.
struct ParamSlots {
  Sequence order;           // slots in position order; an identity as long as slots are positions
  std::int32_t first_free;  // the first of the chain of free slots, if there are any
  std::int32_t num_free;    // slots below num_params + num_free that hold no parameter
  std::int32_t room;        // slots that the block has, at least num_params + free_params
  std::int64_t reads;       // since the last change, while the order is not an identity
};

// The state of lists/name_index.
struct NameIndex {
  Sequence order;  // slots in name order
  // What all names have in common, where blocks keep keys of them.
  NameField beginning;
  std::uint8_t beginning_length;
  std::uint8_t in_order;  // known to be strictly ascending; a file's need not be
};

struct NameEntry {
  std::uint32_t hash;
  std::int32_t slot;  // of the parameter; -1: empty
};

// The state of lists/name_table.
struct NameTable {
  NameEntry* entries;    // open addressing, at most half full; null while not built
  std::uint32_t mask;    // entries - 1, a power of two - 1
  std::int32_t lookups;  // that a table could have answered, while there is none
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
  TEVPF_PARAM* param_ptr;    // by slot; of a settled list: in position order
  std::int32_t cur_param;    // position of the current parameter; -1: before the first
  std::int32_t* index_ptr;   // of a settled list: positions ordered by name
  std::int32_t free_params;  // spare slots as counted for callers

  tevpf::ParamSlots slots;
  tevpf::NameIndex index;  // its array is index_ptr
  tevpf::NameTable names;
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

// Copies everything except the name from `source`, which is settled, to `copy`, a new empty list;
// false when out of memory, and then `copy` is still empty.
[[nodiscard]] bool copy_list_body(const TEVPF_LIST& source, TEVPF_LIST& copy) noexcept;

// Allocates the first spare slots of a new list; false when out of memory.
[[nodiscard]] bool reserve_first_params(TEVPF_LIST& list, std::int32_t slots) noexcept;

}  // namespace tevpf
