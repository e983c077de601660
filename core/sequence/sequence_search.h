// Searching a sequence whose items are ordered by values that only the caller knows.
//
// Reaching a value through its item is a cache miss in a large table. A sequence in blocks can
// therefore carry a key of 2, 4 or 8 bytes beside each item, the value itself or its beginning, so
// that most probes stay within a few cache lines: a search and an insertion among a million rows
// then take a third of the time. A block gathers its keys once a few searches have ended in it.
//
// Whoever searches with keys passes them to insert and move, and reports values that change in
// place (SequenceBlocks::set_key, drop_all_keys); the key of an item inserted without one is read
// again.
#pragma once

#include <cstdint>
#include <cstring>
#include <utility>

#include "core/sequence/sequence.h"

namespace tevpf {

#ifdef TEVPF_TEST_HOOKS
inline constexpr std::int32_t kSearchesPerGathering = 2;
#else
// Gathering the keys of a block costs about as much as this many searches without them.
inline constexpr std::int32_t kSearchesPerGathering = 4;
#endif

// Probes that reach values through the items.
template <class Less>
struct ItemProbes {
  Less less;

  void get_ready(SequenceBlocks&) const noexcept {}
  bool is_group_less(const SequenceBlocks& blocks, std::int32_t g) const noexcept {
    const SequenceGroup& group = *blocks.groups[g];
    return less(group.last[group.count - 1]);
  }
  void get_ready(SequenceGroup&) const noexcept {}
  bool is_last_less(const SequenceGroup& group, std::int32_t b) const noexcept {
    return less(group.last[b]);
  }
  std::int32_t count_less_in(SequenceBlocks&, SequenceGroup& group, std::int32_t b,
                             std::int32_t count) const noexcept {
    SequenceChunk chunk = group.chunk(b);
    chunk.count = count;
    return count_less_in(chunk);
  }
  std::int32_t count_less_in(const SequenceChunk& chunk) const noexcept {
    if (chunk.items == nullptr) {
      return count_less(chunk.count, [&](std::int32_t i) { return less(chunk.first + i); });
    }
    return count_less(chunk.count, [&](std::int32_t i) { return less(chunk.items[i]); });
  }
};

// Requests all cache lines of an array at once; null: none.
template <class T>
void prefetch(const T* array, std::int32_t count) noexcept {
  if (array == nullptr) return;
  constexpr std::int32_t kPerLine = 64 / sizeof(T);
  for (std::int32_t i = 0; i < count; i += kPerLine) __builtin_prefetch(array + i);
}

// The parts of a block that a search without keys tells apart in its first step.
#ifdef TEVPF_TEST_HOOKS
inline constexpr std::int32_t kFirstStepParts = 2;
#else
inline constexpr std::int32_t kFirstStepParts = 8;
#endif

// count_less for what lies far apart in memory: the first step is wider, since its cache misses
// overlap.
template <class IsLess>
std::int32_t count_less_far(std::int32_t length, IsLess is_less) noexcept {
  const std::int32_t part = length / kFirstStepParts;
  std::int32_t first = 0;
  for (std::int32_t probe = 1; part > 0 && probe < kFirstStepParts; ++probe) {
    first += part * static_cast<std::int32_t>(is_less(probe * part - 1));
  }
  const std::int32_t rest = length - (kFirstStepParts - 1) * part;
  return first + count_less(rest, [&](std::int32_t i) { return is_less(first + i); });
}

// The keys of a block; null if they are not gathered.
template <class KeyOf>
auto keys_of_block(SequenceBlocks& blocks, SequenceGroup& group, std::int32_t b,
                   KeyOf key_of) noexcept -> const decltype(key_of(b))* {
  using Key = decltype(key_of(b));
  SequenceBlock& block = group.block[b];
  if (block.keys != nullptr) return static_cast<const Key*>(block.keys);
  if (++block.heat < kSearchesPerGathering) return nullptr;
  block.heat = 0;
  auto* const keys = static_cast<Key*>(blocks.make_keys(group, b));
  if (keys == nullptr) return nullptr;
  const SequenceChunk chunk = group.chunk(b);
  for (std::int32_t i = 0; i < chunk.count; ++i) keys[i] = key_of(chunk[i]);
  return keys;
}

// Probes that read keys where they have been gathered.
template <class KeyOf, class Less>
struct KeyProbes {
  using Key = decltype(std::declval<KeyOf>()(std::int32_t{}));

  KeyOf key_of;
  Less less;

  bool is_item_less(std::int32_t item) const noexcept { return less(key_of(item), item); }

  static Key load(const std::uint64_t& from) noexcept {
    Key key;
    std::memcpy(&key, &from, sizeof key);
    return key;
  }
  static void store(std::uint64_t& to, Key key) noexcept { std::memcpy(&to, &key, sizeof key); }

  void get_ready(SequenceBlocks& blocks) const noexcept {
    if (blocks.has_top_keys) return;
    for (std::int32_t g = 0; g < blocks.num_groups; ++g) {
      const SequenceGroup& group = *blocks.groups[g];
      const std::int32_t b = group.count - 1;
      store(blocks.top_keys[g],
            group.has_last_keys ? load(group.last_key[b]) : key_of(group.last[b]));
    }
    blocks.has_top_keys = true;
  }
  bool is_group_less(const SequenceBlocks& blocks, std::int32_t g) const noexcept {
    const SequenceGroup& group = *blocks.groups[g];
    return less(load(blocks.top_keys[g]), group.last[group.count - 1]);
  }

  void get_ready(SequenceGroup& group) const noexcept {
    prefetch(group.last_key, kGroupRoom);
    if (group.has_last_keys) return;
    for (std::int32_t b = 0; b < group.count; ++b) {
      store(group.last_key[b], key_of(group.last[b]));
    }
    group.has_last_keys = true;
  }
  bool is_last_less(const SequenceGroup& group, std::int32_t b) const noexcept {
    return less(load(group.last_key[b]), group.last[b]);
  }

  std::int32_t count_less_in(SequenceBlocks& blocks, SequenceGroup& group, std::int32_t b,
                             std::int32_t count) const noexcept {
    const SequenceChunk chunk = group.chunk(b);
    const Key* const keys = keys_of_block(blocks, group, b, key_of);
    prefetch(chunk.items, chunk.count);  // whoever searches will read or insert an item
    if (keys == nullptr) {
      return count_less_far(count, [&](std::int32_t i) { return is_item_less(chunk[i]); });
    }
    prefetch(keys, chunk.count);
    return count_less(count, [&](std::int32_t i) { return less(keys[i], chunk[i]); });
  }
  std::int32_t count_less_in(const SequenceChunk& chunk) const noexcept {
    return count_less(chunk.count, [&](std::int32_t i) { return is_item_less(chunk[i]); });
  }
};

// Requests the cache lines that search_keys will read, as far as keys have been gathered. Whoever is
// going to search several sequences takes each step for all of them before the next one, so that
// their cache misses overlap. is_less(key) as in search_keys, without the item.
class SearchAhead {
 public:
  template <class Key, class IsLess>
  void fetch_group(const SequenceBlocks& blocks, IsLess is_less) noexcept {
    group_ = nullptr;
    if (!blocks.has_top_keys || blocks.key_size != std::int32_t{sizeof(Key)}) return;
    group_ = blocks.groups[count_in<Key>(blocks.top_keys, blocks.num_groups - 1, is_less)];
    __builtin_prefetch(group_);
    prefetch(group_->last_key, kGroupRoom);
  }
  template <class Key, class IsLess>
  void fetch_block(IsLess is_less) noexcept {
    if (group_ != nullptr && !group_->has_last_keys) group_ = nullptr;
    if (group_ == nullptr) return;
    block_ = &group_->block[count_in<Key>(group_->last_key, group_->count - 1, is_less)];
    __builtin_prefetch(block_);
    prefetch(group_->start, kGroupRoom + 1);  // for the insertion
  }
  template <class Key>
  void fetch_keys() const noexcept {
    if (group_ == nullptr) return;
    prefetch(static_cast<const Key*>(block_->keys), kBlockRoom);
    prefetch(block_->items, kBlockRoom);
  }

 private:
  template <class Key, class IsLess>
  static std::int32_t count_in(const std::uint64_t* keys, std::int32_t count,
                               IsLess is_less) noexcept {
    return count_less(count, [&](std::int32_t i) {
      Key key;
      std::memcpy(&key, keys + i, sizeof key);
      return is_less(key);
    });
  }

  const SequenceGroup* group_ = nullptr;
  const SequenceBlock* block_ = nullptr;
};

template <class Probes>
SequencePlace search_sequence(const Sequence& sequence, std::int32_t count,
                              const Probes& probes) noexcept {
  if (count <= 0) return sequence.place_at(0);
  if (sequence.blocks == nullptr) return {probes.count_less_in(sequence.chunk_at(count, 0))};
  SequenceBlocks& blocks = *sequence.blocks;
  // The last group, the last block and the last item of a block are not compared: what is not in
  // front of them is there. So a search ends at an item, or at the end of all, whatever `less` says.
  probes.get_ready(blocks);
  const std::int32_t g = count_less(
      blocks.num_groups - 1, [&](std::int32_t i) { return probes.is_group_less(blocks, i); });
  SequenceGroup& group = *blocks.groups[g];
  probes.get_ready(group);
  const std::int32_t b =
      count_less(group.count - 1, [&](std::int32_t i) { return probes.is_last_less(group, i); });
  const bool is_last = g == blocks.num_groups - 1 && b == group.count - 1;
  const std::int32_t compared = group.items_of(b) - (is_last ? 0 : 1);
  const std::int32_t offset = probes.count_less_in(blocks, group, b, compared);
  return {blocks.starts[g] + group.start[b] + offset, g, b, offset};
}

// The place of the first item for which less(item) is false, or of the end. If less is true for an
// item behind that one, any item may be found, or the end.
template <class Less>
SequencePlace search_items(const Sequence& sequence, std::int32_t count, Less less) noexcept {
  return search_sequence(sequence, count, ItemProbes<Less>{less});
}

// The same with less(key, item), where key_of(item) reads an item's key. Outside blocks there are
// no stored keys, and key_of is called at each probe.
template <class KeyOf, class Less>
SequencePlace search_keys(const Sequence& sequence, std::int32_t count, KeyOf key_of,
                          Less less) noexcept {
  using Probes = KeyProbes<KeyOf, Less>;
  if (sequence.blocks != nullptr) sequence.blocks->expect_keys(sizeof(typename Probes::Key));
  return search_sequence(sequence, count, Probes{key_of, less});
}

// The key of the item at a place where a search has ended; not the end of the sequence.
template <class KeyOf>
auto key_at(const Sequence& sequence, const SequencePlace& place, KeyOf key_of) noexcept {
  using Key = decltype(key_of(place.position));
  if (sequence.blocks != nullptr && sequence.blocks->key_size == std::int32_t{sizeof(Key)}) {
    const SequenceBlock& block = sequence.blocks->groups[place.group]->block[place.block];
    if (block.keys != nullptr) return static_cast<const Key*>(block.keys)[place.offset];
  }
  return key_of(sequence.at(place));
}

// The key of the item at a position, for searches with probes of their own.
template <class KeyOf>
auto key_at(const Sequence& sequence, std::int32_t position, KeyOf key_of) noexcept {
  using Key = decltype(key_of(position));
  const std::int32_t item = sequence.at(position);
  if (sequence.blocks == nullptr) return key_of(item);
  SequenceBlocks& blocks = *sequence.blocks;
  blocks.expect_keys(sizeof(Key));
  const SequenceBlocks::Hint& hint = blocks.hint;  // at() has just set it
  const Key* const keys = keys_of_block(blocks, *hint.group, hint.block, key_of);
  return keys == nullptr ? key_of(item) : keys[position - hint.start];
}

}  // namespace tevpf
