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

  bool is_last_less(const SequenceGroup& group, std::int32_t b) const noexcept {
    return less(group.last[b]);
  }
  void get_ready(SequenceGroup&) const noexcept {}
  std::int32_t count_less_in(SequenceBlocks&, SequenceGroup& group, std::int32_t b) const noexcept {
    return count_less_in(group.chunk(b));
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

  bool is_last_less(const SequenceGroup& group, std::int32_t b) const noexcept {
    if (!group.has_last_keys) return is_item_less(group.last[b]);
    Key key;
    std::memcpy(&key, &group.last_key[b], sizeof key);
    return less(key, group.last[b]);
  }

  void get_ready(SequenceGroup& group) const noexcept {
    if (group.has_last_keys || ++group.heat < kSearchesPerGathering) return;
    for (std::int32_t b = 0; b < group.count; ++b) {
      const Key key = key_of(group.last[b]);
      std::memcpy(&group.last_key[b], &key, sizeof key);
    }
    group.has_last_keys = true;
  }

  std::int32_t count_less_in(SequenceBlocks& blocks, SequenceGroup& group,
                             std::int32_t b) const noexcept {
    const SequenceChunk chunk = group.chunk(b);
    const Key* const keys = keys_of_block(blocks, group, b, key_of);
    if (keys == nullptr) return count_less_in(chunk);
    prefetch(chunk.items, chunk.count);  // whoever searches will read or insert an item
    prefetch(keys, chunk.count);
    return count_less(chunk.count, [&](std::int32_t i) { return less(keys[i], chunk[i]); });
  }
  std::int32_t count_less_in(const SequenceChunk& chunk) const noexcept {
    return count_less(chunk.count, [&](std::int32_t i) { return is_item_less(chunk[i]); });
  }
};

template <class Probes>
SequencePlace search_sequence(const Sequence& sequence, std::int32_t count,
                              const Probes& probes) noexcept {
  if (count <= 0) return sequence.place_at(0);
  if (sequence.blocks == nullptr) return {probes.count_less_in(sequence.chunk_at(count, 0))};
  SequenceBlocks& blocks = *sequence.blocks;
  // The last group, and the last block, are not compared: what is not in an earlier one is there.
  const std::int32_t g = count_less(blocks.num_groups - 1, [&](std::int32_t i) {
    const SequenceGroup& some = *blocks.groups[i];
    return probes.is_last_less(some, some.count - 1);
  });
  SequenceGroup& group = *blocks.groups[g];
  probes.get_ready(group);
  const std::int32_t b =
      count_less(group.count - 1, [&](std::int32_t i) { return probes.is_last_less(group, i); });
  const std::int32_t offset = probes.count_less_in(blocks, group, b);
  return {blocks.starts[g] + group.start[b] + offset, g, b, offset};
}

// The place of the first item for which less(item) is false, or of the end. less must be false for
// all items behind that one.
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
