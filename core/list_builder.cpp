// Lists from their stored form.
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

// The parameters of a body, while their texts still lie in it, and room for their index.
struct StoredParams {
  Owned<TEVPF_PARAM> records;
  Owned<std::int32_t> index;
  std::int32_t count = 0;
  std::int32_t known = 0;  // those in front of the first one of an unknown type
};

// Takes the parameters off the body, up to the first one of an unknown type, whose size nobody
// knows. False when they do not fill the body.
bool parse_records(ByteReader body, StoredParams& params) noexcept {
  for (; params.known < params.count; ++params.known) {
    switch (parse_param(body, params.records[static_cast<std::size_t>(params.known)])) {
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

TEVPF_STATUS parse_params(const char* list_name, ByteReader body, std::int32_t count,
                          StoredParams& params) noexcept {
  if (count > body.left() / stored_size(kParamFields)) {  // whatever their types
    return fail(PF_BADFORMAT, list_name);
  }
  params.count = count;
  if (count > 0) {
    params.records = new_array<TEVPF_PARAM>(static_cast<std::uint64_t>(count));
    params.index = new_array<std::int32_t>(static_cast<std::uint64_t>(count));
    if (!params.records || !params.index) return fail_empty(PF_NOMEM);
  }
  return parse_records(body, params) ? PF_NORMAL : fail(PF_BADFORMAT, list_name);
}

// Gives the parameters, as they were parsed, texts of their own and counts them.
TEVPF_STATUS own_params(TEVPF_LIST& list, std::int32_t known, std::int32_t count) noexcept {
  while (list.num_params < known) {
    std::int32_t bytes = 0;
    PF_TRY(TEV8R1_construct_param(&list.param_ptr[list.num_params], &bytes));
    list.header.btf += bytes;
    ++list.num_params;
  }
  if (known == count) return PF_NORMAL;
  return fail(PF_BADTYPE, "parameter", Text(list.param_ptr[known].def.type));
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
  StoredParams params;
  PF_TRY(parse_params(header.elem_name, body, std::max(head.num_params, 0), params));

  header.btf = kListHead;
  TEVPF_LIST* list = nullptr;
  PF_TRY(TEV8R1_create_list(header, &list));
  std::memcpy(list->RESERVED, head.RESERVED, sizeof list->RESERVED);
  list->param_ptr = params.records.release();
  list->index_ptr = params.index.release();
  list->param_room = params.count;

  bool usable_index = false;
  TEVPF_STATUS status = own_params(*list, params.known, params.count);
  if (status == PF_NORMAL) status = read_name_index(*list, input, usable_index);
  if (!usable_index) sort_names(list->param_ptr, list->num_params, list->index_ptr);
  return status;
}

}  // namespace tevpf
