// The default row: one row of the table's layout that holds every column's min, strings the empty
// text, until a caller sets other values. Bytes without a value are zero.
#pragma once

#include "core/heap.h"
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

// The same with a block of row_wid zeros that is already there.
void adopt_minimums(TEVPF_TABLE& table, Owned<unsigned char> zeroed) noexcept;

// Replaces the default row by another block, or by none.
void adopt_default_row(TEVPF_TABLE& table, Owned<unsigned char> row) noexcept;

}  // namespace tevpf
