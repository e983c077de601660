// An order of items: the rows of a table as they are stored, a column's index, the parameters of a
// list, their name index. Items are distinct numbers 0 .. 2^31 - 2 of slots that stay where they
// are, so that an insertion or removal renumbers nothing.
//
// A sequence is in one of three states.
//   identity  item = position; needs no memory. Most are never changed in the middle.
//   flat      one array with room for more: what a file brings.
//   blocks    a large one that was changed in the middle: small blocks (core/sequence_blocks), in
//             which a change costs the same at any size. Leaving the other states for this one
//             costs a copy of nothing: a block gets memory of its own when it is first changed.
#pragma once

#include <cstdint>

#include "core/heap.h"
#include "core/sequence_blocks.h"

namespace tevpf {

#ifdef TEVPF_TEST_HOOKS
inline constexpr std::int32_t kFlatReach = 5;
#else
// A change in an array that moves no more items than this is left to memmove.
inline constexpr std::int32_t kFlatReach = 512;
#endif

// A plain record, all zero: the identity. Copying it copies no contents; whoever holds it calls
// clear at the end.
//
// Invariants: items and blocks are never both set. items: the array, a block of the C runtime, of
// which the first `count` entries count and `room` exist. blocks: all there is. `count` is the
// caller's number in the first two states, and passed by it; in blocks it is theirs, and the same.
struct Sequence {
  std::int32_t* items;
  SequenceBlocks* blocks;
  std::int32_t room;

  bool is_identity() const noexcept { return items == nullptr && blocks == nullptr; }

  // ---- Reading ----------------------------------------------------------------------------------

  // The item at a position, 0 .. count - 1.
  std::int32_t at(std::int32_t position) const noexcept {
    if (items != nullptr) return items[position];
    return blocks == nullptr ? position : blocks->read(position);
  }

  // The items from a position on that lie one behind the other, at least one: for walks, and for
  // copies of the whole. Valid until the next change.
  SequenceChunk chunk_at(std::int32_t count, std::int32_t position) const noexcept;

  // Calls visit(chunk) for all of them in order.
  template <class Visit>
  void for_each_chunk(std::int32_t count, Visit visit) const {
    for (std::int32_t position = 0; position < count;) {
      const SequenceChunk chunk = chunk_at(count, position);
      visit(chunk);
      position += chunk.count;
    }
  }

  // Writes all items, one behind the other.
  void copy_items(std::int32_t count, std::int32_t* out) const noexcept;

  // The place of a position, 0 .. count.
  SequencePlace place_at(std::int32_t position) const noexcept {
    return blocks == nullptr ? SequencePlace{position} : blocks->locate(position);
  }

  // The place of an item; position -1 when it is not there. In blocks O(1), once calls have paid
  // for the map that it takes.
  SequencePlace place_of(std::int32_t count, std::int32_t item) const noexcept;
  std::int32_t position_of(std::int32_t count, std::int32_t item) const noexcept {
    return place_of(count, item).position;
  }

  // ---- Changes ----------------------------------------------------------------------------------
  // Each make_ready gets everything that the one change it names can need, and chooses the state for
  // it; the sequence says the same before and after, and places stay valid. False: no memory.

  [[nodiscard]] bool make_ready_to_insert(std::int32_t count, std::int32_t position,
                                          std::int32_t item) noexcept;
  [[nodiscard]] bool make_ready_to_erase(std::int32_t count, std::int32_t position) noexcept;
  // An erasure at `from`, then an insertion of the same item at `to` in what is left.
  [[nodiscard]] bool make_ready_to_move(std::int32_t count, std::int32_t from,
                                        std::int32_t to) noexcept;

  // Cannot fail. `count` is the one before the change. `key`: see core/sequence_search.
  void insert(std::int32_t count, SequencePlace place, std::int32_t item,
              const void* key = nullptr) noexcept;
  void erase(std::int32_t count, SequencePlace place) noexcept;
  void move(std::int32_t from, std::int32_t to, const void* key = nullptr) noexcept;

  // ---- The whole --------------------------------------------------------------------------------

  // Makes it one array with room for `new_room` items, at least count; O(count) unless it is one.
  [[nodiscard]] bool flatten(std::int32_t count, std::int32_t new_room) noexcept;
  // Takes over an array in place of what there is; hands out the array of a flat one.
  void adopt(Owned<std::int32_t> array, std::int32_t array_room) noexcept;
  [[nodiscard]] Owned<std::int32_t> hand_over() noexcept;
  // A copy, for `out` without contents: an identity, or an array with room for just these items.
  [[nodiscard]] bool copy_to(std::int32_t count, Sequence& out) const noexcept;
  // Releases everything: the identity again.
  void clear() noexcept;

 private:
  bool become_blocks(std::int32_t count) noexcept;
  bool reserve_room(std::int32_t count, std::int64_t needed) noexcept;
};

}  // namespace tevpf
