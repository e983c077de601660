// Holds a list against the invariants that every operation must keep.
#pragma once

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <vector>

#include "lists/name_table.h"
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

// The first broken rule of the name index, or null.
inline const char* broken_index_rule(const TEVPF_LIST& list) {
  std::vector<std::int32_t> positions(list.index_ptr, list.index_ptr + list.num_params);
  std::sort(positions.begin(), positions.end());
  for (std::int32_t i = 0; i < list.num_params; ++i) {
    if (positions[std::size_t(i)] != i) return "index holds each position once";
  }
  const auto name = [&](std::int32_t i) { return list.param_ptr[list.index_ptr[i]].def.name; };
  for (std::int32_t i = 1; i < list.num_params; ++i) {
    if (std::strcmp(name(i - 1), name(i)) >= 0) return "index in order, names unique";
  }
  return nullptr;
}

// The first broken rule of the table of names, or null.
inline const char* broken_table_rule(const TEVPF_LIST& list) {
  if (list.names.slots == nullptr) return nullptr;
  if (2 * static_cast<std::uint32_t>(list.num_params) > list.names.mask + 1) return "half full";
  for (std::int32_t i = 0; i < list.num_params; ++i) {
    const char* const name = list.param_ptr[i].def.name;
    if (tevpf::look_up(list, {name, std::strlen(name), false}) != i) return "table finds each name";
  }
  return nullptr;
}

inline const char* broken_rule(const TEVPF_LIST& list) {
  if (list.num_params < 0 || list.free_params < 0) return "counts";
  if (list.cur_param < -1) return "cursor";
  const std::int64_t slots = std::int64_t{list.num_params} + list.free_params;
  if (slots > list.param_room) return "slots that are counted are there";
  if (slots > 0 && (list.param_ptr == nullptr || list.index_ptr == nullptr)) return "arrays";
  std::int64_t bytes = 12;
  for (std::int32_t i = 0; i < list.num_params; ++i) {
    if (const char* const rule = broken_rule(list.param_ptr[i], bytes)) return rule;
  }
  if (bytes != list.header.btf) return "btf";
  if (const char* const rule = broken_index_rule(list)) return rule;
  return broken_table_rule(list);
}
