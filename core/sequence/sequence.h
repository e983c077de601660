// An ordered sequence of items: the rows of a table as stored, a column's index, the parameters of
// a list, their name index. Items are distinct numbers of slots, 0 .. 2^31 - 2. A slot stays where
// it is, so inserting or erasing an item renumbers nothing.
//
// A sequence is in one of three states:
//   identity  item = position; no memory. Most sequences are never changed in the middle.
//   flat      one array with room for more, as a file brings it.
//   blocks    small blocks of items (core/sequence_blocks), for a large sequence that was changed
//             in the middle: a change costs about the same at any size. Entering this state copies
//             nothing; a block is copied when it is first changed.
#pragma once

#include <cstdint>

#include "core/base/heap.h"
#include "core/sequence/sequence_blocks.h"

namespace tevpf {

// A change that moves no more items than this within an array does so.
#ifdef TEVPF_TEST_HOOKS
inline constexpr std::int32_t kFlatReach = 5;
#else
inline constexpr std::int32_t kFlatReach = 512;
#endif

// A plain record; all zero it is an identity. Copying the record does not copy the contents; its
// owner calls clear at the end.
//
// Invariants: at most one of items and blocks is set. `items` is a block of the C runtime with
// `room` entries, the first `count` of which are the sequence; they may be changed from outside. In
// these two states `count` is the caller's number, which every function is given. In blocks it is
// theirs, and the caller's must equal it.
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

  // The item at a place. Makes the next reads of positions around it cheap.
  std::int32_t at(const SequencePlace& place) const noexcept {
    if (place.group < 0) return at(place.position);
    return blocks->read(place);
  }

  // The longest chunk that starts at a position, 0 .. count - 1. Valid until the next change.
  SequenceChunk chunk_at(std::int32_t count, std::int32_t position) const noexcept;

  // Calls visit(chunk) for chunks that make up the whole, in order.
  template <class Visit>
  void for_each_chunk(std::int32_t count, Visit visit) const {
    for (std::int32_t position = 0; position < count;) {
      const SequenceChunk chunk = chunk_at(count, position);
      visit(chunk);
      position += chunk.count;
    }
  }

  // Writes all items to an array of `count` entries.
  void copy_items(std::int32_t count, std::int32_t* out) const noexcept;

  // The place of a position, 0 .. count.
  SequencePlace place_at(std::int32_t position) const noexcept {
    return blocks == nullptr ? SequencePlace{position} : blocks->locate(position);
  }

  // The place of an item, at position -1 if it is not in the sequence. In blocks, an item that does
  // not stand in ascending order with the others takes a scan at first; once scans have cost as
  // much as a map from items to blocks, there is one, and calls are O(1).
  SequencePlace place_of(std::int32_t count, std::int32_t item) const noexcept;
  std::int32_t position_of(std::int32_t count, std::int32_t item) const noexcept {
    return place_of(count, item).position;
  }
  // To be called before items of a large sequence are found again and again: an array, which has to
  // be scanned, becomes blocks if memory allows.
  void expect_finding(std::int32_t count) noexcept {
    if (items != nullptr && count > kFlatReach) (void)become_blocks(count);
  }

  // ---- Changes ----------------------------------------------------------------------------------
  // Each make_ready allocates whatever the change that it names can need and picks the state for
  // it. The items are the same afterwards and places stay valid. False: out of memory.

  [[nodiscard]] bool make_ready_to_insert(std::int32_t count, std::int32_t position,
                                          std::int32_t item) noexcept;
  [[nodiscard]] bool make_ready_to_erase(std::int32_t count, std::int32_t position) noexcept;
  // Erasing the item at `from`, then inserting it at `to`, a position among the others.
  [[nodiscard]] bool make_ready_to_move(std::int32_t count, std::int32_t from,
                                        std::int32_t to) noexcept;

  // Cannot fail after make_ready. `count` is that before the change. `key`: see
  // core/sequence_search.
  void insert(std::int32_t count, SequencePlace place, std::int32_t item,
              const void* key = nullptr) noexcept;
  void erase(std::int32_t count, SequencePlace place) noexcept;
  void move(std::int32_t from, std::int32_t to, const void* key = nullptr) noexcept;

  // ---- The whole --------------------------------------------------------------------------------

  // Makes it flat, with room for at least `new_room` items (count or more). False: out of memory,
  // and nothing has changed.
  [[nodiscard]] bool flatten(std::int32_t count, std::int32_t new_room) noexcept;
  // adopt takes over an array in place of the contents; hand_over gives up the array of a flat
  // sequence.
  void adopt(Owned<std::int32_t> array, std::int32_t array_room) noexcept;
  [[nodiscard]] Owned<std::int32_t> hand_over() noexcept;
  // Makes `out`, which has no contents, an identity or a flat copy without spare room.
  [[nodiscard]] bool copy_to(std::int32_t count, Sequence& out) const noexcept;
  // Releases the contents; what remains is an identity.
  void clear() noexcept;

 private:
  bool become_blocks(std::int32_t count) noexcept;
  bool reserve_room(std::int32_t count, std::int64_t needed) noexcept;
};

}  // namespace tevpf
