// Parameter values for callers that state the expected type.
#include "include/tevpf_access.h"
#include "lists/find.h"
#include "lists/param_record.h"

namespace tevpf {
namespace {

const char* word_of(std::int32_t type) noexcept {
  if (!is_value_type(type)) return "unknown";
  return type == PF_TYPE_STRING ? "string" : value_type(type).word;
}

std::size_t size_of_value(const TEVPF_PARAM_DEF& definition) noexcept {
  const bool is_string = definition.type == PF_TYPE_STRING;
  return static_cast<std::size_t>(
      value_size(definition.type, is_string ? definition.part.str.length : 0));
}

}  // namespace
}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS tevpf_get_value(const char* list_name, const char* param_name, std::int32_t type,
                             void* value_out, std::size_t size,
                             std::size_t* value_size_out) noexcept {
  TEVPF_LIST* list;
  std::int32_t slot;
  PF_TRY(find_param_of(list_name, param_name, list, slot));
  const TEVPF_PARAM_DEF& definition = param_in(*list, slot).def;
  if (definition.type != type) {
    return fail(PF_BADTYPE, {"parameter ", definition.name}, word_of(definition.type));
  }
  *value_size_out = size_of_value(definition);
  if (*value_size_out <= size) copy_value(definition, value_out);
  return PF_NORMAL;
}
