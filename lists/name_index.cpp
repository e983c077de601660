#include "lists/name_index.h"

#include <algorithm>
#include <bit>
#include <cstring>
#include <numeric>

#include "core/base/status.h"
#include "core/base/text_word.h"
#include "lists/name_table.h"
#include "values/text_compare.h"
#include "values/value_type.h"

namespace tevpf {
namespace {

// A name to search for. Plain names are compared eight bytes at a time, as a zero-padded field; of
// a name too long for a field, only what fits is compared.
struct Wanted {
  explicit Wanted(const char* name) noexcept : pattern(make_pattern(name)) {
    std::memcpy(field, name, std::min(std::strlen(name), sizeof field));
  }

  TextPattern pattern;
  char field[TEVPF_NAME_SIZE] = {};
};

int first_bit(std::uint64_t word) noexcept { return word == 0 ? 64 : std::countr_zero(word); }

// The order of a record's name and a wanted one, as strcmp gives it. Reads whole fields: bytes
// after a terminator have no effect, because the lowest byte that differs or ends decides.
int compare_fields(const char (&name)[TEVPF_NAME_SIZE],
                   const char (&wanted)[TEVPF_NAME_SIZE]) noexcept {
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

// Searches `count` entries; entry(place) is the position there. Several names can match: after a
// match, the search continues before it, for the first one.
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
  return {found ? match : low, found};
}

NamePlace search_index(const TEVPF_PARAM* params, std::int32_t count, const std::int32_t* index,
                       const Wanted& wanted) noexcept {
  return search(params, count, wanted, [=](std::int32_t place) { return index[place]; });
}

}  // namespace

TEVPF_STATUS find_param(TEVPF_LIST& list, const char* name, std::int32_t& position) noexcept {
  const TextPattern pattern = make_pattern(name);
  std::int32_t found = -1;
  if (!pattern.prefix && table_answers(list)) {
    found = look_up(list, pattern);
  } else {
    const Wanted wanted(name);
    const NamePlace at = search_index(list.param_ptr, list.num_params, list.index_ptr, wanted);
    if (at.found) found = list.index_ptr[at.place];
  }
  if (found < 0) return fail(PF_NOPARAM, name);
  position = found;
  return PF_NORMAL;
}

NamePlace search_others(const TEVPF_LIST& list, std::int32_t without, const char* name) noexcept {
  const std::int32_t* const index = list.index_ptr;
  return search(list.param_ptr, list.num_params - 1, Wanted(name),
                [=](std::int32_t place) { return index[place < without ? place : place + 1]; });
}

void index_param(TEVPF_LIST& list, std::int32_t position, std::int32_t place) noexcept {
  const std::int32_t count = list.num_params;
  std::int32_t* const index = list.index_ptr;
  if (position < count) {
    drop_table(list.names);
    for (std::int32_t i = 0; i < count; ++i) index[i] += index[i] >= position;
  } else {
    append_name(list);
  }
  TEV8R1_insert_index_value(index, count, place, position);
}

void move_place(TEVPF_LIST& list, std::int32_t from, std::int32_t to) noexcept {
  drop_table(list.names);
  std::int32_t* const index = list.index_ptr;
  if (from < to) {
    std::rotate(index + from, index + from + 1, index + to + 1);
  } else {
    std::rotate(index + to, index + from, index + from + 1);
  }
}

void move_position(TEVPF_LIST& list, std::int32_t from, std::int32_t to) noexcept {
  drop_table(list.names);
  const std::int32_t first = std::min(from, to);
  const std::int32_t last = std::max(from, to);
  const std::int32_t step = from < to ? -1 : 1;
  const std::int32_t count = list.num_params;
  std::int32_t* const index = list.index_ptr;
  for (std::int32_t i = 0; i < count; ++i) {
    const std::int32_t position = index[i];
    if (position < first || position > last) continue;
    index[i] = position == from ? to : position + step;
  }
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
  const NamePlace at = search_index(params, count, index, Wanted(name));
  *place_out = at.place;
  return at.found ? TEVPF_STATUS{PF_NORMAL} : fail(PF_NOPARAM, name);
}

TEVPF_STATUS TEV8R1_get_param_ptr(TEVPF_LIST* list, const char* name, TEVPF_PARAM** param_out,
                                  std::int32_t* place_out) noexcept {
  PF_TRY(TEV8R1_list_binary_search(list->param_ptr, list->num_params, list->index_ptr, name,
                                   place_out));
  *param_out = &list->param_ptr[list->index_ptr[*place_out]];
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_remove_param_from_index(TEVPF_LIST* list, std::int32_t place) noexcept {
  drop_table(list->names);
  const std::int32_t count = list->num_params;
  std::int32_t* const index = list->index_ptr;
  const std::int32_t removed = index[place];
  for (std::int32_t i = 0; i < count; ++i) index[i] -= index[i] > removed;
  std::copy(index + place + 1, index + count, index + place);
  return PF_NORMAL;
}
