#include "lists/name_table.h"

#include <cstring>

#include "core/base/heap.h"
#include "lists/param_store.h"
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

void insert(NameTable& table, NameEntry entry) noexcept {
  std::uint32_t at = entry.hash & table.mask;
  while (table.entries[at].slot >= 0) at = (at + 1) & table.mask;
  table.entries[at] = entry;
}

bool strictly_ascending(const TEVPF_LIST& list) noexcept {
  const char* last = nullptr;
  for (std::int32_t i = 0; i < list.num_params; ++i) {
    const char* const name = param_in(list, list.index.order.at(i)).def.name;
    if (last != nullptr && std::strcmp(last, name) >= 0) return false;
    last = name;
  }
  return true;
}

// Builds a table of all parameters with room for `names` names, at least num_params.
bool build(TEVPF_LIST& list, std::int64_t names) noexcept {
  std::uint64_t room = 2 * std::uint64_t{kFewNames};
  while (room < 2 * static_cast<std::uint64_t>(names)) room *= 2;
  Owned<NameEntry> block = new_array<NameEntry>(room);
  if (!block) return false;
  const auto bytes = static_cast<std::size_t>(room * sizeof(NameEntry));
  std::memset(block.get(), 0xFF, bytes);  // every slot -1

  heap_free(list.names.entries);
  list.names.entries = block.release();
  list.names.mask = static_cast<std::uint32_t>(room - 1);
  for_each_slot(list, [&](std::int32_t slot) { enter_name(list, slot); });
  return true;
}

}  // namespace

bool table_answers(TEVPF_LIST& list) noexcept {
  NameTable& table = list.names;
  if (table.entries != nullptr) return true;
  if (list.num_params < kFewNames || ++table.lookups < list.num_params / kLookupsPerTable) {
    return false;
  }
  table.lookups = 0;  // if out of memory or unordered, retry after as many more
  // If the index is out of order or holds a name twice, only searching it gives the same results.
  if (list.index.in_order == 0) list.index.in_order = strictly_ascending(list) ? 1 : 0;
  return list.index.in_order != 0 && build(list, list.num_params);
}

std::int32_t look_up(const TEVPF_LIST& list, const TextPattern& name) noexcept {
  if (name.length > kLongestName) return -1;
  const NameTable& table = list.names;
  const std::uint32_t hash = hash_name(name.text, name.length);
  for (std::uint32_t at = hash & table.mask; table.entries[at].slot >= 0;
       at = (at + 1) & table.mask) {
    const NameEntry entry = table.entries[at];
    if (entry.hash == hash && std::strcmp(param_in(list, entry.slot).def.name, name.text) == 0) {
      return entry.slot;
    }
  }
  return -1;
}

void reserve_entry(TEVPF_LIST& list) noexcept {
  NameTable& table = list.names;
  if (table.entries == nullptr) return;
  const bool half_full = static_cast<std::uint32_t>(list.num_params) >= table.mask / 2;
  if (half_full && !build(list, std::int64_t{2} * list.num_params)) drop_table(table);
}

void enter_name(TEVPF_LIST& list, std::int32_t slot) noexcept {
  if (list.names.entries != nullptr) insert(list.names, {hash_name(param_in(list, slot)), slot});
}

// Entries behind the removed one move up where a search for them would now stop too early.
void remove_name(TEVPF_LIST& list, std::int32_t slot) noexcept {
  NameTable& table = list.names;
  if (table.entries == nullptr) return;
  std::uint32_t gap = hash_name(param_in(list, slot)) & table.mask;
  for (; table.entries[gap].slot != slot; gap = (gap + 1) & table.mask) {
    if (table.entries[gap].slot < 0) return drop_table(table);  // renamed from outside
  }
  for (std::uint32_t at = (gap + 1) & table.mask; table.entries[at].slot >= 0;
       at = (at + 1) & table.mask) {
    const NameEntry entry = table.entries[at];
    const std::uint32_t from_home = (at - entry.hash) & table.mask;
    if (from_home < ((at - gap) & table.mask)) continue;
    table.entries[gap] = entry;
    gap = at;
  }
  table.entries[gap].slot = -1;
}

void renumber_table(NameTable& table, const std::int32_t* numbers) noexcept {
  if (table.entries == nullptr) return;
  for (std::uint64_t at = 0; at <= table.mask; ++at) {
    std::int32_t& slot = table.entries[at].slot;
    if (slot >= 0) slot = numbers[slot];
  }
}

void drop_table(NameTable& table) noexcept {
  heap_free(table.entries);
  table = {};
}

}  // namespace tevpf
