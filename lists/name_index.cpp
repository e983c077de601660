#include "lists/name_index.h"

#include <algorithm>
#include <cstring>
#include <numeric>

#include "core/status.h"
#include "values/text_compare.h"

namespace tevpf {
namespace {

// Searches `count` entries; entry(place) gives the position there. Several names can match: once one
// has been met, the search goes on among those before it, for the first one.
template <class Entry>
NamePlace search(const TEVPF_PARAM* params, std::int32_t count, const TextPattern& wanted,
                 Entry entry) noexcept {
  std::int32_t low = 0;
  std::int32_t high = count - 1;
  bool found = false;
  std::int32_t match = 0;
  while (low <= high) {
    const std::int32_t middle = low + (high - low) / 2;
    const int order = compare_text(params[entry(middle)].def.name, wanted);
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
                       const TextPattern& wanted) noexcept {
  return search(params, count, wanted, [=](std::int32_t place) { return index[place]; });
}

}  // namespace

TEVPF_STATUS find_param(TEVPF_LIST& list, const char* name, std::int32_t& position) noexcept {
  const TextPattern wanted = make_pattern(name);
  std::int32_t found = -1;
  if (!wanted.prefix && table_answers(list)) {
    found = look_up(list, wanted);
  } else {
    const NamePlace at = search_index(list.param_ptr, list.num_params, list.index_ptr, wanted);
    if (at.found) found = list.index_ptr[at.place];
  }
  if (found < 0) return fail(PF_NOPARAM, name);
  position = found;
  return PF_NORMAL;
}

NamePlace search_others(const TEVPF_LIST& list, std::int32_t without, const char* name) noexcept {
  const std::int32_t* const index = list.index_ptr;
  return search(list.param_ptr, list.num_params - 1, make_pattern(name),
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
  const NamePlace at = search_index(params, count, index, make_pattern(name));
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
  TEV8R1_memcpy((count - place - 1) * static_cast<std::int32_t>(sizeof *index), index + place + 1,
                index + place);
  return PF_NORMAL;
}
