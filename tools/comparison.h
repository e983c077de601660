// What is different in two parameter files.
#pragma once

#include "difference.h"
#include "tevpf.hpp"

namespace tool {

// Elements, definitions, values of parameters, rows. Rows are matched by the first column that is
// unique in both files, else by their numbers.
void compare(const tevpf::File& before, const tevpf::File& after, const ReportDifference& report);

}  // namespace tool
