// Writes elements in file order: kind by kind, each kind in directory order.
#pragma once

#include <cstdio>

#include "core/element_kind.h"

extern "C" {

// Statuses of the kinds' writers, and
//   PF_OPENFAIL  not everything could be written; texts: the name of the file
TEVPF_API TEVPF_STATUS TEV8R1_store_file(TEVPF_FILE* file) noexcept;
}

namespace tevpf {

// Writes all elements of a file to a stream and flushes it. `name` is the file's name in error
// texts.
[[nodiscard]] TEVPF_STATUS write_elements(const TEVPF_FILE& file, std::FILE* stream,
                                          const char* name) noexcept;

// Writes one element and flushes the stream.
[[nodiscard]] TEVPF_STATUS write_element(std::FILE* stream, TEVPF_ELEM_HEADER& element,
                                         const ElementKind& kind) noexcept;

}  // namespace tevpf
