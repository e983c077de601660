// The stored fields of lists and parameters.
//
//   list        the element's header, kListFields, the parameters, the name index
//   parameter   kParamFields, the first param_part bytes of `part`, for strings the text and its
//               terminator, [the description and its terminator]
#pragma once

#include "core/stored_form.h"
#include "lists/list.h"
#include "lists/param_record.h"

namespace tevpf {

inline constexpr Field kListFields[] = {
    {offsetof(TEVPF_LIST, num_params), 4},
    {offsetof(TEVPF_LIST, RESERVED), 8},
};

inline constexpr Field kParamFields[] = {
    {offsetof(TEVPF_PARAM, RESERVED), 7},
    {offsetof(TEVPF_PARAM, desc_loc), 1},
    {offsetof(TEVPF_PARAM, def.type), 4},
    {offsetof(TEVPF_PARAM, def.name), TEVPF_NAME_SIZE},
    {offsetof(TEVPF_PARAM, def.units), TEVPF_UNITS_SIZE},
    {kNowhere, 4},
};

static_assert(stored_size(kListFields) == kListHead);
static_assert(stored_size(kParamFields) == kParamHead);

}  // namespace tevpf
