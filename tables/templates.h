// The column templates of a table: five definitions, one per value type in type order, which
// callers set and read. They exist only in memory, from their first use on.
#pragma once

#include "tables/table.h"

extern "C" {

// Gives a table the five initial templates, replacing any that it has.
TEVPF_API TEVPF_STATUS TEV8R1_load_col_dft(TEVPF_TABLE* table) noexcept;
}

namespace tevpf {

void release_templates(TEVPF_TABLE& table) noexcept;

// Copies the templates of `source` to `copy`, which has none. Returns false when out of memory, and
// `copy` still has none.
[[nodiscard]] bool copy_templates(const TEVPF_TABLE& source, TEVPF_TABLE& copy) noexcept;

}  // namespace tevpf
