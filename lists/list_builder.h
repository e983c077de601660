// Builds lists from their stored form.
#pragma once

#include <cstdio>

#include "core/io/body.h"
#include "lists/list.h"

extern "C" {

// Creates a list from its header and its header.btf bytes of body; the data after the body is read
// from the stream. A list with a valid body stays in the directory even if a later step fails.
TEVPF_API TEVPF_STATUS TEV8R1_format_list(TEVPF_ELEM_HEADER header, const void* body,
                                          std::FILE* stream) noexcept;
}

namespace tevpf {

// Implements ElementKind::read.
[[nodiscard]] TEVPF_STATUS build_list(const TEVPF_ELEM_HEADER& header, Body body,
                                      Input& input) noexcept;

}  // namespace tevpf
