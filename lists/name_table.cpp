#include "lists/name_table.h"

#include <cstring>

#include "core/base/heap.h"
#include "values/text_compare.h"

namespace tevpf {
namespace {

constexpr std::int32_t kFewNames = 16;         // with fewer, the index is as fast
constexpr std::int32_t kLookupsPerTable = 16;  // n / 16 look-ups repay a table of n names
constexpr std::size_t kLongestName = TEVPF_NAME_SIZE - 1;

// Hashes the name as three zero-padded words; each is mixed in by a multiplication whose upper half
// is folded into the lower.
std::uint32_t hash_name(const char* name, std::size_t length) noexcept {
  constexpr std::uint64_t kOdd = 0x9E3779B97F4A7C15u;
  std::uint64_t words[3] = {};
  std::memcpy(words, name, length);
  std::uint64_t hash = length;
  for (const std::uint64_t word : words) {
    hash = (hash ^ word) * kOdd;
    hash ^= hash >> 32;
  }
  return static_cast<std::uint32_t>(hash);
}

std::uint32_t hash_name(const TEVPF_PARAM& param) noexcept {
  return hash_name(param.def.name, strnlen(param.def.name, kLongestName));
}

void insert(NameTable& table, NameSlot entry) noexcept {
  std::uint32_t at = entry.hash & table.mask;
  while (table.slots[at].position >= 0) at = (at + 1) & table.mask;
  table.slots[at] = entry;
}

bool strictly_ascending(const TEVPF_LIST& list) noexcept {
  const auto name_at = [&](std::int32_t i) { return list.param_ptr[list.index_ptr[i]].def.name; };
  for (std::int32_t i = 1; i < list.num_params; ++i) {
    if (std::strcmp(name_at(i - 1), name_at(i)) >= 0) return false;
  }
  return true;
}

// Builds a table of all parameters with room for `names` names, at least num_params.
bool build(TEVPF_LIST& list, std::int64_t names) noexcept {
  std::uint64_t slots = 2 * std::uint64_t{kFewNames};
  while (slots < 2 * static_cast<std::uint64_t>(names)) slots *= 2;
  Owned<NameSlot> block = new_array<NameSlot>(slots);
  if (!block) return false;
  const auto bytes = static_cast<std::size_t>(slots * sizeof(NameSlot));
  std::memset(block.get(), 0xFF, bytes);  // every position -1

  heap_free(list.names.slots);
  list.names.slots = block.release();
  list.names.mask = static_cast<std::uint32_t>(slots - 1);
  for (std::int32_t i = 0; i < list.num_params; ++i) {
    insert(list.names, {hash_name(list.param_ptr[i]), i});
  }
  return true;
}

}  // namespace

bool table_answers(TEVPF_LIST& list) noexcept {
  NameTable& table = list.names;
  if (table.slots != nullptr) return true;
  if (list.num_params < kFewNames || ++table.lookups < list.num_params / kLookupsPerTable) {
    return false;
  }
  table.lookups = 0;  // if out of memory or unordered, retry after as many more
  // If the index is out of order or holds a name twice, only searching it gives the same results.
  table.in_order = table.in_order || strictly_ascending(list);
  return table.in_order && build(list, list.num_params);
}

std::int32_t look_up(const TEVPF_LIST& list, const TextPattern& name) noexcept {
  if (name.length > kLongestName) return -1;
  const NameTable& table = list.names;
  const std::uint32_t hash = hash_name(name.text, name.length);
  for (std::uint32_t at = hash & table.mask; table.slots[at].position >= 0;
       at = (at + 1) & table.mask) {
    const NameSlot slot = table.slots[at];
    if (slot.hash == hash && std::strcmp(list.param_ptr[slot.position].def.name, name.text) == 0) {
      return slot.position;
    }
  }
  return -1;
}

void append_name(TEVPF_LIST& list) noexcept {
  NameTable& table = list.names;
  if (list.num_params == 0) table.in_order = 1;  // and stays 1: names are inserted in order
  if (table.slots == nullptr) return;
  const bool half_full = static_cast<std::uint32_t>(list.num_params) >= table.mask / 2;
  if (half_full && !build(list, std::int64_t{2} * list.num_params)) {
    drop_table(table);
    return;
  }
  const std::int32_t position = list.num_params;
  insert(table, {hash_name(list.param_ptr[position]), position});
}

void drop_table(NameTable& table) noexcept {
  heap_free(table.slots);
  table.slots = nullptr;
  table.mask = 0;
  table.lookups = 0;
}

}  // namespace tevpf
