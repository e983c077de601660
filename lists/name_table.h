// Finds parameters by exact name in O(1). The table only speeds up look-ups; the list's sorted name
// index is authoritative. The table is built after enough look-ups to repay its cost, and then
// follows the changes of the list. If there is no memory for it, the index is searched.
#pragma once

#include <cstdint>

#include "lists/list.h"

namespace tevpf {

struct TextPattern;

// Counts a look-up by exact name and returns whether the table can answer it. Builds the table when
// the number of look-ups reaches about a sixteenth of the number of parameters.
bool table_answers(TEVPF_LIST& list) noexcept;

// The slot of the parameter with exactly that name, or -1. The table must be built.
std::int32_t look_up(const TEVPF_LIST& list, const TextPattern& name) noexcept;

// ---- Changes; without a table they do nothing ---------------------------------------------------

// Makes room for one more name. Drops the table when out of memory.
void reserve_entry(TEVPF_LIST& list) noexcept;
// Enters the name of the parameter in a slot, or removes it.
void enter_name(TEVPF_LIST& list, std::int32_t slot) noexcept;
void remove_name(TEVPF_LIST& list, std::int32_t slot) noexcept;
// Gives each parameter the slot numbers[slot].
void renumber_table(NameTable& table, const std::int32_t* numbers) noexcept;
void drop_table(NameTable& table) noexcept;

}  // namespace tevpf
