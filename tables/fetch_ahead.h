// Requesting the cache lines that searches of a large table's indexes will read. A search waits for
// each of its cache misses; those of several searches that are requested together overlap.
#pragma once

#include "tables/table.h"

namespace tevpf {

// Before all indexes are searched for the values of a row.
void fetch_places(const TEVPF_TABLE& table, const unsigned char* row) noexcept;

// Before the indexes of the columns in which two rows differ are searched for the values of both.
void fetch_places_of_changes(const TEVPF_TABLE& table, const unsigned char* row,
                             const unsigned char* other_row) noexcept;

}  // namespace tevpf
