// The stored fields of tables and columns.
//
//   table    the element's header, kTableFields, the columns, the index of each indexed column, the
//            rows
//   column   kColumnFields, the first column_part bytes of `limits`, [the description and its
//            terminator]
#pragma once

#include "core/stored_form.h"
#include "tables/column_record.h"
#include "tables/table.h"

namespace tevpf {

inline constexpr Field kTableFields[] = {
    {offsetof(TEVPF_TABLE, num_cols), 4}, {offsetof(TEVPF_TABLE, num_rows), 4},
    {offsetof(TEVPF_TABLE, row_wid), 4},  {offsetof(TEVPF_TABLE, dsp_wid), 4},
    {offsetof(TEVPF_TABLE, RESERVED), 8},
};

inline constexpr Field kColumnFields[] = {
    {offsetof(TEVPF_COLUMN, offset), 4},
    {offsetof(TEVPF_COLUMN, RESERVED), 4},
    {offsetof(TEVPF_COLUMN, def.type), 4},
    {offsetof(TEVPF_COLUMN, def.name), TEVPF_NAME_SIZE},
    {offsetof(TEVPF_COLUMN, def.units), TEVPF_UNITS_SIZE},
    {offsetof(TEVPF_COLUMN, desc_flag), 1},  // stored in place of desc_byte
    {offsetof(TEVPF_COLUMN, def.spare_byte), 1},
    {offsetof(TEVPF_COLUMN, def.idx_flag), 1},
    {offsetof(TEVPF_COLUMN, def.unq_flag), 1},
    {offsetof(TEVPF_COLUMN, def.width), 4},
};

static_assert(stored_size(kTableFields) == kTableHead);
static_assert(stored_size(kColumnFields) == kColumnHead);

}  // namespace tevpf
