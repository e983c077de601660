// The keys of a sequence in blocks as items come and go. Keys only save time: those that cannot be
// kept are dropped.
#include <cstring>

#include "core/base/heap.h"
#include "core/sequence/sequence_blocks.h"

namespace tevpf {
namespace {

void move_bytes(unsigned char* to, const unsigned char* from, std::int32_t count) noexcept {
  std::memmove(to, from, static_cast<std::size_t>(count));
}

}  // namespace

unsigned char* SequenceBlocks::key_bytes(const SequenceBlock& block,
                                         std::int32_t offset) const noexcept {
  return static_cast<unsigned char*>(block.keys) + offset * key_size;
}

void* SequenceBlocks::take_keys() noexcept {
  return key_pieces.reserve(1) ? key_pieces.take() : nullptr;
}

void* SequenceBlocks::make_keys(SequenceGroup& group, std::int32_t b) noexcept {
  SequenceBlock& block = group.block[b];
  block.keys = take_keys();
  block.own_keys = block.keys != nullptr;
  return block.keys;
}

void SequenceBlocks::adopt_keys(void* keys, std::int32_t size) noexcept {
  expect_keys(size);
  drop_all_keys();
  flat_keys = keys;
  auto* at = static_cast<unsigned char*>(keys);
  for (std::int32_t g = 0; g < num_groups; ++g) {
    SequenceGroup& group = *groups[g];
    for (std::int32_t b = 0; b < group.count && group.items_of(b) > 0; ++b) {
      group.block[b].keys = at;
      ++borrowed_keys;
      at += group.items_of(b) * size;
      std::memcpy(&group.last_key[b], at - size, static_cast<std::size_t>(size));
    }
    group.has_last_keys = borrowed_keys > 0;
  }
}

void SequenceBlocks::release_keys(SequenceBlock& block) noexcept {
  if (block.own_keys) {
    key_pieces.give_back(block.keys);
  } else if (block.keys != nullptr && --borrowed_keys == 0) {
    heap_free(flat_keys);
    flat_keys = nullptr;
  }
  block.keys = nullptr;
  block.own_keys = false;
}

// Copies adopted keys that are about to change; drops them when memory runs out.
void SequenceBlocks::give_own_keys(SequenceGroup& group, std::int32_t b) noexcept {
  SequenceBlock& block = group.block[b];
  if (block.keys == nullptr || block.own_keys) return;
  void* const own = take_keys();
  if (own != nullptr) {
    std::memcpy(own, block.keys, static_cast<std::size_t>(group.items_of(b) * key_size));
  }
  release_keys(block);
  block.keys = own;
  block.own_keys = own != nullptr;
}

void SequenceBlocks::drop_keys(SequenceGroup& group, std::int32_t b) noexcept {
  release_keys(group.block[b]);
}

void SequenceBlocks::drop_all_keys() noexcept {
  has_top_keys = false;
  for (std::int32_t g = 0; g < num_groups; ++g) {
    groups[g]->has_last_keys = false;
    for (std::int32_t b = 0; b < groups[g]->count; ++b) {
      groups[g]->block[b].keys = nullptr;
      groups[g]->block[b].own_keys = false;
    }
  }
  key_pieces.release();
  heap_free(flat_keys);
  flat_keys = nullptr;
  borrowed_keys = 0;
}

void SequenceBlocks::change_key_size(std::int32_t size) noexcept {
  drop_all_keys();
  key_size = size;
  key_pieces.piece_size = kBlockRoom * size;
}

void SequenceBlocks::set_key(SequencePlace place, const void* key) noexcept {
  if (place.group < 0) place = locate(place.position);
  SequenceGroup& group = *groups[place.group];
  const std::int32_t b = place.block;
  give_own_keys(group, b);
  if (group.block[b].keys != nullptr) {
    std::memcpy(key_bytes(group.block[b], place.offset), key, static_cast<std::size_t>(key_size));
  }
  if (place.offset == group.items_of(b) - 1) set_last_key(group, b, key);
}

void SequenceBlocks::set_last_key(SequenceGroup& group, std::int32_t b, const void* key) noexcept {
  const bool of_group = b == group.count - 1;
  if (key == nullptr) {
    group.has_last_keys = false;
    has_top_keys = has_top_keys && !of_group;
    return;
  }
  const auto size = static_cast<std::size_t>(key_size);
  if (group.has_last_keys) std::memcpy(&group.last_key[b], key, size);
  if (has_top_keys && of_group) std::memcpy(&top_keys[group.number], key, size);
}

void SequenceBlocks::insert_key(SequenceGroup& group, const SequencePlace& place,
                                const void* key) noexcept {
  const SequenceBlock& block = group.block[place.block];
  const std::int32_t behind = group.items_of(place.block) - place.offset;
  if (behind == 0) set_last_key(group, place.block, key);
  if (key == nullptr) return drop_keys(group, place.block);
  give_own_keys(group, place.block);
  if (block.keys == nullptr) return;
  unsigned char* const at = key_bytes(block, place.offset);
  move_bytes(at + key_size, at, behind * key_size);
  std::memcpy(at, key, static_cast<std::size_t>(key_size));
}

void SequenceBlocks::erase_key(SequenceGroup& group, const SequencePlace& place) noexcept {
  const SequenceBlock& block = group.block[place.block];
  const std::int32_t behind = group.items_of(place.block) - place.offset - 1;
  give_own_keys(group, place.block);
  if (block.keys == nullptr) {
    if (behind == 0) set_last_key(group, place.block, nullptr);
    return;
  }
  unsigned char* const at = key_bytes(block, place.offset);
  move_bytes(at, at + key_size, behind * key_size);
  if (behind == 0 && place.offset > 0) set_last_key(group, place.block, at - key_size);
}

void SequenceBlocks::split_keys(SequenceGroup& group, std::int32_t b, std::int32_t kept) noexcept {
  const SequenceBlock& left = group.block[b];
  group.last_key[b + 1] = group.last_key[b];
  if (left.keys == nullptr) {
    if (kept < kBlockRoom) set_last_key(group, b, nullptr);
    return;
  }
  set_last_key(group, b, key_bytes(left, kept - 1));
  SequenceBlock& right = group.block[b + 1];
  if (make_keys(group, b + 1) == nullptr) return;
  move_bytes(key_bytes(right, 0), key_bytes(left, kept), (kBlockRoom - kept) * key_size);
}

void SequenceBlocks::join_keys(SequenceGroup& group, std::int32_t b) noexcept {
  const SequenceBlock& left = group.block[b];
  const SequenceBlock& right = group.block[b + 1];
  give_own_keys(group, b);
  if (right.keys == nullptr) drop_keys(group, b);
  if (left.keys == nullptr) return;
  move_bytes(key_bytes(left, group.items_of(b)), key_bytes(right, 0),
             group.items_of(b + 1) * key_size);
}

}  // namespace tevpf
