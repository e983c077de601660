// Holds a list against the invariants that every operation must keep.
#pragma once

#include <cstdint>
#include <cstring>
#include <vector>

#include "lists/name_table.h"
#include "values/text_compare.h"
#include "values/value_type.h"

inline bool terminated(const char* field, std::size_t size) {
  return std::memchr(field, '\0', size) != nullptr;
}

// The stored bytes of a parameter, and where its description would lie in them.
inline std::int64_t stored_bytes(const TEVPF_PARAM_DEF& def, std::int64_t& description_place) {
  const std::int64_t parts[] = {12, 16, 5, 28, 6};
  std::int64_t bytes = 44 + parts[def.type - PF_TYPE_INT];
  if (def.type == PF_TYPE_STRING) bytes += def.part.str.length;
  description_place = def.description == nullptr ? 0 : def.type == PF_TYPE_STRING ? 1 : bytes - 8;
  if (def.description != nullptr)
    bytes += static_cast<std::int64_t>(std::strlen(def.description)) + 1;
  return bytes;
}

// The first broken rule of one parameter, or null; adds its stored bytes.
inline const char* broken_rule(const TEVPF_PARAM& param, std::int64_t& bytes) {
  const TEVPF_PARAM_DEF& def = param.def;
  if (!tevpf::is_value_type(def.type)) return "value type";
  if (!terminated(def.name, sizeof def.name)) return "terminated name";
  if (!terminated(def.units, sizeof def.units)) return "terminated units";
  if (def.type == PF_TYPE_STRING) {
    if (def.part.str.value == nullptr) return "string has a value";
    const std::size_t length = std::strlen(def.part.str.value);
    if (static_cast<std::size_t>(def.part.str.length) != length)
      return "length of the string value";
  }
  std::int64_t description_place;
  bytes += stored_bytes(def, description_place);
  return param.desc_loc == description_place ? nullptr : "desc_loc";
}

// The first broken rule of the name index, or null.
inline const char* broken_index_rule(const TEVPF_LIST& list) {
  std::vector<bool> seen(static_cast<std::size_t>(list.num_params));
  const char* previous = nullptr;
  for (std::int32_t place = 0; place < list.num_params; ++place) {
    const std::int32_t position = list.index_ptr[place];
    if (position < 0 || position >= list.num_params) return "index entries are positions";
    if (seen[static_cast<std::size_t>(position)]) return "index holds each position once";
    seen[static_cast<std::size_t>(position)] = true;
    const char* const name = list.param_ptr[position].def.name;
    if (previous != nullptr && std::strcmp(previous, name) >= 0)
      return "index in order, names unique";
    previous = name;
  }
  return nullptr;
}

// The first broken rule of the table of names, or null: each parameter stands in it once, by its name.
inline const char* broken_table_rule(const TEVPF_LIST& list) {
  if (list.names.slots == nullptr) return nullptr;
  std::int32_t used = 0;
  for (std::uint32_t i = 0; i <= list.names.mask; ++i) used += list.names.slots[i].position >= 0;
  if (used != list.num_params) return "table of names holds each parameter once";
  if (2 * static_cast<std::uint32_t>(used) > list.names.mask + 1) return "table of names half full";
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
