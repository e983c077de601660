#include "lists/settle.h"

#include <algorithm>

#include "core/base/heap.h"
#include "lists/directory.h"
#include "lists/name_index.h"
#include "lists/name_table.h"
#include "lists/param_store.h"

namespace tevpf {
namespace {

std::int32_t wanted_room(const TEVPF_LIST& list) noexcept {
  const std::int64_t room = std::int64_t{list.num_params} + std::max(list.free_params, 0);
  return static_cast<std::int32_t>(std::min<std::int64_t>(room, INT32_MAX));
}

bool is_settled(const TEVPF_LIST& list, std::int32_t room) noexcept {
  const Sequence& names = list.index.order;
  return is_in_place(list) && (room == 0 || (names.items != nullptr && names.room >= room));
}

// The position of the parameter in each slot.
Owned<std::int32_t> number_slots(const TEVPF_LIST& list) noexcept {
  auto numbers = new_array<std::int32_t>(static_cast<std::uint64_t>(list.num_params) +
                                         static_cast<std::uint64_t>(list.slots.num_free));
  if (!numbers) return numbers;
  std::int32_t position = 0;
  for_each_slot(list,
                [&](std::int32_t slot) { numbers[static_cast<std::size_t>(slot)] = position++; });
  return numbers;
}

// Moves the parameters into position order; the name index is flat.
bool order_params(TEVPF_LIST& list, std::int32_t room) noexcept {
  auto params = new_array<TEVPF_PARAM>(static_cast<std::uint64_t>(room));
  const Owned<std::int32_t> numbers = number_slots(list);
  if (!params || !numbers) return false;
  const auto position_in = [&](std::int32_t slot) {
    return numbers[static_cast<std::size_t>(slot)];
  };
  copy_params_to(list, params.get());
  std::transform(list.index_ptr, list.index_ptr + list.num_params, list.index_ptr, position_in);
  renumber_table(list.names, numbers.get());
  adopt_params(list, std::move(params), room);
  return true;
}

}  // namespace

bool settle(TEVPF_LIST& list) noexcept {
  const std::int32_t room = wanted_room(list);
  if (is_settled(list, room)) return true;
  list.slots.reads = 0;
  if (room > 0 && !flatten_names(list, room)) return false;
  return is_in_place(list) || order_params(list, room);
}

// Reading a parameter through blocks costs some tens of nanoseconds more; settling costs about a
// hundred for each. When out of memory, the list stays unsettled until as many more reads.
void count_read(TEVPF_LIST& list) noexcept {
  constexpr std::int64_t kReadsPerParam = 4;
  if (++list.slots.reads > kReadsPerParam * list.num_params) (void)settle(list);
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_get_list_ptr(const char* name, TEVPF_LIST** list_out) noexcept {
  TEVPF_LIST* list;
  PF_TRY(find_list(name, list));
  if (!settle(*list)) return fail_empty(PF_NOMEM);
  *list_out = list;
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_get_param_ptr(TEVPF_LIST* list, const char* name, TEVPF_PARAM** param_out,
                                  std::int32_t* place_out) noexcept {
  if (!settle(*list)) return fail_empty(PF_NOMEM);
  PF_TRY(TEV8R1_list_binary_search(list->param_ptr, list->num_params, list->index_ptr, name,
                                   place_out));
  *param_out = list->param_ptr + list->index_ptr[*place_out];
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_remove_param_from_index(TEVPF_LIST* list, std::int32_t place) noexcept {
  if (!settle(*list)) return fail_empty(PF_NOMEM);
  drop_table(list->names);
  const std::int32_t count = list->num_params;
  std::int32_t* const index = list->index_ptr;
  const std::int32_t removed = index[place];
  for (std::int32_t i = 0; i < count; ++i) index[i] -= index[i] > removed;
  std::copy(index + place + 1, index + count, index + place);
  return PF_NORMAL;
}
