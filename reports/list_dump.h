// The text of a list and its parameters.
#pragma once

#include <cstdio>

#include "lists/list.h"
#include "reports/text_out.h"

extern "C" {

// Writes the list's dump.
//   PF_NOMEM  what was written stays
TEVPF_API TEVPF_STATUS TEV8R1_list_dump(const TEVPF_LIST* list, std::FILE* stream) noexcept;
}

namespace tevpf {

// What TEV8R1_list_dump does.
[[nodiscard]] TEVPF_STATUS write_list(TextOut& out, const TEVPF_LIST& list) noexcept;

}  // namespace tevpf
