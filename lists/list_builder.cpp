#include "lists/list_builder.h"

#include <algorithm>
#include <cstring>
#include <utility>

#include "core/base/permutation.h"
#include "core/base/status.h"
#include "core/base/text_field.h"
#include "core/reader.h"
#include "lists/directory.h"
#include "lists/list_fields.h"
#include "lists/name_index.h"
#include "lists/param_record.h"
#include "lists/param_store.h"

namespace tevpf {

namespace {

constexpr std::size_t kTypePlace = stored_place(kParamFields, offsetof(TEVPF_PARAM, def.type));

// Parses the value of a string, whose length is in `def`, and its terminator. `to_come`: bytes of
// the body after the buffered ones.
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

// Parses the description if the stored desc_loc announces one.
Parsed parse_description(ByteReader& bytes, TEVPF_PARAM& param, TextSizes& sizes) noexcept {
  if (param.desc_loc == 0) return Parsed::kWhole;
  const std::int64_t before = bytes.left();
  param.def.description = const_cast<char*>(bytes.take_text());
  if (param.def.description == nullptr) return Parsed::kCutOff;
  sizes.description = before - bytes.left();
  // For a string, any nonzero place means that there is a description.
  const std::int8_t place = description_place(param.def);
  if (param.def.type != PF_TYPE_STRING && param.desc_loc != place) return Parsed::kBroken;
  param.desc_loc = place;
  return Parsed::kWhole;
}

// Parses one stored parameter. Its texts are not copied.
Parsed parse_param(ByteReader& bytes, std::int64_t to_come, TEVPF_PARAM& param,
                   TextSizes& sizes) noexcept {
  param = {};
  sizes = {};
  const unsigned char* fields = bytes.take(stored_size(kParamFields));
  if (fields == nullptr) return Parsed::kCutOff;
  unpack<kParamFields>(fields, &param);
  TEVPF_PARAM_DEF& def = param.def;
  // Loaded from the stored bytes, not from the record: the next steps depend on the type, and the
  // stores to the record may still be in flight.
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

// Buffers more of a body after the bytes that are still unparsed.
Parsed fetch_more(Body& body, ByteReader& at_hand) noexcept {
  body.take(body.at_hand().left() - at_hand.left());
  const Input::Got got = body.fetch_more();
  at_hand = body.at_hand();
  return got == Input::Got::kAll    ? Parsed::kWhole
         : got == Input::Got::kPart ? Parsed::kBroken
                                    : Parsed::kNoMemory;
}

// An upper bound for the bytes of texts in a body; the exact number is known only after parsing.
// The excess, up to 24 bytes per number, stays unused at the end of the list's text block.
std::int64_t text_room(const Body& body, std::int32_t count) noexcept {
  constexpr std::int32_t kLeastPart = value_type(PF_TYPE_STRING).param_part;
  return body.left() - std::int64_t{count} * (kParamHead + kLeastPart);
}

// Parses the parameters of the body, up to the first one of an unknown type, whose size cannot be
// determined, and copies their texts. The list counts the parameters taken and their bytes.
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

// Allocates the number of parameters that the body claims, if it can hold that many, and parses
// them.
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
    auto index = new_array<std::int32_t>(static_cast<std::uint64_t>(count));
    if (!index || !reserve_params(list, count)) return Parsed::kNoMemory;
    adopt_names(list, std::move(index), count);
  }
  const Parsed parsed = take_params(body, count, list);
  // A truncated body is invalid, whatever it contains.
  return parsed == Parsed::kUnknownType && !body.take_rest() ? Parsed::kBroken : parsed;
}

// Creates an element for the contents of a body. An invalid body creates none; one that was parsed
// only up to an unknown type does.
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

// Reads the name index; sets `usable` if it is valid.
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
