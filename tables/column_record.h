// The record of one column: its sizes, its completion, the checks of its definition, finding it by
// name.
#pragma once

#include <cstdint>

#include "tables/table.h"

extern "C" {

// Completes a record whose definition has just been filled in: its own copy of the description, an
// empty format, the tolerance; raises *mod to a number's value size and gives the stored size and
// the value size. After a failure the description is the record's own, or null.
//   PF_BADTYPE, PF_NOMEM
TEVPF_API TEVPF_STATUS TEV8R1_construct_column(TEVPF_COLUMN* column, std::int32_t* btf_out,
                                               std::int32_t* size_out, std::int16_t* mod) noexcept;

// All checks for a new column: PF_BADNAME, PF_DUPLICATE, PF_BADUNIQUE, range or type, PF_BADWIDTH.
TEVPF_API TEVPF_STATUS TEV8R1_validate_col_def(const TEVPF_TABLE* table,
                                               TEVPF_COL_DEF definition) noexcept;

// PF_DUPLICATE when a column of the table has this name.
TEVPF_API TEVPF_STATUS TEV8R1_check_unique_column(const TEVPF_TABLE* table,
                                                  const char* name) noexcept;

// Finds a column by its exact name.
//   PF_NOCOLUMN  texts: the name, empty
TEVPF_API TEVPF_STATUS TEV8R1_get_col_ptr(const TEVPF_TABLE* table, const char* name,
                                          TEVPF_COLUMN** column_out) noexcept;
}

namespace tevpf {

// What every column takes in the file before its limits.
inline constexpr std::int32_t kColumnHead = 48;

// Names and units from a caller or a file end within their fields.
void terminate_texts(TEVPF_COL_DEF& definition) noexcept;

// What values of a real or double column may differ by and still be equal; 0 for the other types.
double tolerance_of(const TEVPF_COL_DEF& definition) noexcept;

// Bytes that a column of a valid type takes in the file.
std::int64_t stored_column_size(std::int32_t type, const char* description) noexcept;

// What the file keeps in place of the description pointer: where it stands, or 0 for none.
std::int8_t description_flag(const TEVPF_COL_DEF& definition) noexcept;

// A definition for a caller, with a description of its own.
//   PF_NOMEM  the rest is written, its description is null
[[nodiscard]] TEVPF_STATUS copy_definition(const TEVPF_COL_DEF& source,
                                           TEVPF_COL_DEF& copy) noexcept;

// The refusal of a definition with which a row would be wider than 31 bits can say.
[[nodiscard]] TEVPF_STATUS row_too_wide(const TEVPF_COL_DEF& definition) noexcept;

// Releases what the record owns: description, index and search keys.
void release_column(TEVPF_COLUMN& column) noexcept;

// The place of a column of this table; -1 for null.
std::int32_t column_position(const TEVPF_TABLE& table, const TEVPF_COLUMN* column) noexcept;

}  // namespace tevpf
