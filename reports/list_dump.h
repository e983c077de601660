// Dumps a list and its parameters as text.
#pragma once

#include <cstdio>

#include "lists/list.h"
#include "reports/text_out.h"

extern "C" {

// Writes the list's dump. Settles the list first.
//   PF_NOMEM  the output written so far remains
TEVPF_API TEVPF_STATUS TEV8R1_list_dump(TEVPF_LIST* list, std::FILE* stream) noexcept;
}

namespace tevpf {

// Same as TEV8R1_list_dump, for an open stream buffer.
[[nodiscard]] TEVPF_STATUS write_list(TextOut& out, TEVPF_LIST& list) noexcept;

}  // namespace tevpf
