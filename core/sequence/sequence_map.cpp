// Finding an item in the blocks of a sequence: a map from items to blocks, and linear scans.
#include <algorithm>

#include "core/base/heap.h"
#include "core/sequence/sequence_blocks.h"

namespace tevpf {
namespace {

// Making an entry of the map costs about as much as scanning this many items.
#ifdef TEVPF_TEST_HOOKS
constexpr std::int64_t kItemsPerEntry = 1;
#else
constexpr std::int64_t kItemsPerEntry = 16;
#endif

// Looking at a run costs a cache miss or two, as scanning some items does.
constexpr std::int32_t kItemsPerRun = 64;

constexpr std::int32_t kNoBlock = -1;

template <class Visit>
void for_each_block(const SequenceBlocks& blocks, Visit visit) noexcept {
  for (std::int32_t g = 0; g < blocks.num_groups; ++g) {
    for (std::int32_t b = 0; b < blocks.groups[g]->count; ++b) visit(*blocks.groups[g], b);
  }
}

std::int32_t block_of_id(const SequenceGroup& group, std::int32_t id) noexcept {
  std::int32_t found = 0;
  for (std::int32_t b = 0; b < group.count; ++b) found |= group.id[b] == id ? b : 0;
  return found;
}

}  // namespace

std::int32_t offset_in(const SequenceChunk& chunk, std::int32_t item) noexcept {
  if (chunk.items == nullptr) {
    const std::int64_t offset = std::int64_t{item} - chunk.first;
    return offset >= 0 && offset < chunk.count ? static_cast<std::int32_t>(offset) : -1;
  }
  constexpr std::int32_t kStep = 32;  // the compiler vectorises the inner loop
  std::int32_t at = 0;
  for (; chunk.count - at >= kStep; at += kStep) {
    std::uint32_t found = 0;
    for (std::int32_t i = 0; i < kStep; ++i) found |= chunk.items[at + i] == item ? 1u : 0u;
    if (found != 0) break;
  }
  for (; at < chunk.count; ++at) {
    if (chunk.items[at] == item) return at;
  }
  return -1;
}

SequencePlace SequenceBlocks::find(std::int32_t item) noexcept {
  if (map == nullptr && effort >= kItemsPerEntry * count) make_map();
  if (map == nullptr) {
    const SequencePlace place = look_in_order(item);
    return place.position >= 0 ? place : look_everywhere(item);
  }
  const std::int32_t id = item >= 0 && item < map_room ? map[item] : kNoBlock;
  if (id == kNoBlock) return {-1};
  const SequenceGroup& group = *homes[id].group;
  const std::int32_t b = block_of_id(group, id);
  return place_in(group, b, offset_in(group.chunk(b), item));
}

SequencePlace SequenceBlocks::place_in(const SequenceGroup& group, std::int32_t b,
                                       std::int32_t offset) const noexcept {
  return {starts[group.number] + group.start[b] + offset, group.number, b, offset};
}

// Where most items ascend, as where few have been moved since they were an identity, this finds
// nearly all of them.
SequencePlace SequenceBlocks::look_in_order(std::int32_t item) const noexcept {
  const std::int32_t g = count_less(
      num_groups - 1, [&](std::int32_t i) { return groups[i]->last[groups[i]->count - 1] < item; });
  const SequenceGroup& group = *groups[g];
  const std::int32_t b =
      count_less(group.count - 1, [&](std::int32_t i) { return group.last[i] < item; });
  const std::int32_t offset = offset_in(group.chunk(b), item);
  return offset < 0 ? SequencePlace{-1} : place_in(group, b, offset);
}

SequencePlace SequenceBlocks::look_everywhere(std::int32_t item) noexcept {
  for (std::int32_t g = 0; g < num_groups; ++g) {
    const SequenceGroup& group = *groups[g];
    for (std::int32_t b = 0; b < group.count; ++b) {
      const SequenceChunk chunk = group.chunk(b);
      effort += chunk.items == nullptr ? kItemsPerRun : chunk.count;
      const std::int32_t offset = offset_in(chunk, item);
      if (offset >= 0) return place_in(group, b, offset);
    }
  }
  return {-1};
}

void SequenceBlocks::make_map() noexcept {
  effort = 0;
  std::int32_t highest = 0;
  for_each_block(*this, [&](const SequenceGroup& group, std::int32_t b) {
    const SequenceChunk chunk = group.chunk(b);
    highest = std::max(highest, group.last[b]);
    for (std::int32_t i = 0; chunk.items != nullptr && i < chunk.count; ++i) {
      highest = std::max(highest, chunk.items[i]);
    }
  });
  const std::int64_t room = std::int64_t{highest} + 1;
  map = new_array<std::int32_t>(static_cast<std::uint64_t>(room)).release();
  if (map == nullptr) return;
  map_room = static_cast<std::int32_t>(room);
  std::fill(map, map + room, kNoBlock);
  for_each_block(*this, [&](const SequenceGroup& group, std::int32_t b) {
    remember(group.chunk(b), group.id[b]);
  });
}

// Drops the map when there is no memory to grow it.
void SequenceBlocks::reserve_map(std::int32_t item) noexcept {
  if (map == nullptr || item < map_room) return;
  const std::int64_t needed = std::int64_t{item} + 1;
  const std::int64_t room = std::min<std::int64_t>(grown_room(map_room, needed),
                                                   std::numeric_limits<std::int32_t>::max());
  void* const grown = heap_resize(map, static_cast<std::uint64_t>(room), sizeof *map);
  if (grown == nullptr) {
    heap_free(map);
    map = nullptr;
    map_room = 0;
    return;
  }
  map = static_cast<std::int32_t*>(grown);
  std::fill(map + map_room, map + room, kNoBlock);
  map_room = static_cast<std::int32_t>(room);
}

void SequenceBlocks::remember(const SequenceChunk& chunk, std::int32_t id) noexcept {
  if (map == nullptr) return;
  for (std::int32_t i = 0; i < chunk.count; ++i) map[chunk[i]] = id;
}

}  // namespace tevpf
