// Builds tables from their stored form.
#pragma once

#include <cstdio>

#include "core/io/body.h"
#include "tables/table.h"

extern "C" {

// Creates a table from its header and its header.btf bytes of body; what follows the body comes from the
// stream. A table whose body is in order stays in the directory in the state it reached.
TEVPF_API TEVPF_STATUS TEV8R1_format_table(TEVPF_ELEM_HEADER header, const void* body,
                                           std::FILE* stream) noexcept;
}

namespace tevpf {

// As ElementKind::read has it.
[[nodiscard]] TEVPF_STATUS build_table(const TEVPF_ELEM_HEADER& header, Body body,
                                       Input& input) noexcept;

}  // namespace tevpf
