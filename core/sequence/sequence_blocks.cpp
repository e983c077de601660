#include "core/sequence/sequence_blocks.h"

#include <algorithm>
#include <cstring>
#include <numeric>
#include <utility>

#include "core/base/heap.h"

namespace tevpf {
namespace {

// Blocks and groups start three quarters full, so that the first insertions do not split them.
// Small ones are joined with a neighbour when both together are no fuller than that.
constexpr std::int32_t filled(std::int32_t room) noexcept { return room - room / 4; }
constexpr bool is_small(std::int32_t count, std::int32_t room) noexcept {
  return count <= room / 4;
}

// An erasure takes at most one piece, for a block that has none of its own; so does an insertion,
// for that or for a split.
constexpr std::int64_t kPiecesPerChange = 2;
constexpr std::int32_t kGroupsPerChange = 1;
constexpr std::int32_t kIdsPerChange = 1;

constexpr std::int32_t divided_up(std::int32_t count, std::int32_t by) noexcept {
  return count / by + (count % by != 0 ? 1 : 0);
}

template <class T>
bool grow(T*& array, std::int64_t room) noexcept {
  void* const block = heap_resize(array, static_cast<std::uint64_t>(room), sizeof(T));
  if (block == nullptr) return false;
  array = static_cast<T*>(block);
  return true;
}

template <class T>
void move_entries(T* to, const T* from, std::int32_t count) noexcept {
  std::memmove(to, from, static_cast<std::size_t>(count) * sizeof(T));
}

// Moves the entries of `count` blocks, except for their starts.
void move_blocks(SequenceGroup& to, std::int32_t at, const SequenceGroup& from, std::int32_t first,
                 std::int32_t count) noexcept {
  move_entries(to.last + at, from.last + first, count);
  move_entries(to.id + at, from.id + first, count);
  move_entries(to.block + at, from.block + first, count);
  move_entries(to.last_key + at, from.last_key + first, count);
}

// Adds to the starts behind block b.
void shift_starts(SequenceGroup& group, std::int32_t b, std::int32_t change) noexcept {
  for (std::int32_t i = b + 1; i <= group.count; ++i) {
    group.start[i] = static_cast<std::int16_t>(group.start[i] + change);
  }
}

void end_starts(SequenceGroup& group) noexcept {
  std::fill(group.start + group.count + 1, group.start + kGroupRoom + 1, SequenceGroup::kNoStart);
}

// Removes the entries of a block; its range goes to the previous one.
void close_block(SequenceGroup& group, std::int32_t b) noexcept {
  move_blocks(group, b, group, b + 1, group.count - b - 1);
  move_entries(group.start + b, group.start + b + 1, group.count - b);
  --group.count;
  end_starts(group);
}

// The block of the group that holds that offset: counts starts without a branch.
std::int32_t block_at(const SequenceGroup& group, std::int32_t offset) noexcept {
  const auto wanted = static_cast<std::int16_t>(offset);
  std::int16_t in_front = 0;
  for (std::int32_t i = 1; i <= kGroupRoom; ++i) {
    in_front = static_cast<std::int16_t>(in_front + (group.start[i] <= wanted ? 1 : 0));
  }
  return std::min<std::int32_t>(in_front, group.count - 1);  // the end belongs to the last one
}

}  // namespace

void copy_chunk(const SequenceChunk& chunk, std::int32_t* out) noexcept {
  if (chunk.items == nullptr) {
    std::iota(out, out + chunk.count, chunk.first);
  } else {
    move_entries(out, chunk.items, chunk.count);
  }
}

// ---- Making and releasing -----------------------------------------------------------------------

SequenceBlocks* SequenceBlocks::make(std::int32_t* flat, std::int32_t count) noexcept {
  auto* const blocks = static_cast<SequenceBlocks*>(heap_zeroed(1, sizeof(SequenceBlocks)));
  if (blocks == nullptr) return nullptr;
  blocks->item_pieces.piece_size = kBlockRoom * std::int32_t{sizeof(std::int32_t)};
  blocks->group_pieces.piece_size = sizeof(SequenceGroup);
  blocks->free_id = -1;
  const std::int32_t num_blocks = std::max(1, divided_up(count, filled(kBlockRoom)));
  const std::int32_t num_groups = divided_up(num_blocks, filled(kGroupRoom));
  if (!blocks->reserve_groups(num_groups) || !blocks->reserve_ids(num_blocks)) {
    release(blocks);
    return nullptr;
  }
  blocks->flat = flat;
  while (blocks->count < count || blocks->num_groups == 0) blocks->append_group(count);
  return blocks;
}

// Adds a group over the next items, up to item number `all`.
void SequenceBlocks::append_group(std::int32_t all) noexcept {
  SequenceGroup& group = add_group(num_groups);
  do {
    const std::int32_t b = group.count++;
    const std::int32_t size = std::min(all - count, filled(kBlockRoom));
    group.block[b] = {flat == nullptr ? nullptr : flat + count, nullptr, false, false, 0};
    group.id[b] = new_id(group);
    group.start[b + 1] = static_cast<std::int16_t>(group.start[b] + size);
    count += size;
    group.last[b] = flat == nullptr ? count - 1 : flat[count - 1];
    borrowed += flat == nullptr ? 0 : 1;
  } while (count < all && group.count < filled(kGroupRoom));
  end_starts(group);
}

void SequenceBlocks::release(SequenceBlocks* blocks) noexcept {
  for (Pool* pool : {&blocks->item_pieces, &blocks->group_pieces, &blocks->key_pieces}) {
    pool->release();
  }
  for (void* array :
       {static_cast<void*>(blocks->groups), static_cast<void*>(blocks->starts),
        static_cast<void*>(blocks->homes), static_cast<void*>(blocks->flat),
        static_cast<void*>(blocks->top_keys), blocks->flat_keys, static_cast<void*>(blocks->map)}) {
    heap_free(array);
  }
  heap_free(blocks);
}

bool SequenceBlocks::reserve(std::int32_t item) noexcept {
  reserve_map(item);
  return item_pieces.reserve(kPiecesPerChange) && reserve_groups(kGroupsPerChange) &&
         reserve_ids(kIdsPerChange);
}

bool SequenceBlocks::reserve_groups(std::int32_t more) noexcept {
  if (!group_pieces.reserve(more)) return false;
  const std::int64_t needed = std::int64_t{num_groups} + more;
  if (needed <= group_room) return true;
  const std::int64_t room = grown_room(group_room, needed);
  if (!grow(groups, room) || !grow(starts, room) || !grow(top_keys, room)) return false;
  group_room = static_cast<std::int32_t>(room);
  return true;
}

bool SequenceBlocks::reserve_ids(std::int32_t more) noexcept {
  const std::int64_t needed = std::int64_t{num_ids} + more;
  if (needed <= id_room || free_id >= 0) return true;
  const std::int64_t room = grown_room(id_room, needed);
  if (!grow(homes, room)) return false;
  id_room = static_cast<std::int32_t>(room);
  return true;
}

std::int32_t SequenceBlocks::new_id(SequenceGroup& group) noexcept {
  std::int32_t id = free_id;
  if (id < 0) {
    id = num_ids++;
  } else {
    free_id = homes[id].next_free;
  }
  homes[id].group = &group;
  return id;
}

void SequenceBlocks::release_id(std::int32_t id) noexcept {
  homes[id].next_free = free_id;
  free_id = id;
}

// ---- Reading ------------------------------------------------------------------------------------

SequencePlace SequenceBlocks::locate(std::int32_t position) const noexcept {
  const std::int32_t g =
      count_less(num_groups - 1, [&](std::int32_t i) { return starts[i + 1] <= position; });
  const SequenceGroup& group = *groups[g];
  const std::int32_t offset = position - starts[g];
  const std::int32_t b = block_at(group, offset);
  return {position, g, b, offset - group.start[b]};
}

std::int32_t SequenceBlocks::read_elsewhere(std::int32_t position) noexcept {
  return read(locate(position));
}

std::int32_t SequenceBlocks::read(const SequencePlace& place) noexcept {
  SequenceGroup& group = *groups[place.group];
  hint = {place.position - place.offset, group.chunk(place.block), &group, place.block};
  return hint.chunk[place.offset];
}

// ---- Inserting ----------------------------------------------------------------------------------

void SequenceBlocks::insert(SequencePlace place, std::int32_t item, const void* key) noexcept {
  forget_hint();
  if (place.group < 0) place = locate(place.position);
  place = at_end_of_previous(place);
  if (groups[place.group]->items_of(place.block) == kBlockRoom) place = split(place);
  SequenceGroup& group = *groups[place.group];
  give_own_piece(group.block[place.block], group.chunk(place.block));
  insert_key(group, place, key);
  const std::int32_t behind = group.items_of(place.block) - place.offset;
  std::int32_t* const at = group.block[place.block].items + place.offset;
  move_entries(at + 1, at, behind);
  *at = item;
  if (behind == 0) group.last[place.block] = item;
  if (map != nullptr) map[item] = group.id[place.block];
  count_items(place, 1);
}

// The front of a block is also the end of the previous one. Preferring that while it has room keeps
// blocks full where items arrive in order.
SequencePlace SequenceBlocks::at_end_of_previous(const SequencePlace& place) const noexcept {
  if (place.offset != 0 || place.block == 0) return place;
  const std::int32_t size = groups[place.group]->items_of(place.block - 1);
  if (size == kBlockRoom) return place;
  return {place.position, place.group, place.block - 1, size};
}

void SequenceBlocks::count_items(const SequencePlace& place, std::int32_t change) noexcept {
  shift_starts(*groups[place.group], place.block, change);
  for (std::int32_t g = place.group + 1; g < num_groups; ++g) starts[g] += change;
  count += change;
}

// Copies the items of a block that is changed for the first time.
void SequenceBlocks::give_own_piece(SequenceBlock& block, const SequenceChunk& chunk) noexcept {
  if (block.own) return;
  auto* const items = static_cast<std::int32_t*>(item_pieces.take());
  copy_chunk(chunk, items);
  release_items(block);
  block.items = items;
  block.own = true;
}

void SequenceBlocks::release_items(const SequenceBlock& block) noexcept {
  if (block.own) {
    item_pieces.give_back(block.items);
  } else if (block.items != nullptr && --borrowed == 0) {
    heap_free(flat);
    flat = nullptr;
  }
}

// Splits a full block in half; an item that goes to its end gets a new block instead, so that
// appending fills blocks up. Returns what the place has become.
SequencePlace SequenceBlocks::split(SequencePlace place) noexcept {
  if (groups[place.group]->count == kGroupRoom) place = split_group(place);
  SequenceGroup& group = *groups[place.group];
  const std::int32_t b = place.block;
  const bool at_end = place.offset == kBlockRoom;
  const std::int32_t kept = at_end ? kBlockRoom : kBlockRoom / 2;

  move_blocks(group, b + 2, group, b + 1, group.count - b - 1);
  move_entries(group.start + b + 2, group.start + b + 1, group.count - b);
  ++group.count;
  group.start[b + 1] = static_cast<std::int16_t>(group.start[b] + kept);
  auto* const items = static_cast<std::int32_t*>(item_pieces.take());
  group.block[b + 1] = {items, nullptr, true, false, group.block[b].heat};
  group.id[b + 1] = new_id(group);
  move_entries(items, group.block[b].items + kept, kBlockRoom - kept);
  group.last[b + 1] = group.last[b];
  group.last[b] = group.block[b].items[kept - 1];
  split_keys(group, b, kept);
  remember({items, 0, kBlockRoom - kept}, group.id[b + 1]);
  if (!at_end && place.offset <= kept) return place;
  return {place.position, place.group, b + 1, place.offset - kept};
}

SequencePlace SequenceBlocks::split_group(const SequencePlace& place) noexcept {
  constexpr std::int32_t kept = kGroupRoom / 2;
  SequenceGroup& right = add_group(place.group + 1);
  SequenceGroup& left = *groups[place.group];
  append_blocks(right, left, kept);
  right.has_last_keys = left.has_last_keys;
  left.count = kept;
  end_starts(left);
  starts[right.number] = starts[left.number] + left.items();
  if (place.block < kept) return place;
  return {place.position, right.number, place.block - kept, place.offset};
}

// Appends the blocks of a group, from `first` on, to another.
void SequenceBlocks::append_blocks(SequenceGroup& to, const SequenceGroup& from,
                                   std::int32_t first) noexcept {
  const std::int32_t moved = from.count - first;
  const std::int32_t shift = to.items() - from.start[first];
  move_blocks(to, to.count, from, first, moved);
  for (std::int32_t i = 0; i <= moved; ++i) {
    to.start[to.count + i] = static_cast<std::int16_t>(from.start[first + i] + shift);
  }
  for (std::int32_t i = 0; i < moved; ++i) homes[to.id[to.count + i]].group = &to;
  to.count += moved;
  end_starts(to);
}

// Inserts a group without blocks at number g.
SequenceGroup& SequenceBlocks::add_group(std::int32_t g) noexcept {
  auto* const group = static_cast<SequenceGroup*>(group_pieces.take());
  group->count = 0;
  group->start[0] = 0;
  group->has_last_keys = false;
  group->heat = 0;
  move_entries(groups + g + 1, groups + g, num_groups - g);
  move_entries(starts + g + 1, starts + g, num_groups - g);
  groups[g] = group;
  starts[g] = count;
  has_top_keys = false;
  ++num_groups;
  number_groups(g);
  return *group;
}

void SequenceBlocks::number_groups(std::int32_t first) noexcept {
  for (std::int32_t g = first; g < num_groups; ++g) groups[g]->number = g;
}

// ---- Erasing ------------------------------------------------------------------------------------

void SequenceBlocks::erase(SequencePlace place) noexcept {
  forget_hint();
  if (place.group < 0) place = locate(place.position);
  SequenceGroup& group = *groups[place.group];
  const std::int32_t b = place.block;
  give_own_piece(group.block[b], group.chunk(b));
  erase_key(group, place);
  std::int32_t* const at = group.block[b].items + place.offset;
  if (map != nullptr) map[*at] = -1;
  const std::int32_t behind = group.items_of(b) - place.offset - 1;
  move_entries(at, at + 1, behind);
  if (behind == 0 && place.offset > 0) group.last[b] = at[-1];
  count_items(place, -1);
  shrink(group, b);
}

// Drops a block that has become empty; joins one that has become small with a neighbour.
void SequenceBlocks::shrink(SequenceGroup& group, std::int32_t b) noexcept {
  const std::int32_t size = group.items_of(b);
  if (size == 0) {
    if (group.count > 1 || num_groups > 1) drop_block(group, b);
    return;
  }
  if (!is_small(size, kBlockRoom)) return;
  const auto fits = [&](std::int32_t other) {
    return other >= 0 && other < group.count && size + group.items_of(other) <= filled(kBlockRoom);
  };
  if (fits(b + 1)) {
    join(group, b);
  } else if (fits(b - 1)) {
    join(group, b - 1);
  }
}

// Appends the items of the next block to a block. That one has a piece of its own: it has just been
// changed, or it holds fewer items than blocks are made with.
void SequenceBlocks::join(SequenceGroup& group, std::int32_t b) noexcept {
  const SequenceChunk right = group.chunk(b + 1);
  join_keys(group, b);
  copy_chunk(right, group.block[b].items + group.items_of(b));
  remember(right, group.id[b]);
  group.last[b] = group.last[b + 1];
  group.last_key[b] = group.last_key[b + 1];
  drop_block(group, b + 1);
}

// Drops a block that is empty, or whose items the previous block has taken over.
void SequenceBlocks::drop_block(SequenceGroup& group, std::int32_t b) noexcept {
  drop_keys(group, b);
  if (b == group.count - 1) has_top_keys = false;
  release_items(group.block[b]);
  release_id(group.id[b]);
  close_block(group, b);
  if (group.count == 0) {
    drop_group(group.number);
  } else if (is_small(group.count, kGroupRoom)) {
    shrink_group(group.number);
  }
}

void SequenceBlocks::shrink_group(std::int32_t g) noexcept {
  const auto fits = [&](std::int32_t other) {
    return other >= 0 && other < num_groups &&
           groups[g]->count + groups[other]->count <= filled(kGroupRoom);
  };
  if (!fits(g + 1)) {
    if (!fits(g - 1)) return;
    --g;
  }
  SequenceGroup& left = *groups[g];
  const SequenceGroup& right = *groups[g + 1];
  left.has_last_keys = left.has_last_keys && right.has_last_keys;
  append_blocks(left, right, 0);
  drop_group(g + 1);
}

// Drops a group whose blocks are gone or have moved.
void SequenceBlocks::drop_group(std::int32_t g) noexcept {
  group_pieces.give_back(groups[g]);
  has_top_keys = false;
  --num_groups;
  move_entries(groups + g, groups + g + 1, num_groups - g);
  move_entries(starts + g, starts + g + 1, num_groups - g);
  number_groups(g);
}

}  // namespace tevpf
