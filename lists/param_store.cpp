#include "lists/param_store.h"

#include <algorithm>
#include <cstring>
#include <limits>

#include "lists/param_record.h"

namespace tevpf {
namespace {

constexpr std::int64_t kMostSlots = std::numeric_limits<std::int32_t>::max();

// In a free slot: the number of the next one.
std::int32_t& next_free(TEVPF_PARAM& slot) noexcept { return slot.def.type; }

}  // namespace

SequencePlace find_in_order(TEVPF_LIST& list, std::int32_t slot) noexcept {
  if (is_in_place(list)) return {slot};
  list.slots.order.expect_finding(list.num_params);
  return list.slots.order.place_of(list.num_params, slot);
}

bool reserve_params(TEVPF_LIST& list, std::int64_t count) noexcept {
  std::int32_t& room = list.slots.room;
  if (count <= room) return true;
  if (count > kMostSlots) return false;
  const std::int64_t grown = std::min(grown_room(room, count), kMostSlots);
  void* const block =
      heap_resize(list.param_ptr, static_cast<std::uint64_t>(grown), sizeof(TEVPF_PARAM));
  if (block == nullptr) return false;
  list.param_ptr = static_cast<TEVPF_PARAM*>(block);
  room = static_cast<std::int32_t>(grown);
  return true;
}

bool ready_to_insert_param(TEVPF_LIST& list, std::int32_t position) noexcept {
  return list.slots.order.make_ready_to_insert(list.num_params, position, next_slot(list));
}

bool ready_to_erase_param(TEVPF_LIST& list, std::int32_t position) noexcept {
  return list.slots.order.make_ready_to_erase(list.num_params, position);
}

bool ready_to_move_param(TEVPF_LIST& list, std::int32_t from, std::int32_t to) noexcept {
  return list.slots.order.make_ready_to_move(list.num_params, from, to);
}

void insert_param(TEVPF_LIST& list, std::int32_t position, const TEVPF_PARAM& param) noexcept {
  ParamSlots& slots = list.slots;
  const std::int32_t slot = next_slot(list);
  if (slots.num_free > 0) {
    slots.first_free = next_free(param_in(list, slot));
    --slots.num_free;
  }
  slots.order.insert(list.num_params, slots.order.place_at(position), slot);
  slots.reads = 0;
  param_in(list, slot) = param;
}

void erase_param(TEVPF_LIST& list, const SequencePlace& place, std::int32_t slot) noexcept {
  ParamSlots& slots = list.slots;
  // The last parameter of an identity order: its slot is the next one anyway.
  if (is_in_place(list)) return;
  slots.order.erase(list.num_params, place);
  slots.reads = 0;
  param_in(list, slot) = {};
  next_free(param_in(list, slot)) = slots.first_free;
  slots.first_free = slot;
  ++slots.num_free;
  if (list.num_params > 1) return;
  slots.order.clear();
  slots.num_free = 0;
}

void move_param(TEVPF_LIST& list, std::int32_t from, std::int32_t to) noexcept {
  list.slots.order.move(from, to);
  list.slots.reads = 0;
}

void release_params(TEVPF_LIST& list) noexcept {
  for_each_slot(list,
                [&](std::int32_t slot) { release_texts(param_in(list, slot).def, list.texts); });
  adopt_params(list, nullptr, 0);
}

void adopt_params(TEVPF_LIST& list, Owned<TEVPF_PARAM> params, std::int32_t room) noexcept {
  heap_free(list.param_ptr);
  list.slots.order.clear();
  list.param_ptr = params.release();
  list.slots = {};
  list.slots.room = room;
}

// Reading records out of slot order causes cache misses, so later ones are prefetched while one is
// copied.
void copy_params_to(const TEVPF_LIST& list, TEVPF_PARAM* out) noexcept {
  constexpr std::int32_t kAhead = 8;
  list.slots.order.for_each_chunk(list.num_params, [&](const SequenceChunk& chunk) {
    if (chunk.items == nullptr) {
      std::memcpy(out, &param_in(list, chunk.first),
                  static_cast<std::size_t>(chunk.count) * sizeof *out);
    } else {
      for (std::int32_t i = 0; i < chunk.count; ++i) {
        const TEVPF_PARAM* const later =
            &param_in(list, chunk[std::min(i + kAhead, chunk.count - 1)]);
        __builtin_prefetch(later);
        __builtin_prefetch(reinterpret_cast<const char*>(later + 1) - 1);
        out[i] = param_in(list, chunk[i]);
      }
    }
    out += chunk.count;
  });
}

}  // namespace tevpf
