// A parameter file as one page of HTML that needs nothing but itself: no network, no other file.
#pragma once

#include <cstddef>

#include "output.h"
#include "tevpf.hpp"

namespace tool {

// most_rows: of each list and table that are shown; what is said of columns comes from all rows.
void write_page(Output& output, const tevpf::File& file, std::size_t most_rows);

}  // namespace tool
