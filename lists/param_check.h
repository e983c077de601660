// The checks on a parameter's definition and value.
#pragma once

#include "core/base/status.h"
#include "lists/list.h"
#include "values/value_text.h"

extern "C" {

// Checks a definition; the list is not consulted.
//   PF_BADNAME   the name starts with a blank; texts empty
//   PF_BADTYPE   no such value type; texts: "parameter", the type
//   PF_BADRANGE  max below min; texts as they were
//   PF_RANGE     value outside min..max; texts: the value, empty
//   PF_BADPREC   precision below 1; texts: the precision, the name
TEVPF_API TEVPF_STATUS TEV8R1_validate_param_def(const TEVPF_LIST* list,
                                                 TEVPF_PARAM_DEF definition) noexcept;
}

namespace tevpf {

// Reports a number outside its bounds.
template <class T>
[[nodiscard]] TEVPF_STATUS out_of_range(T value) noexcept {
  return fail(PF_RANGE, number_text(value));
}

}  // namespace tevpf
