// The name index of a list: the slots of its parameters, ordered by name. Apart from the reader,
// the writer and the operations on whole records, only these functions access it.
//
// An index from a file is accepted in any order; searches of it end, stay in bounds and change
// nothing.
#pragma once

#include <cstdint>

#include "core/base/heap.h"
#include "lists/list.h"

extern "C" {

// The place of the first parameter in name order that matches the name or pattern.
//   PF_NOPARAM  none; place_out: where the name would have to be inserted; texts: the name
TEVPF_API TEVPF_STATUS TEV8R1_list_binary_search(const TEVPF_PARAM* params, std::int32_t count,
                                                 const std::int32_t* index, const char* name,
                                                 std::int32_t* place_out) noexcept;
}

namespace tevpf {

// The slot of the parameter that matches the name or pattern. Exact names take O(1) once there
// have been enough look-ups to build the name table.
//   PF_NOPARAM  none; texts: the name
[[nodiscard]] TEVPF_STATUS find_param(TEVPF_LIST& list, const char* name,
                                      std::int32_t& slot) noexcept;

struct NamePlace {
  SequencePlace place;  // of the parameter found, otherwise the insertion place of the name
  bool found;
};

// The place of the first parameter that matches the name or pattern.
NamePlace search_names(TEVPF_LIST& list, const char* name) noexcept;

// The same among all parameters except the one at place `without`; places are counted as if it were
// absent.
NamePlace search_others(TEVPF_LIST& list, std::int32_t without, const char* name) noexcept;

// ---- Changes; num_params is the count before them -----------------------------------------------

// Each allocates what the change may need. False when out of memory, and nothing has changed;
// places stay valid.
[[nodiscard]] bool ready_to_insert_name(TEVPF_LIST& list, std::int32_t place,
                                        std::int32_t slot) noexcept;
[[nodiscard]] bool ready_to_erase_name(TEVPF_LIST& list, std::int32_t place) noexcept;
[[nodiscard]] bool ready_to_move_name(TEVPF_LIST& list, std::int32_t from,
                                      std::int32_t to) noexcept;

// Enters the name of the parameter in a slot, whose record is already there.
void insert_name(TEVPF_LIST& list, const SequencePlace& place, std::int32_t slot) noexcept;
// Removes the entry of a slot at a place; the record is still there.
void erase_name(TEVPF_LIST& list, const SequencePlace& place, std::int32_t slot) noexcept;
// Renames the parameter at place `from`; `to` counts the others.
void change_name(TEVPF_LIST& list, std::int32_t from, std::int32_t to,
                 const NameField& name) noexcept;

// ---- The whole ----------------------------------------------------------------------------------

// Makes the index one array with room for `room` names. False when out of memory, and nothing has
// changed.
[[nodiscard]] bool flatten_names(TEVPF_LIST& list, std::int32_t room) noexcept;
// Replaces the index by an array of `room` entries.
void adopt_names(TEVPF_LIST& list, Owned<std::int32_t> index, std::int32_t room) noexcept;

// Fills an index of `count` entries with the positions in name order.
void sort_names(const TEVPF_PARAM* params, std::int32_t count, std::int32_t* index) noexcept;

}  // namespace tevpf
