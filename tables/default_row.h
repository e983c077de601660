// The default row: one row in the table's layout that holds every column's min, or the empty text
// for strings, until a caller sets other values. In rows created here, bytes that belong to no
// value are zero.
#pragma once

#include "core/base/heap.h"
#include "tables/table.h"

extern "C" {

// Writes every column's min, or zeros over a whole string, into the default row.
//   PF_BADTYPE  a column of an unknown type was skipped
TEVPF_API TEVPF_STATUS TEV8R1_init_row_defaults(TEVPF_TABLE* table) noexcept;
}

namespace tevpf {

// Stores the definition's min, or the empty text, as the value at a given place.
void put_min(unsigned char* place, const TEVPF_COL_DEF& definition) noexcept;

// Replaces the default row of a table whose columns are complete with a row of minimums. Returns
// false when out of memory, and the table keeps its default row.
[[nodiscard]] bool make_default_row(TEVPF_TABLE& table) noexcept;

// Creates the default row if there is none: a table whose loading failed has columns, but gets a
// default row only when an operation needs it. Returns false when out of memory.
[[nodiscard]] bool ensure_default_row(TEVPF_TABLE& table) noexcept;

// Widens the default row from row_wid to new_wid bytes, or creates the first one, and stores the
// min of a new column at `offset`. Existing bytes are kept; the others are zero. Returns false when
// out of memory.
[[nodiscard]] bool widen_default_row(TEVPF_TABLE& table, std::int64_t new_wid, std::int64_t offset,
                                     const TEVPF_COL_DEF& definition) noexcept;

// Like make_default_row, but uses a given block of row_wid zeros.
void adopt_minimums(TEVPF_TABLE& table, Owned<unsigned char> zeroed) noexcept;

// Replaces the default row with another block, or with none.
void adopt_default_row(TEVPF_TABLE& table, Owned<unsigned char> row) noexcept;

}  // namespace tevpf
