// Holds a list against the invariants that every operation must keep.
#pragma once

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <vector>

#include "lists/name_table.h"
#include "lists/param_store.h"
#include "values/text_compare.h"
#include "values/value_type.h"

// The first broken rule of one parameter, or null; adds its stored bytes.
inline const char* broken_rule(const TEVPF_PARAM& param, std::int64_t& bytes) {
  const TEVPF_PARAM_DEF& def = param.def;
  if (!tevpf::is_value_type(def.type)) return "value type";
  if (std::memchr(def.name, '\0', sizeof def.name) == nullptr) return "terminated name";
  if (std::memchr(def.units, '\0', sizeof def.units) == nullptr) return "terminated units";
  const bool string = def.type == PF_TYPE_STRING;
  const auto& [length, value] = def.part.str;
  if (string && (value == nullptr || std::size_t(length) != std::strlen(value))) return "string";
  constexpr std::int64_t kParts[] = {12, 16, 5, 28, 6};
  std::int64_t size = 44 + kParts[def.type - PF_TYPE_INT] + (string ? length : 0);
  const std::int64_t description_place = def.description == nullptr ? 0 : string ? 1 : size - 8;
  if (def.description != nullptr)
    size += static_cast<std::int64_t>(std::strlen(def.description)) + 1;
  bytes += size;
  return param.desc_loc == description_place ? nullptr : "desc_loc";
}

// The slots of a list are in the order or free; of one that is not settled, too.
inline const char* broken_slots(const TEVPF_LIST& list) {
  const tevpf::ParamSlots& slots = list.slots;
  if (slots.order.is_identity() && slots.num_free != 0) return "free slots in an identity";
  const std::int64_t used = std::int64_t{list.num_params} + slots.num_free;
  const std::int64_t counted = std::int64_t{list.num_params} + list.free_params;
  if (slots.room < std::max(used, counted)) return "slots that are counted are there";
  if (counted > 0 && list.param_ptr == nullptr) return "parameter block";
  std::vector<bool> seen(static_cast<std::size_t>(used));
  const auto is_new = [&](std::int32_t slot) {
    const bool fits = slot >= 0 && slot < used && !seen[std::size_t(slot)];
    if (fits) seen[std::size_t(slot)] = true;
    return fits;
  };
  std::int32_t next = slots.first_free;
  for (std::int32_t i = 0; i < slots.num_free; ++i) {
    if (!is_new(next)) return "free slots are distinct";
    next = list.param_ptr[next].def.type;
  }
  for (std::int32_t i = 0; i < list.num_params; ++i) {
    const std::int32_t slot = slots.order.at(i);
    if (!is_new(slot)) return "slots held are distinct";
    if (slots.order.position_of(list.num_params, slot) != i) return "a slot's position";
  }
  return nullptr;
}

// The keys that blocks of the name index keep beside their items.
inline const char* broken_keys(const TEVPF_LIST& list) {
  const tevpf::SequenceBlocks* const blocks = list.index.order.blocks;
  if (blocks == nullptr || blocks->key_size == 0) return nullptr;
  const std::int32_t skipped = list.index.beginning_length;
  const auto is_true = [&](const void* key, std::int32_t slot) {
    const char* const name = list.param_ptr[slot].def.name;
    char expected[8] = {};
    if (std::strncmp(name, list.index.beginning, std::size_t(skipped)) != 0) return false;
    std::memcpy(expected, name + skipped, strnlen(name + skipped, sizeof expected));
    std::reverse(expected, expected + sizeof expected);
    return std::memcmp(key, expected, sizeof expected) == 0;
  };
  for (std::int32_t g = 0; g < blocks->num_groups; ++g) {
    const tevpf::SequenceGroup& group = *blocks->groups[g];
    for (std::int32_t b = 0; b < group.count; ++b) {
      const tevpf::SequenceChunk chunk = group.chunk(b);
      const auto* const keys = static_cast<const char*>(group.block[b].keys);
      for (std::int32_t i = 0; keys != nullptr && i < chunk.count; ++i) {
        if (!is_true(keys + 8 * std::ptrdiff_t{i}, chunk[i])) return "keys of blocks";
      }
      if (group.has_last_keys && !is_true(&group.last_key[b], group.last[b])) return "last keys";
    }
  }
  return nullptr;
}

// The first broken rule of the name index, or null.
inline const char* broken_index_rule(const TEVPF_LIST& list) {
  const tevpf::Sequence& index = list.index.order;
  if (list.index_ptr != index.items) return "the array is shown";
  if (index.items != nullptr && index.room < list.num_params) return "room in the index";
  const auto count = static_cast<std::size_t>(list.num_params);
  std::vector<std::int32_t> slots(count), expected(count);
  index.copy_items(list.num_params, slots.data());
  list.slots.order.copy_items(list.num_params, expected.data());
  const auto name = [&](std::size_t i) { return list.param_ptr[slots[i]].def.name; };
  std::vector<std::int32_t> held = slots;
  std::sort(held.begin(), held.end());
  std::sort(expected.begin(), expected.end());
  if (held != expected) return "index holds each parameter once";
  for (std::size_t i = 1; i < count; ++i) {
    if (std::strcmp(name(i - 1), name(i)) >= 0) return "index in order, names unique";
  }
  return broken_keys(list);
}

// The first broken rule of the table of names, or null.
inline const char* broken_table_rule(const TEVPF_LIST& list) {
  const tevpf::NameTable& names = list.names;
  if (names.entries == nullptr) return nullptr;
  std::int32_t entered = 0;
  for (std::uint32_t i = 0; i <= names.mask; ++i) entered += names.entries[i].slot >= 0;
  if (entered != list.num_params) return "table holds each name once";
  if (2 * static_cast<std::uint32_t>(entered) > names.mask + 1) return "half full";
  for (std::int32_t i = 0; i < list.num_params; ++i) {
    const std::int32_t slot = list.slots.order.at(i);
    const char* const name = list.param_ptr[slot].def.name;
    if (tevpf::look_up(list, {name, std::strlen(name), false}) != slot) {
      return "table finds each name";
    }
  }
  return nullptr;
}

inline const char* broken_rule(const TEVPF_LIST& list) {
  if (list.num_params < 0 || list.free_params < 0) return "counts";
  if (list.cur_param < -1) return "cursor";
  if (const char* const rule = broken_slots(list)) return rule;
  std::int64_t bytes = 12;
  for (std::int32_t i = 0; i < list.num_params; ++i) {
    if (const char* const rule = broken_rule(tevpf::param_at(list, i), bytes)) return rule;
  }
  if (bytes != list.header.btf) return "btf";
  if (const char* const rule = broken_index_rule(list)) return rule;
  return broken_table_rule(list);
}

// What callers outside see of a list that is handed out: all of it in arrays, in order.
inline const char* broken_settled_rule(const TEVPF_LIST& list) {
  const std::int64_t counted = std::int64_t{list.num_params} + list.free_params;
  if (!list.slots.order.is_identity()) return "parameters in order";
  if (counted > 0 && list.index_ptr == nullptr) return "index in an array";
  if (counted > 0 && list.index.order.room < counted) return "room in the array";
  return broken_rule(list);
}
