// Finds parameters by exact name in O(1). The table only speeds up look-ups; the list's sorted name
// index is authoritative. The table is built after enough look-ups to repay its cost, extended when
// parameters are appended, and dropped on any other change of positions or names. If there is no
// memory for it, the index is searched.
#pragma once

#include <cstdint>

#include "lists/list.h"

namespace tevpf {

struct TextPattern;

// Counts a look-up by exact name and returns whether the table can answer it. Builds the table when
// the number of look-ups reaches about a sixteenth of the number of parameters.
bool table_answers(TEVPF_LIST& list) noexcept;

// The position of the parameter with exactly that name, or -1. The table must be built.
std::int32_t look_up(const TEVPF_LIST& list, const TextPattern& name) noexcept;

// Adds the parameter that was stored after the last one, before num_params counts it.
void append_name(TEVPF_LIST& list) noexcept;

// Must be called before positions or names change in any other way.
void drop_table(NameTable& table) noexcept;

}  // namespace tevpf
