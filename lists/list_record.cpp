// Whole list records: their release, their copy and their first storage.
#include <cstring>

#include "core/base/heap.h"
#include "core/base/text_field.h"
#include "lists/default_table.h"
#include "lists/list.h"
#include "lists/name_table.h"
#include "lists/param_record.h"

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
  half.param_ptr = new_array<TEVPF_PARAM>(static_cast<std::uint32_t>(source.num_params)).release();
  TextPacker packer;
  if (half.param_ptr == nullptr || !packer.reserve(text_bytes(source), half.texts)) return false;
  for (std::int32_t& i = half.num_params; i < source.num_params; ++i) {
    TEVPF_PARAM_DEF& definition = (half.param_ptr[i] = source.param_ptr[i]).def;
    if (!own_texts(definition, text_sizes(definition), packer, half.texts)) return false;
  }
  return true;
}

bool copy_index(const TEVPF_LIST& source, TEVPF_LIST& half) noexcept {
  half.index_ptr = static_cast<std::int32_t*>(heap_copy(
      source.index_ptr,
      std::uint64_t{sizeof(std::int32_t)} * static_cast<std::uint32_t>(source.num_params)));
  return half.index_ptr != nullptr;
}

}  // namespace

void release_contents(TEVPF_LIST& list) noexcept {
  if (list.param_ptr != nullptr) {
    for (std::int32_t i = 0; i < list.num_params; ++i)
      release_texts(list.param_ptr[i].def, list.texts);
  }
  heap_free(list.texts.begin);
  release_defaults(list.dft_ptr);
  drop_table(list.names);
  heap_free(list.index_ptr);
  heap_free(list.param_ptr);
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
  half.param_room = half.num_params;
  half.names.in_order = source.names.in_order;
  copy = half;
  return true;
}

bool reserve_first_params(TEVPF_LIST& list, std::int32_t slots) noexcept {
  Owned<TEVPF_PARAM> params = new_zeroed<TEVPF_PARAM>(static_cast<std::uint32_t>(slots));
  Owned<std::int32_t> index = new_zeroed<std::int32_t>(static_cast<std::uint32_t>(slots));
  if (!params || !index) return false;
  list.param_ptr = params.release();
  list.index_ptr = index.release();
  list.free_params = slots;
  list.param_room = slots;
  return true;
}

}  // namespace tevpf
