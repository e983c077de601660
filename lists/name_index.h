// The name index of a list: the positions of its parameters, ordered by name. Apart from the
// reader, the writer and the operations on whole records, only these functions access it.
//
// Terms: a position counts parameters as the list presents them; a place counts them in name order.
#pragma once

#include <cstdint>

#include "lists/list.h"

extern "C" {

// The place of the first parameter in name order that matches the name or pattern.
//   PF_NOPARAM  none; place_out: where the name would have to be inserted; texts: the name
TEVPF_API TEVPF_STATUS TEV8R1_list_binary_search(const TEVPF_PARAM* params, std::int32_t count,
                                                 const std::int32_t* index, const char* name,
                                                 std::int32_t* place_out) noexcept;
TEVPF_API TEVPF_STATUS TEV8R1_get_param_ptr(TEVPF_LIST* list, const char* name,
                                            TEVPF_PARAM** param_out,
                                            std::int32_t* place_out) noexcept;

// Removes the entry at a place; higher positions decrease by one. Always PF_NORMAL. The caller
// updates num_params and the records.
TEVPF_API TEVPF_STATUS TEV8R1_remove_param_from_index(TEVPF_LIST* list,
                                                      std::int32_t place) noexcept;
}

namespace tevpf {

// The position of the parameter that matches the name or pattern. Exact names take O(1) once there
// have been enough look-ups to build the name table.
//   PF_NOPARAM  none; texts: the name
[[nodiscard]] TEVPF_STATUS find_param(TEVPF_LIST& list, const char* name,
                                      std::int32_t& position) noexcept;

struct NamePlace {
  std::int32_t place;  // of the parameter found, otherwise the insertion place of the name
  bool found;
};

// The same as TEV8R1_list_binary_search over all parameters except the one at place `without`;
// places are counted as if it were absent.
NamePlace search_others(const TEVPF_LIST& list, std::int32_t without, const char* name) noexcept;

// Adds a parameter whose record is already at `position`, before num_params counts it. Positions
// from there on increase by one.
void index_param(TEVPF_LIST& list, std::int32_t position, std::int32_t place) noexcept;

// Moves the entry at place `from` to place `to`, counted without that entry.
void move_place(TEVPF_LIST& list, std::int32_t from, std::int32_t to) noexcept;

// Updates the index for a parameter that moves between positions and for those that shift in
// between.
void move_position(TEVPF_LIST& list, std::int32_t from, std::int32_t to) noexcept;

// Fills an index of `count` entries with the positions in name order.
void sort_names(const TEVPF_PARAM* params, std::int32_t count, std::int32_t* index) noexcept;

}  // namespace tevpf
