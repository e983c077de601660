// Builds lists from their stored form.
#pragma once

#include <cstdio>

#include "core/io/body.h"
#include "lists/list.h"

extern "C" {

// Creates a list from its header and its header.btf bytes of body; what follows the body comes from the
// stream. A list whose body is in order stays in the directory in the state it reached.
TEVPF_API TEVPF_STATUS TEV8R1_format_list(TEVPF_ELEM_HEADER header, const void* body,
                                          std::FILE* stream) noexcept;
}

namespace tevpf {

// As ElementKind::read has it.
[[nodiscard]] TEVPF_STATUS build_list(const TEVPF_ELEM_HEADER& header, Body body,
                                      Input& input) noexcept;

}  // namespace tevpf
