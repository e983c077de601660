// Lists chosen columns and rows of a table.
#pragma once

#include <cstdint>
#include <cstdio>

#include "tables/table.h"

extern "C" {

// What TEV8R1_PF_print_table does, for a table and a stream.
TEVPF_API TEVPF_STATUS TEV8R1_print_table(TEVPF_TABLE* table, std::FILE* stream,
                                          std::int32_t definitions, std::int32_t count,
                                          const char (*names)[TEVPF_NAME_SIZE], std::int32_t first,
                                          std::int32_t last) noexcept;
}
