// What is different in the rows of two tables.
#pragma once

#include <string>

#include "difference.h"
#include "tevpf.hpp"

namespace tool {

// Compares the columns that both tables have. O(rows).
void compare_rows(const std::string& place, const tevpf::Table& before, const tevpf::Table& after,
                  const ReportDifference& report);

}  // namespace tool
