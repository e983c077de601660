// The third state of a sequence (see core/sequence): its items in small blocks, the blocks in
// groups. An insertion moves part of one block, adds one to the starts of the later blocks of its
// group and one to the starts of the later groups; a position is found by two short searches of
// these starts.
#pragma once

#include <cstdint>
#include <limits>

#include "core/sequence/pool.h"

namespace tevpf {

#ifdef TEVPF_TEST_HOOKS
inline constexpr std::int32_t kBlockRoom = 4;  // small sequences too have many blocks and groups
inline constexpr std::int32_t kGroupRoom = 4;
#else
inline constexpr std::int32_t kBlockRoom = 128;
inline constexpr std::int32_t kGroupRoom = 64;
#endif

// Some consecutive entries of a sequence.
struct SequenceChunk {
  const std::int32_t* items;  // null: a run, the items first, first + 1, first + 2 ...
  std::int32_t first;
  std::int32_t count;

  std::int32_t operator[](std::int32_t offset) const noexcept {
    return items != nullptr ? items[offset] : first + offset;
  }
};

void copy_chunk(const SequenceChunk& chunk, std::int32_t* out) noexcept;
// The offset of an item in a chunk, or -1.
std::int32_t offset_in(const SequenceChunk& chunk, std::int32_t item) noexcept;

// Where an item stands or where one can be inserted; valid until the next change.
struct SequencePlace {
  std::int32_t position;
  std::int32_t group = -1;  // its number; -1: only the position is known
  std::int32_t block = 0;   // within the group
  std::int32_t offset = 0;  // within the block
};

// The number of leading places 0 .. length - 1 for which is_less holds; behind the first for which
// it does not, it must hold for none. Each step makes three probes whose cache misses overlap and
// quarters what is left; no branch depends on an answer.
template <class IsLess>
[[gnu::always_inline]] inline std::int32_t count_less(std::int32_t length,
                                                      IsLess is_less) noexcept {
  std::int32_t first = 0;  // the answer is one of `length` places from there on, or behind them
  const auto less = [&](std::int32_t place) {
    return static_cast<std::int32_t>(is_less(first + place - 1));
  };
  while (length >= 4) {
    const std::int32_t quarter = length / 4;
    first += quarter * (less(quarter) + less(2 * quarter) + less(3 * quarter));
    length -= 3 * quarter;
  }
  std::int32_t behind = 0;
  for (std::int32_t place = 1; place <= length; ++place) behind += less(place);
  return first + behind;
}

// A block's items lie in a piece of its own (`own`), or where they were when the blocks were made:
// in the flat array, or, as a run, nowhere (items null; they follow from the last one). Only own
// pieces are written to.
struct SequenceBlock {
  std::int32_t* items;
  void* keys;         // one for each item, in a piece of their own or in an adopted array; null:
                      // not gathered
  bool own;           // whether `items` is a piece
  bool own_keys;      // whether `keys` is one
  std::int32_t heat;  // searches that missed keys
};

// Invariants: a group has 1 to kGroupRoom blocks. start[b] is the number of the group's items in
// front of block b, start[count] that of all of them; entries beyond are kNoStart. A block holds 1
// to kBlockRoom items, except that a sequence without items keeps one empty block.
struct SequenceGroup {
  static constexpr std::int16_t kNoStart = std::numeric_limits<std::int16_t>::max();
  static_assert(kBlockRoom * kGroupRoom < kNoStart);

  std::int32_t number;  // its index in SequenceBlocks::groups
  std::int32_t count;   // of its blocks
  std::int16_t start[kGroupRoom + 1];
  bool has_last_keys;             // whether last_key holds the key of each block's last item
  std::int32_t heat;              // searches that missed them
  std::int32_t last[kGroupRoom];  // each block's last item
  std::int32_t id[kGroupRoom];    // each block's, which never changes
  SequenceBlock block[kGroupRoom];
  std::uint64_t last_key[kGroupRoom];  // in the first key_size bytes of each

  std::int32_t items() const noexcept { return start[count]; }
  std::int32_t items_of(std::int32_t b) const noexcept { return start[b + 1] - start[b]; }
  SequenceChunk chunk(std::int32_t b) const noexcept {
    const std::int32_t size = items_of(b);
    return {block[b].items, last[b] - size + 1, size};
  }
};

// Invariants: groups[g]->number == g; starts[g] is the number of items in front of group g, and
// `count` that of all. homes[id].group is the group of the block with that id; unused ids are
// chained from free_id on, -1 at the end. `borrowed` counts the blocks that lie in `flat`, which is
// released with the last of them; borrowed_keys counts those whose keys lie in flat_keys. If there
// is a map, it covers every item held: map[item] is the id of the item's block, or -1 for items
// that are not held. Gathered keys equal those of the items. With has_top_keys, top_keys[g] holds
// the key of the last item of group g, in its first key_size bytes.
// The keys, the map and the hint only save time: each may be missing, and is dropped where memory
// is short.
struct SequenceBlocks {
  union Home {
    SequenceGroup* group;
    std::int32_t next_free;
  };
  // The block that was read last.
  struct Hint {
    std::int32_t start;
    SequenceChunk chunk;  // count 0: none
    SequenceGroup* group;
    std::int32_t block;
  };

  std::int32_t count;
  std::int32_t num_groups;
  std::int32_t group_room;  // entries allocated for groups and starts
  std::int32_t num_ids;     // ids given out so far, including unused ones
  std::int32_t id_room;
  std::int32_t free_id;
  SequenceGroup** groups;
  std::int32_t* starts;
  std::uint64_t* top_keys;
  bool has_top_keys;
  Home* homes;
  Hint hint;

  std::int32_t* flat;
  std::int32_t borrowed;
  std::int32_t map_room;
  std::int32_t* map;
  std::int64_t effort;  // items scanned for want of a map
  Pool item_pieces, group_pieces, key_pieces;
  std::int32_t key_size;  // bytes; 0: no block has keys
  std::int32_t borrowed_keys;
  void* flat_keys;

  // Blocks over a flat array, which they take over, or over the items 0 .. count - 1 where it is
  // null. O(count / kBlockRoom). Null when memory runs out.
  static SequenceBlocks* make(std::int32_t* flat, std::int32_t count) noexcept;
  static void release(SequenceBlocks* blocks) noexcept;

  // Allocates what one erasure and one insertion, of `item`, can need; false when memory runs out.
  [[nodiscard]] bool reserve(std::int32_t item) noexcept;

  // The place of a position, 0 .. count.
  SequencePlace locate(std::int32_t position) const noexcept;
  // The place of an item; position -1 when it is not there.
  SequencePlace find(std::int32_t item) noexcept;

  // To be called after reserve. `key`: the item's key, of key_size bytes, or null.
  void insert(SequencePlace place, std::int32_t item, const void* key) noexcept;
  void erase(SequencePlace place) noexcept;

  std::int32_t read(std::int32_t position) noexcept {
    const auto offset =
        static_cast<std::uint32_t>(position) - static_cast<std::uint32_t>(hint.start);
    if (offset >= static_cast<std::uint32_t>(hint.chunk.count)) return read_elsewhere(position);
    return hint.chunk[static_cast<std::int32_t>(offset)];
  }
  std::int32_t read(const SequencePlace& place) noexcept;
  std::int32_t read_elsewhere(std::int32_t position) noexcept;
  void forget_hint() noexcept { hint.chunk.count = 0; }

  // ---- Keys -------------------------------------------------------------------------------------

  // Sets key_size; drops all keys if it changes.
  void expect_keys(std::int32_t size) noexcept {
    if (key_size != size) change_key_size(size);
  }
  void change_key_size(std::int32_t size) noexcept;
  // Gives a block a piece for its keys, to be filled by the caller; null when memory runs out.
  void* make_keys(SequenceGroup& group, std::int32_t b) noexcept;
  // Takes over an array of the keys of all items, to be called before the first change.
  void adopt_keys(void* keys, std::int32_t size) noexcept;
  void drop_keys(SequenceGroup& group, std::int32_t b) noexcept;
  void drop_all_keys() noexcept;
  // Replaces the key of the item at a place, where it has been gathered.
  void set_key(SequencePlace place, const void* key) noexcept;

 private:
  void append_group(std::int32_t all) noexcept;
  bool reserve_groups(std::int32_t more) noexcept;
  bool reserve_ids(std::int32_t more) noexcept;
  std::int32_t new_id(SequenceGroup& group) noexcept;
  void release_id(std::int32_t id) noexcept;

  SequencePlace at_end_of_previous(const SequencePlace& place) const noexcept;
  void count_items(const SequencePlace& place, std::int32_t change) noexcept;
  void give_own_piece(SequenceBlock& block, const SequenceChunk& chunk) noexcept;
  void release_items(const SequenceBlock& block) noexcept;
  SequencePlace split(SequencePlace place) noexcept;
  SequencePlace split_group(const SequencePlace& place) noexcept;
  void append_blocks(SequenceGroup& to, const SequenceGroup& from, std::int32_t first) noexcept;
  SequenceGroup& add_group(std::int32_t g) noexcept;
  void number_groups(std::int32_t first) noexcept;
  void shrink(SequenceGroup& group, std::int32_t b) noexcept;
  void join(SequenceGroup& group, std::int32_t b) noexcept;
  void drop_block(SequenceGroup& group, std::int32_t b) noexcept;
  void shrink_group(std::int32_t g) noexcept;
  void drop_group(std::int32_t g) noexcept;

  // In sequence_map.cpp.
  void reserve_map(std::int32_t item) noexcept;
  void make_map() noexcept;
  void remember(const SequenceChunk& chunk, std::int32_t id) noexcept;
  SequencePlace place_in(const SequenceGroup& group, std::int32_t b,
                         std::int32_t offset) const noexcept;
  SequencePlace look_in_order(std::int32_t item) const noexcept;
  SequencePlace look_everywhere(std::int32_t item) noexcept;

  // In sequence_keys.cpp; the last four are called before the change to the items.
  void* take_keys() noexcept;
  void release_keys(SequenceBlock& block) noexcept;
  void give_own_keys(SequenceGroup& group, std::int32_t b) noexcept;
  unsigned char* key_bytes(const SequenceBlock& block, std::int32_t offset) const noexcept;
  void set_last_key(SequenceGroup& group, std::int32_t b, const void* key) noexcept;
  void insert_key(SequenceGroup& group, const SequencePlace& place, const void* key) noexcept;
  void erase_key(SequenceGroup& group, const SequencePlace& place) noexcept;
  void split_keys(SequenceGroup& group, std::int32_t b, std::int32_t kept) noexcept;
  void join_keys(SequenceGroup& group, std::int32_t b) noexcept;
};

}  // namespace tevpf
