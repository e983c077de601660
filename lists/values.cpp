// Values of parameters, in binary form and from text.
#include <cstring>

#include "core/base/heap.h"
#include "core/base/status.h"
#include "lists/find.h"
#include "lists/param_check.h"
#include "lists/param_record.h"
#include "values/value_type.h"

namespace tevpf {
namespace {

TEVPF_STATUS bad_type(std::int32_t type) noexcept {
  return fail(PF_BADTYPE, "parameter", Text(type));
}

// Bounds are inclusive and exact; NaN is out of range for any bounds.
template <class T>
TEVPF_STATUS change_number(TEVPF_PARAM_DEF& definition, T value) noexcept {
  auto& part = number_part<T>(definition);
  if (part.max < part.min) return PF_BADRANGE;
  if (!(value >= part.min && value <= part.max)) return out_of_range(value);
  part.value = value;
  return PF_NORMAL;
}

TEVPF_STATUS change_string(TEVPF_LIST& list, TEVPF_PARAM_DEF& definition,
                           const char* value) noexcept {
  auto& string = definition.part.str;
  const std::size_t length = std::strlen(value);
  const std::int64_t growth = static_cast<std::int64_t>(length) - string.length;
  NewText text;
  if (!btf_can_change(list, growth) ||
      !text.prepare(value, length, static_cast<std::size_t>(string.length) + 1)) {
    return fail_empty(PF_NOMEM);
  }
  string.value = text.commit(string.value, list.texts);
  string.length = static_cast<std::int32_t>(length);
  list.header.btf += static_cast<std::int32_t>(growth);
  return PF_NORMAL;
}

template <class T>
TEVPF_STATUS number_from_text(std::int32_t type, const char* text,
                              TEVPF_PARAM_DEF& definition) noexcept {
  auto& part = number_part<T>(definition);
  T value = part.value;  // empty text leaves a real or double unchanged
  PF_TRY(TEV8R1_from_char(type, text, &value));
  part.value = value;
  return PF_NORMAL;
}

}  // namespace
}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_PF_modify_param(const char* list_name, const char* param_name,
                                    const void* value) noexcept {
  TEVPF_LIST* list;
  std::int32_t slot;
  PF_TRY(find_param_of(list_name, param_name, list, slot));

  TEVPF_PARAM_DEF& definition = param_in(*list, slot).def;
  if (!is_value_type(definition.type)) return bad_type(definition.type);
  if (definition.type == PF_TYPE_STRING) {
    return change_string(*list, definition, static_cast<const char*>(value));
  }
  return with_number(definition.type, [&](auto tag) {
    return change_number(definition, load<decltype(tag)>(value));
  });
}

TEVPF_STATUS TEV8R1_PF_get_param_value(const char* list_name, const char* param_name,
                                       void* value_out) noexcept {
  TEVPF_LIST* list;
  std::int32_t slot;
  PF_TRY(find_param_of(list_name, param_name, list, slot));
  list->cur_param = position_of(*list, slot);
  copy_value(param_in(*list, slot).def, value_out);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_load_param_value(const TEVPF_PARAM_DEF* definition, void* value_out) noexcept {
  if (!is_value_type(definition->type)) return bad_type(definition->type);
  TEVPF_PARAM_DEF measured = *definition;
  PF_TRY(normalise(measured));
  copy_value(measured, value_out);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_store_param_value(std::int32_t type, const char* text,
                                      TEVPF_PARAM_DEF* definition) noexcept {
  if (!is_value_type(type)) return bad_type(type);
  if (type == PF_TYPE_STRING) {
    char* const copy = heap_copy(text);
    if (copy == nullptr) return fail_empty(PF_NOMEM);
    definition->part.str.value = copy;
    return PF_NORMAL;
  }
  return with_number(
      type, [&](auto tag) { return number_from_text<decltype(tag)>(type, text, *definition); });
}
