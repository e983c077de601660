// Parameters by exact name, in O(1): an accelerator beside a list's sorted name index, which stays
// the truth. It is built when look-ups have paid for it, kept up while parameters are appended, and
// dropped whenever positions or names change otherwise. Without memory for it the index is
// searched.
#pragma once

#include <cstdint>

#include "lists/list.h"

namespace tevpf {

struct TextPattern;

// Counts a look-up by exact name and tells whether the table can answer it; builds it when it is
// due: after some sixteenth as many look-ups as there are parameters.
bool table_answers(TEVPF_LIST& list) noexcept;

// The position of the parameter with exactly that name, -1 when there is none; the table is built.
std::int32_t look_up(const TEVPF_LIST& list, const TextPattern& name) noexcept;

// Takes up the parameter that was stored behind the last one, before num_params counts it.
void append_name(TEVPF_LIST& list) noexcept;

// Before positions or names change in any other way.
void drop_table(NameTable& table) noexcept;

}  // namespace tevpf
