// Writes elements as the file holds them.
#pragma once

#include <cstdio>

#include "core/element.h"

extern "C" {

TEVPF_API TEVPF_STATUS TEV8R1_store_file(TEVPF_FILE* file) noexcept;
TEVPF_API TEVPF_STATUS TEV8R1_store_list(std::FILE* stream, const TEVPF_LIST* list) noexcept;
TEVPF_API TEVPF_STATUS TEV8R1_store_table(std::FILE* stream, const TEVPF_TABLE* table) noexcept;
}
