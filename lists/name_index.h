// The name index of a list: the positions of its parameters, ordered by name. Besides the reader,
// the writer and what holds whole records together, these are the only functions that look into it.
//
// Terms: a position counts parameters as the list presents them; a place counts them in name order.
#pragma once

#include <cstdint>

#include "lists/list.h"

extern "C" {

// The place of the first parameter in name order that the name, or pattern, finds.
//   PF_NOPARAM  none; place_out: where the name would have to be inserted; texts: the name
TEVPF_API TEVPF_STATUS TEV8R1_list_binary_search(const TEVPF_PARAM* params, std::int32_t count,
                                                 const std::int32_t* index, const char* name,
                                                 std::int32_t* place_out) noexcept;
TEVPF_API TEVPF_STATUS TEV8R1_get_param_ptr(TEVPF_LIST* list, const char* name,
                                            TEVPF_PARAM** param_out,
                                            std::int32_t* place_out) noexcept;

// Takes out the entry at a place; the positions behind the parameter's own go down by one. Always
// PF_NORMAL. num_params and the records are the caller's.
TEVPF_API TEVPF_STATUS TEV8R1_remove_param_from_index(TEVPF_LIST* list,
                                                      std::int32_t place) noexcept;
}

namespace tevpf {

// The position of the parameter that the name, or pattern, finds. Exact names cost O(1) once
// looking up has paid for it.
//   PF_NOPARAM  none; texts: the name
[[nodiscard]] TEVPF_STATUS find_param(TEVPF_LIST& list, const char* name,
                                      std::int32_t& position) noexcept;

struct NamePlace {
  std::int32_t place;  // of the parameter found, else where the name would have to be inserted
  bool found;
};

// The same as TEV8R1_list_binary_search over all parameters but the one at place `without`; places
// count as if it were not there.
NamePlace search_others(const TEVPF_LIST& list, std::int32_t without, const char* name) noexcept;

// Takes up a parameter whose record stands at `position`, before num_params counts it. The
// positions from there on go up by one.
void index_param(TEVPF_LIST& list, std::int32_t position, std::int32_t place) noexcept;

// Puts the entry at place `from` to the place that it has among the others.
void move_place(TEVPF_LIST& list, std::int32_t from, std::int32_t to) noexcept;

// Follows a parameter that moves between positions, and those in between that make room for it.
void move_position(TEVPF_LIST& list, std::int32_t from, std::int32_t to) noexcept;

// Fills an index of `count` entries with the positions in name order.
void sort_names(const TEVPF_PARAM* params, std::int32_t count, std::int32_t* index) noexcept;

}  // namespace tevpf
