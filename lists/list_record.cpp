// Whole list records: their release, their copy and their first storage.
#include <algorithm>
#include <cstring>
#include <utility>

#include "core/base/heap.h"
#include "core/base/text_field.h"
#include "lists/default_table.h"
#include "lists/list.h"
#include "lists/name_index.h"
#include "lists/name_table.h"
#include "lists/param_record.h"
#include "lists/param_store.h"

namespace tevpf {
namespace {

// Bytes of all texts of a list: btf minus the part that the types determine.
std::int64_t text_bytes(const TEVPF_LIST& list) noexcept {
  std::int64_t bytes = list.header.btf - kListHead;
  for (std::int32_t i = 0; i < list.num_params; ++i) {
    bytes -= stored_size(list.param_ptr[i].def.type, TextSizes{});
  }
  return bytes;
}

// Copies the records into `half`; its num_params counts the complete ones.
bool copy_params(const TEVPF_LIST& source, TEVPF_LIST& half) noexcept {
  if (!reserve_params(half, source.num_params)) return false;
  TextPacker packer;
  if (!packer.reserve(text_bytes(source), half.texts)) return false;
  for (std::int32_t& i = half.num_params; i < source.num_params; ++i) {
    TEVPF_PARAM_DEF& definition = (half.param_ptr[i] = source.param_ptr[i]).def;
    if (!own_texts(definition, text_sizes(definition), packer, half.texts)) return false;
  }
  return true;
}

bool copy_index(const TEVPF_LIST& source, TEVPF_LIST& half) noexcept {
  const auto count = static_cast<std::uint64_t>(source.num_params);
  auto index = new_array<std::int32_t>(count);
  if (!index) return false;
  std::copy_n(source.index_ptr, count, index.get());
  adopt_names(half, std::move(index), source.num_params);
  half.index.in_order = source.index.in_order;
  return true;
}

}  // namespace

void release_contents(TEVPF_LIST& list) noexcept {
  release_params(list);
  heap_free(list.texts.begin);
  release_defaults(list.dft_ptr);
  drop_table(list.names);
  list.index.order.clear();
}

void release_list(TEVPF_LIST* list) noexcept {
  if (list == nullptr) return;
  release_contents(*list);
  heap_free(list);
}

bool copy_list_body(const TEVPF_LIST& source, TEVPF_LIST& copy) noexcept {
  TEVPF_LIST half{};
  if (source.num_params > 0) {
    if (!copy_params(source, half) || !copy_index(source, half) ||
        !copy_defaults(source.dft_ptr, half.dft_ptr)) {
      release_contents(half);
      return false;
    }
  }
  half.header = source.header;
  set_field(half.header.elem_name, copy.header.elem_name);
  std::memcpy(half.RESERVED, source.RESERVED, sizeof half.RESERVED);
  half.cur_param = source.cur_param;
  copy = half;
  return true;
}

bool reserve_first_params(TEVPF_LIST& list, std::int32_t slots) noexcept {
  const auto count = static_cast<std::uint64_t>(slots);
  Owned<TEVPF_PARAM> params = new_zeroed<TEVPF_PARAM>(count);
  Owned<std::int32_t> index = new_zeroed<std::int32_t>(count);
  if (!params || !index) return false;
  adopt_params(list, std::move(params), slots);
  adopt_names(list, std::move(index), slots);
  list.free_params = slots;
  return true;
}

}  // namespace tevpf
