#include "lists/list_builder.h"

#include <algorithm>
#include <cstring>

#include "core/base/permutation.h"
#include "core/base/status.h"
#include "core/base/text_field.h"
#include "core/reader.h"
#include "lists/directory.h"
#include "lists/list_fields.h"
#include "lists/name_index.h"
#include "lists/param_record.h"

namespace tevpf {

namespace {

constexpr std::size_t kTypePlace = stored_place(kParamFields, offsetof(TEVPF_PARAM, def.type));

// Takes the value of a string, whose length stands in `def`, and the terminator behind it. `to_come`:
// bytes of the body behind those at hand.
Parsed parse_string_value(ByteReader& bytes, std::int64_t to_come, TEVPF_PARAM_DEF& def) noexcept {
  const std::int32_t length = def.part.str.length;
  if (length < 0 || length >= bytes.left() + to_come) return Parsed::kBroken;
  const unsigned char* text = bytes.take(std::int64_t{length} + 1);
  if (text == nullptr) return Parsed::kCutOff;
  // A terminator before the stated length ends the value.
  ByteReader value(text, std::int64_t{length} + 1);
  def.part.str.value = const_cast<char*>(value.take_text());
  if (def.part.str.value == nullptr) return Parsed::kBroken;
  def.part.str.length = length - static_cast<std::int32_t>(value.left());
  return Parsed::kWhole;
}

// Takes the description that desc_loc, as it was read, speaks of.
Parsed parse_description(ByteReader& bytes, TEVPF_PARAM& param, TextSizes& sizes) noexcept {
  if (param.desc_loc == 0) return Parsed::kWhole;
  const std::int64_t before = bytes.left();
  param.def.description = const_cast<char*>(bytes.take_text());
  if (param.def.description == nullptr) return Parsed::kCutOff;
  sizes.description = before - bytes.left();
  // Of a string, any place means that there is one.
  const std::int8_t place = description_place(param.def);
  if (param.def.type != PF_TYPE_STRING && param.desc_loc != place) return Parsed::kBroken;
  param.desc_loc = place;
  return Parsed::kWhole;
}

// Takes one stored parameter. Its texts are left where they are.
Parsed parse_param(ByteReader& bytes, std::int64_t to_come, TEVPF_PARAM& param,
                   TextSizes& sizes) noexcept {
  param = {};
  sizes = {};
  const unsigned char* fields = bytes.take(stored_size(kParamFields));
  if (fields == nullptr) return Parsed::kCutOff;
  unpack<kParamFields>(fields, &param);
  TEVPF_PARAM_DEF& def = param.def;
  // Not from the record: what comes next waits for the type, and the record is still being written.
  const auto type = load<std::int32_t>(fields + kTypePlace);
  if (!is_value_type(type)) return Parsed::kUnknownType;
  terminate_field(def.name);
  terminate_field(def.units);

  const unsigned char* part = bytes.take(value_type(type).param_part);
  if (part == nullptr) return Parsed::kCutOff;
  if (type == PF_TYPE_STRING) {
    def.part.str.length = load<std::int32_t>(part);
    const Parsed parsed = parse_string_value(bytes, to_come, def);
    if (parsed != Parsed::kWhole) return parsed;
    sizes.value = std::int64_t{def.part.str.length} + 1;
  } else {
    with_number(type, [&](auto tag) {
      auto& numbers = number_part<decltype(tag)>(def);
      std::memcpy(&numbers, part, sizeof numbers);
    });
  }
  return parse_description(bytes, param, sizes);
}

// Gets more of a body to hand behind what is left at hand.
Parsed fetch_more(Body& body, ByteReader& at_hand) noexcept {
  body.take(body.at_hand().left() - at_hand.left());
  const Input::Got got = body.fetch_more();
  at_hand = body.at_hand();
  return got == Input::Got::kAll    ? Parsed::kWhole
         : got == Input::Got::kPart ? Parsed::kBroken
                                    : Parsed::kNoMemory;
}

// How many of a body's bytes can be texts, at most: their number is known when it has been gone
// through. What is too much, up to 24 bytes a number, stays at the end of the list's text block.
std::int64_t text_room(const Body& body, std::int32_t count) noexcept {
  constexpr std::int32_t kLeastPart = value_type(PF_TYPE_STRING).param_part;
  return body.left() - std::int64_t{count} * (kParamHead + kLeastPart);
}

// Takes the parameters off the body, up to the first one of an unknown type, whose size nobody
// knows, and gives them texts of their own. The list counts those it has got, and their bytes.
Parsed take_params(Body& body, std::int32_t count, TEVPF_LIST& list) noexcept {
  TextPacker packer;
  if (!packer.reserve(text_room(body, count), list.texts)) return Parsed::kNoMemory;
  ByteReader at_hand = body.at_hand();
  std::int64_t to_come = body.left() - at_hand.left();
  while (list.num_params < count) {
    TEVPF_PARAM& param = list.param_ptr[list.num_params];
    TextSizes sizes;
    ByteReader behind = at_hand;
    Parsed parsed = parse_param(behind, to_come, param, sizes);
    if (parsed == Parsed::kCutOff) {
      parsed = fetch_more(body, at_hand);
      to_come = body.left() - at_hand.left();
      if (parsed == Parsed::kWhole) continue;
    }
    if (parsed == Parsed::kUnknownType) packer.finish(list.texts);
    if (parsed != Parsed::kWhole) return parsed;
    if (!own_texts(param.def, sizes, packer, list.texts)) return Parsed::kNoMemory;
    list.header.btf += static_cast<std::int32_t>(stored_size(param.def.type, sizes));
    ++list.num_params;
    at_hand = behind;
  }
  packer.finish(list.texts);
  body.take(body.at_hand().left() - at_hand.left());
  return body.left() == 0 ? Parsed::kWhole : Parsed::kBroken;
}

// Makes room for the parameters that the body claims, when it can hold so many, and takes them.
Parsed take_body(Body& body, TEVPF_LIST& list) noexcept {
  if (list.header.btf < kListHead) return Parsed::kBroken;
  const unsigned char* const fields = body.take_fields(kListHead);
  if (fields == nullptr) return Parsed::kBroken;
  TEVPF_LIST head;
  unpack<kListFields>(fields, &head);
  std::memcpy(list.RESERVED, head.RESERVED, sizeof list.RESERVED);
  list.header.btf = kListHead;
  const std::int32_t count = std::max(head.num_params, 0);
  if (count > body.left() / stored_size(kParamFields))
    return Parsed::kBroken;  // whatever their types
  if (count != 0) {
    list.param_ptr = new_array<TEVPF_PARAM>(static_cast<std::uint64_t>(count)).release();
    list.index_ptr = new_array<std::int32_t>(static_cast<std::uint64_t>(count)).release();
    if (list.param_ptr == nullptr || list.index_ptr == nullptr) return Parsed::kNoMemory;
    list.param_room = count;
  }
  const Parsed parsed = take_params(body, count, list);
  // A body that is cut short is none, whatever stands in it.
  return parsed == Parsed::kUnknownType && !body.take_rest() ? Parsed::kBroken : parsed;
}

// Gives what a body held an element of its own. A body that is no list makes none; one that is cut
// short by an unknown type does.
TEVPF_STATUS create(Parsed parsed, const TEVPF_LIST& loaded, TEVPF_LIST*& list) noexcept {
  if (parsed == Parsed::kNoMemory) return fail_empty(PF_NOMEM);
  if (parsed == Parsed::kBroken) return fail(PF_BADFORMAT, loaded.header.elem_name);
  PF_TRY(TEV8R1_create_list(loaded.header, &list));
  const TEVPF_LIST created = *list;
  *list = loaded;
  list->header = created.header;
  list->cur_param = created.cur_param;
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

TEVPF_STATUS build_list(const TEVPF_ELEM_HEADER& header, Body body, Input& input) noexcept {
  TEVPF_LIST loaded{};
  loaded.header = header;
  const Parsed parsed = take_body(body, loaded);
  TEVPF_LIST* list = nullptr;
  TEVPF_STATUS status = create(parsed, loaded, list);
  if (status != PF_NORMAL) {
    release_contents(loaded);
    return status;
  }

  bool usable_index = false;
  if (parsed == Parsed::kWhole) {
    status = read_name_index(*list, input, usable_index);
  } else {
    status = fail(PF_BADTYPE, "parameter", Text(list->param_ptr[list->num_params].def.type));
  }
  if (!usable_index) sort_names(list->param_ptr, list->num_params, list->index_ptr);
  return status;
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_format_list(TEVPF_ELEM_HEADER header, const void* body,
                                std::FILE* stream) noexcept {
  Input input(stream);
  terminate_texts(header);
  return build_list(header, Body(body, header.btf), input);
}
