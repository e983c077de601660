// Builds tables from their stored form.
#pragma once

#include <cstdio>

#include "core/io/body.h"
#include "tables/table.h"

extern "C" {

// Creates a table from its header and its body of header.btf bytes; what follows the body is read
// from the stream. If the body is valid, the table stays in the directory in the state it reached,
// even after a failure.
TEVPF_API TEVPF_STATUS TEV8R1_format_table(TEVPF_ELEM_HEADER header, const void* body,
                                           std::FILE* stream) noexcept;
}

namespace tevpf {

// See ElementKind::read.
[[nodiscard]] TEVPF_STATUS build_table(const TEVPF_ELEM_HEADER& header, Body body,
                                       Input& input) noexcept;

}  // namespace tevpf
