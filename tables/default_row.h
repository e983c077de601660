// The default row: one row of the table's layout that holds every column's min, strings the empty
// text, until a caller sets other values. Bytes without a value are zero in rows that are made here.
#pragma once

#include "core/base/heap.h"
#include "tables/table.h"

extern "C" {

// Writes every column's min, or zeros over a whole string, into the default row.
//   PF_BADTYPE  a column of no known type was passed over
TEVPF_API TEVPF_STATUS TEV8R1_init_row_defaults(TEVPF_TABLE* table) noexcept;
}

namespace tevpf {

// Puts the definition's min, or the empty text, at the place of a value.
void put_min(unsigned char* place, const TEVPF_COL_DEF& definition) noexcept;

// Gives a table whose columns stand a default row of the minimums in place of the one it has; false
// when memory runs out, and then it keeps that.
[[nodiscard]] bool make_default_row(TEVPF_TABLE& table) noexcept;

// Makes the default row where there is none yet: a table whose loading has failed has columns, but
// gets a default row only when an operation needs it. False when memory runs out.
[[nodiscard]] bool ensure_default_row(TEVPF_TABLE& table) noexcept;

// Widens the default row from row_wid to new_wid bytes, or makes the first one, and puts the min of a
// new column at `offset`. Bytes that were there stay, the others are zero. False when memory runs out.
[[nodiscard]] bool widen_default_row(TEVPF_TABLE& table, std::int64_t new_wid, std::int64_t offset,
                                     const TEVPF_COL_DEF& definition) noexcept;

// The same as make_default_row with a block of row_wid zeros that is already there.
void adopt_minimums(TEVPF_TABLE& table, Owned<unsigned char> zeroed) noexcept;

// Replaces the default row by another block, or by none.
void adopt_default_row(TEVPF_TABLE& table, Owned<unsigned char> row) noexcept;

}  // namespace tevpf
