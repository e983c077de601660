#include "core/sequence/sequence.h"

#include <algorithm>
#include <cstring>
#include <limits>
#include <utility>

namespace tevpf {

// ---- Reading ------------------------------------------------------------------------------------

SequenceChunk Sequence::chunk_at(std::int32_t count, std::int32_t position) const noexcept {
  if (items != nullptr) return {items + position, 0, count - position};
  if (blocks == nullptr) return {nullptr, position, count - position};
  const SequencePlace place = blocks->locate(position);
  SequenceChunk chunk = blocks->groups[place.group]->chunk(place.block);
  if (chunk.items != nullptr) chunk.items += place.offset;
  chunk.first += place.offset;
  chunk.count -= place.offset;
  return chunk;
}

void Sequence::copy_items(std::int32_t count, std::int32_t* out) const noexcept {
  for_each_chunk(count, [&](const SequenceChunk& chunk) {
    copy_chunk(chunk, out);
    out += chunk.count;
  });
}

SequencePlace Sequence::place_of(std::int32_t count, std::int32_t item) const noexcept {
  if (blocks != nullptr) return blocks->find(item);
  return {offset_in({items, 0, count}, item)};
}

// ---- Getting ready ------------------------------------------------------------------------------

bool Sequence::reserve_room(std::int32_t count, std::int64_t needed) noexcept {
  constexpr std::int64_t most = std::numeric_limits<std::int32_t>::max();
  if (needed > most) return false;
  if (items != nullptr && room >= needed) return true;
  const std::int64_t grown = std::min(grown_room(items == nullptr ? count : room, needed), most);
  return flatten(count, static_cast<std::int32_t>(grown));
}

bool Sequence::become_blocks(std::int32_t count) noexcept {
  SequenceBlocks* const made = SequenceBlocks::make(items, count);
  if (made == nullptr) return false;
  *this = {nullptr, made, 0};
  return true;
}

// An array can take any change, if more slowly, so one with room stays where there is no memory for
// blocks.

bool Sequence::make_ready_to_insert(std::int32_t count, std::int32_t position,
                                    std::int32_t item) noexcept {
  if (blocks != nullptr) return blocks->reserve(item);
  if (items == nullptr && position == count && item == count) return true;
  const std::int32_t moved = items == nullptr ? count : count - position;
  if (moved > kFlatReach && become_blocks(count)) return blocks->reserve(item);
  return reserve_room(count, count + std::int64_t{1});
}

bool Sequence::make_ready_to_erase(std::int32_t count, std::int32_t position) noexcept {
  if (blocks != nullptr) return blocks->reserve(0);
  if (items == nullptr && position == count - 1) return true;
  const std::int32_t moved = items == nullptr ? count : count - position;
  if (moved > kFlatReach && become_blocks(count)) return blocks->reserve(0);
  return reserve_room(count, count);
}

bool Sequence::make_ready_to_move(std::int32_t count, std::int32_t from, std::int32_t to) noexcept {
  if (blocks != nullptr) return blocks->reserve(0);
  if (from == to) return true;
  const std::int32_t moved = items == nullptr ? count : std::max(from, to) - std::min(from, to);
  if (moved > kFlatReach && become_blocks(count)) return blocks->reserve(0);
  return reserve_room(count, count);
}

// ---- Changes ------------------------------------------------------------------------------------

void Sequence::insert(std::int32_t count, SequencePlace place, std::int32_t item,
                      const void* key) noexcept {
  if (blocks != nullptr) return blocks->insert(place, item, key);
  if (items == nullptr) return;  // an identity takes its next item
  std::int32_t* const at = items + place.position;
  std::memmove(at + 1, at, static_cast<std::size_t>(count - place.position) * sizeof *at);
  *at = item;
}

void Sequence::erase(std::int32_t count, SequencePlace place) noexcept {
  if (blocks != nullptr) return blocks->erase(place);
  if (items == nullptr) return;  // an identity loses its last item
  std::int32_t* const at = items + place.position;
  std::memmove(at, at + 1, static_cast<std::size_t>(count - 1 - place.position) * sizeof *at);
}

void Sequence::move(std::int32_t from, std::int32_t to, const void* key) noexcept {
  if (from == to) return;
  if (blocks != nullptr) {
    const std::int32_t item = at(from);
    blocks->erase({from});
    blocks->insert({to}, item, key);
  } else if (from < to) {
    std::rotate(items + from, items + from + 1, items + to + 1);
  } else {
    std::rotate(items + to, items + from, items + from + 1);
  }
}

// ---- The whole ----------------------------------------------------------------------------------

bool Sequence::flatten(std::int32_t count, std::int32_t new_room) noexcept {
  if (items != nullptr) {
    if (room >= new_room) return true;
    void* const array = heap_resize(items, static_cast<std::uint64_t>(new_room), sizeof *items);
    if (array == nullptr) return false;
    items = static_cast<std::int32_t*>(array);
    room = new_room;
    return true;
  }
  auto array = new_array<std::int32_t>(static_cast<std::uint64_t>(new_room));
  if (!array) return false;
  copy_items(count, array.get());
  adopt(std::move(array), new_room);
  return true;
}

void Sequence::adopt(Owned<std::int32_t> array, std::int32_t array_room) noexcept {
  clear();
  items = array.release();
  room = array_room;
}

Owned<std::int32_t> Sequence::hand_over() noexcept {
  Owned<std::int32_t> array(items);
  items = nullptr;
  room = 0;
  return array;
}

bool Sequence::copy_to(std::int32_t count, Sequence& out) const noexcept {
  if (is_identity()) return true;
  auto array = new_array<std::int32_t>(static_cast<std::uint64_t>(count));
  if (!array) return false;
  copy_items(count, array.get());
  out.adopt(std::move(array), count);
  return true;
}

void Sequence::clear() noexcept {
  heap_free(items);
  if (blocks != nullptr) SequenceBlocks::release(blocks);
  *this = {};
}

}  // namespace tevpf
