#include <algorithm>
#include <cstring>

#include "core/directory.h"
#include "core/element_builder.h"
#include "core/permutation.h"
#include "core/status.h"
#include "core/stored_form.h"
#include "core/text_field.h"
#include "lists/name_index.h"
#include "lists/param_record.h"

namespace tevpf {

namespace {

Parsed parse_string_value(ByteReader& body, TEVPF_PARAM_DEF& def) noexcept {
  const std::int32_t length = def.part.str.length;
  const unsigned char* text = length < 0 ? nullptr : body.take(std::int64_t{length} + 1);
  if (text == nullptr) return Parsed::kBroken;
  const void* terminator = std::memchr(text, '\0', static_cast<std::size_t>(length) + 1);
  if (terminator == nullptr) return Parsed::kBroken;
  // A terminator before the stated length ends the value.
  const std::ptrdiff_t real_length = static_cast<const unsigned char*>(terminator) - text;
  def.part.str.length = static_cast<std::int32_t>(real_length);
  def.part.str.value = const_cast<char*>(reinterpret_cast<const char*>(text));
  return Parsed::kWhole;
}

// Takes one stored parameter off the body. Its texts are left where they are in the body.
Parsed parse_param(ByteReader& body, TEVPF_PARAM& param) noexcept {
  param = {};
  const unsigned char* fields = body.take(stored_size(kParamFields));
  if (fields == nullptr) return Parsed::kBroken;
  unpack<kParamFields>(fields, &param);
  TEVPF_PARAM_DEF& def = param.def;
  if (!is_value_type(def.type)) return Parsed::kUnknownType;
  terminate_field(def.name);
  terminate_field(def.units);

  const std::int32_t part_bytes = value_type(def.type).param_part;
  const unsigned char* part = body.take(part_bytes);
  if (part == nullptr) return Parsed::kBroken;
  std::memcpy(&def.part, part, static_cast<std::size_t>(part_bytes));
  if (def.type == PF_TYPE_STRING && parse_string_value(body, def) != Parsed::kWhole) {
    return Parsed::kBroken;
  }
  if (param.desc_loc == 0) return Parsed::kWhole;
  def.description = const_cast<char*>(body.take_text());
  if (def.description == nullptr) return Parsed::kBroken;
  // Of a string, any place means that there is one.
  const std::int8_t place = description_place(def);
  if (def.type != PF_TYPE_STRING && param.desc_loc != place) return Parsed::kBroken;
  param.desc_loc = place;
  return Parsed::kWhole;
}

// Whether the parameters fill the body, up to the first one of an unknown type, whose size nobody knows.
bool is_well_formed(ByteReader body, std::int32_t num_params) noexcept {
  if (num_params > body.left() / kParamHead) return false;  // whatever their types
  TEVPF_PARAM param;
  for (std::int32_t i = 0; i < num_params; ++i) {
    switch (parse_param(body, param)) {
      case Parsed::kBroken:
        return false;
      case Parsed::kUnknownType:
        return true;
      case Parsed::kWhole:
        break;
    }
  }
  return body.left() == 0;
}

TEVPF_STATUS build_params(TEVPF_LIST& list, ByteReader body, std::int32_t num_params) noexcept {
  for (std::int32_t i = 0; i < num_params; ++i) {
    TEVPF_PARAM& param = list.param_ptr[i];
    if (parse_param(body, param) == Parsed::kUnknownType) {
      return fail(PF_BADTYPE, "parameter", Text(param.def.type));
    }
    std::int32_t bytes = 0;
    PF_TRY(TEV8R1_construct_param(&param, &bytes));
    list.header.btf += bytes;
    list.num_params = i + 1;
  }
  return PF_NORMAL;
}

// Reads the name index; `usable` when it is one.
TEVPF_STATUS read_name_index(TEVPF_LIST& list, Input& input, bool& usable) noexcept {
  const std::uint64_t bytes = static_cast<std::uint64_t>(list.num_params) * sizeof(std::int32_t);
  if (input.read(list.index_ptr, bytes) != bytes) return fail(PF_BADFORMAT, "list index");
  const std::optional<bool> answer = is_permutation(list.index_ptr, list.num_params);
  if (!answer) return fail_empty(PF_NOMEM);
  usable = *answer;
  return PF_NORMAL;
}

}  // namespace

TEVPF_STATUS build_list(TEVPF_ELEM_HEADER header, const void* body_bytes, Input& input) noexcept {
  if (header.btf < kListHead) return fail(PF_BADFORMAT, header.elem_name);
  ByteReader body(body_bytes, header.btf);
  TEVPF_LIST head;
  unpack<kListFields>(body.take(kListHead), &head);
  const std::int32_t num_params = std::max(head.num_params, 0);
  if (!is_well_formed(body, num_params)) return fail(PF_BADFORMAT, header.elem_name);

  header.btf = kListHead;
  TEVPF_LIST* list = nullptr;
  PF_TRY(TEV8R1_create_list(header, &list));
  std::memcpy(list->RESERVED, head.RESERVED, sizeof list->RESERVED);
  if (num_params == 0) return PF_NORMAL;

  const auto slots = static_cast<std::uint64_t>(num_params);
  Owned<TEVPF_PARAM> params = new_array<TEVPF_PARAM>(slots);
  Owned<std::int32_t> index = new_array<std::int32_t>(slots);
  if (!params || !index) return fail_empty(PF_NOMEM);
  list->param_ptr = params.release();
  list->index_ptr = index.release();
  list->param_room = num_params;

  bool usable_index = false;
  TEVPF_STATUS status = build_params(*list, body, num_params);
  if (status == PF_NORMAL) status = read_name_index(*list, input, usable_index);
  if (!usable_index) sort_names(list->param_ptr, list->num_params, list->index_ptr);
  return status;
}

}  // namespace tevpf
