// The column templates of a table: five definitions, one a value type in type order, that callers
// set and read. They exist in memory only, from their first use on.
#pragma once

#include "tables/table.h"

extern "C" {

// Gives a table the five initial templates, in place of those it has.
TEVPF_API TEVPF_STATUS TEV8R1_load_col_dft(TEVPF_TABLE* table) noexcept;
}

namespace tevpf {

void release_templates(TEVPF_TABLE& table) noexcept;

// Gives `copy`, which has none, the templates of `source`; false when memory runs out, and then
// `copy` still has none.
[[nodiscard]] bool copy_templates(const TEVPF_TABLE& source, TEVPF_TABLE& copy) noexcept;

}  // namespace tevpf
