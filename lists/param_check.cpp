#include "lists/param_check.h"

#include "core/base/text_field.h"

namespace tevpf {
namespace {

template <class T>
TEVPF_STATUS check_number(const TEVPF_PARAM_DEF& definition) noexcept {
  const auto& part = number_part<T>(definition);
  if (!(part.max >= part.min)) return PF_BADRANGE;  // also when either is NaN
  if (part.value > part.max || part.value < part.min) return out_of_range<T>(part.value);
  if constexpr (kIsFloating<T>) {
    if (part.precision < 1) return fail(PF_BADPREC, Text(part.precision), definition.name);
  }
  return PF_NORMAL;
}

}  // namespace
}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_validate_param_def(const TEVPF_LIST*, TEVPF_PARAM_DEF definition) noexcept {
  terminate_field(definition.name);
  if (starts_with_blank(definition.name)) return fail_empty(PF_BADNAME);
  if (!is_value_type(definition.type)) return fail(PF_BADTYPE, "parameter", Text(definition.type));
  if (definition.type == PF_TYPE_STRING) return PF_NORMAL;
  return with_number(definition.type,
                     [&](auto tag) { return check_number<decltype(tag)>(definition); });
}
