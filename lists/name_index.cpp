#include "lists/name_index.h"

#include <algorithm>
#include <bit>
#include <cstring>
#include <numeric>
#include <utility>

#include "core/base/status.h"
#include "core/base/text_word.h"
#include "core/sequence/sequence_search.h"
#include "lists/name_keys.h"
#include "lists/name_table.h"
#include "lists/param_store.h"
#include "values/text_compare.h"
#include "values/value_type.h"

namespace tevpf {
namespace {

// A name to search for. Plain names are compared eight bytes at a time, as a zero-padded field; of
// a name too long for a field, only what fits is compared.
struct Wanted {
  explicit Wanted(const char* name) noexcept : pattern(make_pattern(name)) {
    std::memcpy(field, name, std::min(pattern.length, sizeof field));
  }

  TextPattern pattern;
  NameField field = {};  // without the "*" of a prefix
};

int first_bit(std::uint64_t word) noexcept { return word == 0 ? 64 : std::countr_zero(word); }

// The order of a record's name and a wanted one, as strcmp gives it. Reads whole fields: bytes
// after a terminator have no effect, because the lowest byte that differs or ends decides.
int compare_fields(const NameField& name, const NameField& wanted) noexcept {
  for (const std::size_t offset : {std::size_t{0}, std::size_t{8}, sizeof name - 8}) {
    const std::uint64_t a = load_word(name + offset);
    const std::uint64_t b = load_word(wanted + offset);
    const int difference = first_bit(a ^ b) & ~7;
    const int end = first_bit(zero_bytes(b)) & ~7;
    if (difference <= end && difference < 64) {
      return static_cast<int>((a >> difference) & 0xFF) -
             static_cast<int>((b >> difference) & 0xFF);
    }
    if (end < 64) return 0;
  }
  return -1;  // the wanted name is longer than any field
}

int order_of(const TEVPF_PARAM& param, const Wanted& wanted) noexcept {
  return wanted.pattern.prefix ? compare_text(param.def.name, wanted.pattern)
                               : compare_fields(param.def.name, wanted.field);
}

// The search as documented, of `count` entries; entry(place) is the slot there. Several names can
// match: after a match, the search continues before it, for the first one.
template <class Entry>
NamePlace search(const TEVPF_PARAM* params, std::int32_t count, const Wanted& wanted,
                 Entry entry) noexcept {
  std::int32_t low = 0;
  std::int32_t high = count - 1;
  bool found = false;
  std::int32_t match = 0;
  while (low <= high) {
    const std::int32_t middle = low + (high - low) / 2;
    const int order = order_of(params[entry(middle)], wanted);
    if (order < 0) {
      low = middle + 1;
      continue;
    }
    high = middle - 1;
    if (order == 0) {
      found = true;
      match = middle;
    }
  }
  return {{found ? match : low}, found};
}

// ---- Keys of blocks -----------------------------------------------------------------------------

std::int32_t beginning_length(const TEVPF_LIST& list) noexcept {
  return list.index.beginning_length;
}

NameKey key_in_slot(const TEVPF_LIST& list, std::int32_t slot) noexcept {
  return key_of_name(param_in(list, slot).def.name, beginning_length(list));
}

// What the first name and the last one have in common, all those between them have.
void find_beginning(TEVPF_LIST& list) noexcept {
  NameIndex& index = list.index;
  const TEVPF_PARAM& last = param_in(list, index.order.at(list.num_params - 1));
  std::memcpy(index.beginning, param_in(list, index.order.at(0)).def.name, sizeof index.beginning);
  index.beginning_length = static_cast<std::uint8_t>(common_length(index.beginning, last.def.name));
}

// Before a name enters the index. One that begins differently makes all keys useless.
void admit(NameIndex& index, const NameField& name) noexcept {
  if (index.order.blocks == nullptr) return;
  const std::int32_t length = common_length(index.beginning, name);
  if (length >= index.beginning_length) return;
  index.beginning_length = static_cast<std::uint8_t>(length);
  index.order.blocks->drop_all_keys();
}

// A key to compare with those of the list, also for a name that does not begin as they do: it is
// less or greater than all of them, or equal to some, where the names decide.
NameKey wanted_key(const NameIndex& index, const Wanted& wanted) noexcept {
  const std::int32_t length = index.beginning_length;
  const std::int32_t same = std::min(common_length(index.beginning, wanted.field), length);
  if (same == length) return key_of_name(wanted.field, length);
  const auto byte = [&](const NameField& name) { return static_cast<unsigned char>(name[same]); };
  return byte(wanted.field) < byte(index.beginning) ? 0 : ~NameKey{0};
}

// Blocks are searched as ordered ones.
NamePlace search_blocks(TEVPF_LIST& list, const Wanted& wanted) noexcept {
  Sequence& order = list.index.order;
  const std::int32_t count = list.num_params;
  if (count > 0 && order.blocks->key_size == 0) find_beginning(list);
  const NameKey key = wanted_key(list.index, wanted);
  bool met = false;  // the key; where that is not so, the name is not there
  const SequencePlace place = search_keys(
      order, count, [&](std::int32_t slot) { return key_in_slot(list, slot); },
      [&](NameKey other, std::int32_t slot) {
        if (other != key) return other < key;
        met = true;
        return order_of(param_in(list, slot), wanted) < 0;
      });
  if (!met && !wanted.pattern.prefix) return {place, false};
  const bool found =
      place.position < count && order_of(param_in(list, order.at(place)), wanted) == 0;
  return {place, found};
}

NamePlace search_all(TEVPF_LIST& list, const Wanted& wanted) noexcept {
  const Sequence& order = list.index.order;
  if (order.blocks != nullptr) return search_blocks(list, wanted);
  return search(list.param_ptr, list.num_params, wanted,
                [&](std::int32_t place) { return order.at(place); });
}

// After anything that can replace the array of the index.
void show_array(TEVPF_LIST& list) noexcept { list.index_ptr = list.index.order.items; }

}  // namespace

// ---- Searching ----------------------------------------------------------------------------------

TEVPF_STATUS find_param(TEVPF_LIST& list, const char* name, std::int32_t& slot) noexcept {
  const TextPattern pattern = make_pattern(name);
  std::int32_t found = -1;
  if (!pattern.prefix && table_answers(list)) {
    found = look_up(list, pattern);
  } else {
    const NamePlace at = search_all(list, Wanted(name));
    if (at.found) found = list.index.order.at(at.place);
  }
  if (found < 0) return fail(PF_NOPARAM, name);
  slot = found;
  return PF_NORMAL;
}

NamePlace search_names(TEVPF_LIST& list, const char* name) noexcept {
  return search_all(list, Wanted(name));
}

NamePlace search_others(TEVPF_LIST& list, std::int32_t without, const char* name) noexcept {
  const Sequence& order = list.index.order;
  const std::int32_t others = list.num_params - 1;
  const Wanted wanted(name);
  const auto entry = [&](std::int32_t place) {
    return order.at(place < without ? place : place + 1);
  };
  if (order.blocks == nullptr) return search(list.param_ptr, others, wanted, entry);
  std::int32_t at = search_blocks(list, wanted).place.position;
  if (without < at) --at;
  return {{at}, at < others && order_of(param_in(list, entry(at)), wanted) == 0};
}

// ---- Changes ------------------------------------------------------------------------------------

bool ready_to_insert_name(TEVPF_LIST& list, std::int32_t place, std::int32_t slot) noexcept {
  reserve_entry(list);
  const bool ready = list.index.order.make_ready_to_insert(list.num_params, place, slot);
  show_array(list);
  return ready;
}

bool ready_to_erase_name(TEVPF_LIST& list, std::int32_t place) noexcept {
  const bool ready = list.index.order.make_ready_to_erase(list.num_params, place);
  show_array(list);
  return ready;
}

bool ready_to_move_name(TEVPF_LIST& list, std::int32_t from, std::int32_t to) noexcept {
  const bool ready = list.index.order.make_ready_to_move(list.num_params, from, to);
  show_array(list);
  return ready;
}

void insert_name(TEVPF_LIST& list, const SequencePlace& place, std::int32_t slot) noexcept {
  if (list.num_params == 0) list.index.in_order = 1;  // and stays 1: names are inserted in order
  admit(list.index, param_in(list, slot).def.name);
  const NameKey key = key_in_slot(list, slot);
  list.index.order.insert(list.num_params, place, slot, &key);
  enter_name(list, slot);
}

void erase_name(TEVPF_LIST& list, const SequencePlace& place, std::int32_t slot) noexcept {
  remove_name(list, slot);
  list.index.order.erase(list.num_params, place);
  if (list.num_params == 1) list.index.order.clear();
  show_array(list);
}

void change_name(TEVPF_LIST& list, std::int32_t from, std::int32_t to,
                 const NameField& name) noexcept {
  const std::int32_t slot = list.index.order.at(from);
  remove_name(list, slot);
  admit(list.index, name);
  const NameKey key = key_of_name(name, beginning_length(list));
  list.index.order.move(from, to, &key);
  std::memcpy(param_in(list, slot).def.name, name, sizeof name);
  enter_name(list, slot);
}

// ---- The whole ----------------------------------------------------------------------------------

bool flatten_names(TEVPF_LIST& list, std::int32_t room) noexcept {
  const bool flat = list.index.order.flatten(list.num_params, room);
  show_array(list);
  return flat;
}

void adopt_names(TEVPF_LIST& list, Owned<std::int32_t> index, std::int32_t room) noexcept {
  list.index.order.adopt(std::move(index), room);
  show_array(list);
}

void sort_names(const TEVPF_PARAM* params, std::int32_t count, std::int32_t* index) noexcept {
  std::iota(index, index + count, 0);
  std::sort(index, index + count, [=](std::int32_t a, std::int32_t b) {
    const int order = std::strcmp(params[a].def.name, params[b].def.name);
    return order != 0 ? order < 0 : a < b;
  });
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_list_binary_search(const TEVPF_PARAM* params, std::int32_t count,
                                       const std::int32_t* index, const char* name,
                                       std::int32_t* place_out) noexcept {
  const NamePlace at =
      search(params, count, Wanted(name), [=](std::int32_t place) { return index[place]; });
  *place_out = at.place.position;
  return at.found ? TEVPF_STATUS{PF_NORMAL} : fail(PF_NOPARAM, name);
}
