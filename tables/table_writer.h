// Writes tables in their stored form.
#pragma once

#include <cstdio>

#include "core/io/sink.h"
#include "tables/table.h"

extern "C" {

//   PF_OPENFAIL  the table could not be written completely; texts: the name of the table
//   PF_BADTYPE   an unknown value type; texts: "column", the type
TEVPF_API TEVPF_STATUS TEV8R1_store_table(std::FILE* stream, TEVPF_TABLE* table) noexcept;
}

namespace tevpf {

[[nodiscard]] TEVPF_STATUS store_table(Sink& sink, TEVPF_TABLE& table) noexcept;

}  // namespace tevpf
