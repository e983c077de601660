// Writes elements as the file holds them.
#pragma once

#include <cstdio>

#include "core/element.h"

extern "C" {

//   PF_OPENFAIL  not everything could be written; texts: the name of the file (of the element)
//   PF_BADTYPE   an unknown value type; texts: "parameter" or "column", the type
TEVPF_API TEVPF_STATUS TEV8R1_store_file(TEVPF_FILE* file) noexcept;
TEVPF_API TEVPF_STATUS TEV8R1_store_list(std::FILE* stream, const TEVPF_LIST* list) noexcept;
TEVPF_API TEVPF_STATUS TEV8R1_store_table(std::FILE* stream, const TEVPF_TABLE* table) noexcept;
}

namespace tevpf {

// Writes all elements of a file to a stream that stands for the file of that name, and flushes it.
[[nodiscard]] TEVPF_STATUS write_elements(const TEVPF_FILE& file, std::FILE* stream,
                                          const char* name) noexcept;

}  // namespace tevpf
