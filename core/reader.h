// Reads a parameter file into the directory of the current file.
#pragma once

#include <cstdio>

#include "core/element.h"

extern "C" {

// Build one element from its header and its header.btf bytes of body; trailing arrays come from the
// stream. An element whose body is in order stays in the directory in the state it reached.
TEVPF_API TEVPF_STATUS TEV8R1_format_list(TEVPF_ELEM_HEADER header, const void* body,
                                          std::FILE* stream) noexcept;
TEVPF_API TEVPF_STATUS TEV8R1_format_table(TEVPF_ELEM_HEADER header, const void* body,
                                           std::FILE* stream) noexcept;
TEVPF_API TEVPF_STATUS TEV8R1_check_valid_file(TEVPF_FILE* file) noexcept;
}

namespace tevpf {

// Loads every element of the file, which is registered and current.
[[nodiscard]] TEVPF_STATUS load_file(TEVPF_FILE& file) noexcept;

}  // namespace tevpf
