// Reads a parameter file into the directory of the current file.
#pragma once

#include "core/element.h"

extern "C" {

// Closes a file from which no element could be read.
//   PF_BADFILE  it has none; texts: the file's name
TEVPF_API TEVPF_STATUS TEV8R1_check_valid_file(TEVPF_FILE* file) noexcept;
}

namespace tevpf {

// Terminates the texts of a header that was read, within their fields.
void terminate_texts(TEVPF_ELEM_HEADER& header) noexcept;

// Loads every element of the file, which is registered and current.
[[nodiscard]] TEVPF_STATUS load_file(TEVPF_FILE& file) noexcept;

}  // namespace tevpf
