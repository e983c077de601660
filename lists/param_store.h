// The parameters of a list. Only param_store knows how they lie in param_ptr.
//
// A parameter occupies one slot of the parameter block and stays there, whatever comes, goes or
// moves around it. The sequence slots.order lists the slots in position order. Slots of deleted
// parameters are reused.
//
// Invariants: the slots in the order and the free slots are 0 .. num_params + num_free - 1, each
// once; there are no free slots while the order is an identity. A free slot is zero except for the
// number of the next one. The block grows geometrically. free_params counts what the documented
// increments added; callers maintain it, as they do num_params.
#pragma once

#include <cstdint>

#include "core/base/heap.h"
#include "lists/list.h"

namespace tevpf {

// ---- Parameters, slots and positions ------------------------------------------------------------

inline bool is_in_place(const TEVPF_LIST& list) noexcept { return list.slots.order.is_identity(); }

inline TEVPF_PARAM& param_in(const TEVPF_LIST& list, std::int32_t slot) noexcept {
  return list.param_ptr[slot];
}

// The parameter at a position.
inline TEVPF_PARAM& param_at(const TEVPF_LIST& list, std::int32_t position) noexcept {
  return list.param_ptr[list.slots.order.at(position)];
}

// Where the parameter in a slot stands in position order; its position.
SequencePlace find_in_order(TEVPF_LIST& list, std::int32_t slot) noexcept;
inline std::int32_t position_of(TEVPF_LIST& list, std::int32_t slot) noexcept {
  return is_in_place(list) ? slot : find_in_order(list, slot).position;
}

// Calls visit(slot) for every parameter in position order.
template <class Visit>
void for_each_slot(const TEVPF_LIST& list, Visit visit) {
  list.slots.order.for_each_chunk(list.num_params, [&](const SequenceChunk& chunk) {
    for (std::int32_t i = 0; i < chunk.count; ++i) visit(chunk[i]);
  });
}

// ---- Changes; num_params is the count before them -----------------------------------------------

// Makes room for `count` parameters. False when out of memory, and nothing has changed.
[[nodiscard]] bool reserve_params(TEVPF_LIST& list, std::int64_t count) noexcept;

// The slot for the next parameter; the block must have room for it.
inline std::int32_t next_slot(const TEVPF_LIST& list) noexcept {
  return list.slots.num_free > 0 ? list.slots.first_free : list.num_params;
}

// Each allocates what the change may need. False when out of memory, and nothing has changed.
[[nodiscard]] bool ready_to_insert_param(TEVPF_LIST& list, std::int32_t position) noexcept;
[[nodiscard]] bool ready_to_erase_param(TEVPF_LIST& list, std::int32_t position) noexcept;
[[nodiscard]] bool ready_to_move_param(TEVPF_LIST& list, std::int32_t from,
                                       std::int32_t to) noexcept;

// Stores a record that owns its texts in the next slot.
void insert_param(TEVPF_LIST& list, std::int32_t position, const TEVPF_PARAM& param) noexcept;
// Frees the slot of a parameter; the caller has released its texts.
void erase_param(TEVPF_LIST& list, const SequencePlace& place, std::int32_t slot) noexcept;
// Moves a parameter; `to` counts the others.
void move_param(TEVPF_LIST& list, std::int32_t from, std::int32_t to) noexcept;

// ---- The whole ----------------------------------------------------------------------------------

// Releases the block and the texts of all parameters.
void release_params(TEVPF_LIST& list) noexcept;

// Replaces the block by one of `room` slots that holds all parameters in position order.
void adopt_params(TEVPF_LIST& list, Owned<TEVPF_PARAM> params, std::int32_t room) noexcept;

// Copies all records, in position order. Their texts stay those of the list.
void copy_params_to(const TEVPF_LIST& list, TEVPF_PARAM* out) noexcept;

}  // namespace tevpf
