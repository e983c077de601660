#include "core/name_set.h"

#include <cstring>

#include "core/base/heap.h"
#include "core/base/text_field.h"

namespace tevpf {

namespace {

constexpr std::uint32_t kFirstSlots = 64;

// FNV-1a over the characters that are kept, mixed once more because the low bits choose the slot.
std::uint32_t hash_name(const char* name) noexcept {
  std::uint32_t hash = 2166136261u;
  for (int i = 0; i < TEVPF_NAME_SIZE - 1 && name[i] != '\0'; ++i) {
    hash = (hash ^ static_cast<unsigned char>(name[i])) * 16777619u;
  }
  return hash ^ (hash >> 15);
}

// The slot of an element, or the empty one where it belongs.
NameSet::Slot& place(NameSet& set, NameSet::Slot wanted) noexcept {
  std::uint32_t i = wanted.hash & set.mask;
  while (set.slots[i].element != nullptr && set.slots[i].element != wanted.element) {
    i = (i + 1) & set.mask;
  }
  return set.slots[i];
}

// Keeps the set at most half full, so that probes stay short; false when out of memory.
bool make_room(NameSet& set) noexcept {
  const std::uint32_t old_slots = set.slots == nullptr ? 0 : set.mask + 1;
  if (static_cast<std::uint32_t>(set.count) < old_slots / 2) return true;
  const std::uint32_t slots = old_slots == 0 ? kFirstSlots : old_slots * 2;
  if (slots == 0) return false;
  NameSet larger{new_zeroed<NameSet::Slot>(slots).release(), slots - 1, set.count};
  if (larger.slots == nullptr) return false;
  for (std::uint32_t i = 0; i < old_slots; ++i) {
    if (set.slots[i].element != nullptr) place(larger, set.slots[i]) = set.slots[i];
  }
  heap_free(set.slots);
  set = larger;
  return true;
}

}  // namespace

void add_name(NameSet& set, TEVPF_ELEM_HEADER* element) noexcept {
  if (!make_room(set)) {
    drop_names(set);
    return;
  }
  const NameSet::Slot slot{element, hash_name(element->elem_name)};
  place(set, slot) = slot;
  ++set.count;
}

TEVPF_ELEM_HEADER* find_name(const NameSet& set, const char* name) noexcept {
  if (set.slots == nullptr) return nullptr;
  const std::uint32_t hash = hash_name(name);
  for (std::uint32_t i = hash & set.mask;; i = (i + 1) & set.mask) {
    const NameSet::Slot& slot = set.slots[i];
    if (slot.element == nullptr) return nullptr;
    if (slot.hash == hash && same_element_name(slot.element->elem_name, name)) return slot.element;
  }
}

void remove_name(NameSet& set, const TEVPF_ELEM_HEADER* element) noexcept {
  if (set.slots == nullptr) return;
  std::uint32_t hole = hash_name(element->elem_name) & set.mask;
  while (set.slots[hole].element != element) {
    if (set.slots[hole].element == nullptr) return drop_names(set);  // its name was changed
    hole = (hole + 1) & set.mask;
  }
  // Close the gap: a later entry moves into the hole unless its home slot comes after the hole.
  for (std::uint32_t i = (hole + 1) & set.mask; set.slots[i].element != nullptr;
       i = (i + 1) & set.mask) {
    const std::uint32_t probed = (i - set.slots[i].hash) & set.mask;
    if (probed < ((i - hole) & set.mask)) continue;
    set.slots[hole] = set.slots[i];
    hole = i;
  }
  set.slots[hole] = {};
  --set.count;
}

void drop_names(NameSet& set) noexcept {
  heap_free(set.slots);
  set = {};
}

}  // namespace tevpf
