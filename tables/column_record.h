// The record of one column: its sizes, its completion, the checks of its definition, and lookup by
// name.
#pragma once

#include <cstdint>

#include "tables/table.h"

extern "C" {

// Completes a record whose definition has just been filled in: makes its own copy of the
// description, empties the format and sets the tolerance. Raises *mod to the value size of a
// number, and returns the stored size and the value size. After a failure the description belongs
// to the record, or is null.
//   PF_BADTYPE, PF_NOMEM
TEVPF_API TEVPF_STATUS TEV8R1_construct_column(TEVPF_COLUMN* column, std::int32_t* btf_out,
                                               std::int32_t* size_out, std::int16_t* mod) noexcept;

// All checks for a new column: PF_BADNAME, PF_DUPLICATE, PF_BADUNIQUE, range or type, PF_BADWIDTH.
TEVPF_API TEVPF_STATUS TEV8R1_validate_col_def(const TEVPF_TABLE* table,
                                               TEVPF_COL_DEF definition) noexcept;

// PF_DUPLICATE when a column of the table has this name.
TEVPF_API TEVPF_STATUS TEV8R1_check_unique_column(const TEVPF_TABLE* table,
                                                  const char* name) noexcept;
}

namespace tevpf {

// The bytes that every column takes in the file before its limits.
inline constexpr std::int32_t kColumnHead = 48;

// Finds a column by its exact name.
//   PF_NOCOLUMN  texts: the name, empty
[[nodiscard]] TEVPF_STATUS find_column(const TEVPF_TABLE& table, const char* name,
                                       TEVPF_COLUMN*& column) noexcept;

// Terminates names and units from a caller or a file within their fields.
void terminate_texts(TEVPF_COL_DEF& definition) noexcept;

// The largest difference at which two values of a real or double column are equal; 0 for other
// types.
double tolerance_of(const TEVPF_COL_DEF& definition) noexcept;

// Bytes that a column of a valid type takes in the file.
std::int64_t stored_column_size(std::int32_t type, const char* description) noexcept;

// What the file stores in place of the description pointer: the description's position, or 0 if
// there is none.
std::int8_t description_flag(const TEVPF_COL_DEF& definition) noexcept;

// Copies a definition for a caller, who owns the copied description.
//   PF_NOMEM  everything else is written; the description is null
[[nodiscard]] TEVPF_STATUS copy_definition(const TEVPF_COL_DEF& source,
                                           TEVPF_COL_DEF& copy) noexcept;

// The refusal of a definition that would make a row wider than 31 bits can express.
[[nodiscard]] TEVPF_STATUS row_too_wide(const TEVPF_COL_DEF& definition) noexcept;

// Releases what the record owns: description, index and search keys.
void release_column(TEVPF_COLUMN& column) noexcept;

// The position of a column in this table; -1 for null.
std::int32_t column_position(const TEVPF_TABLE& table, const TEVPF_COLUMN* column) noexcept;

}  // namespace tevpf
