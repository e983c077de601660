// What is different in the rows of two tables.
#pragma once

#include <functional>
#include <string>

#include "comparison.h"

namespace tool {

// Compares the columns that both tables have. O(rows).
void compare_rows(const std::string& place, const tevpf::Table& before, const tevpf::Table& after,
                  const std::function<void(const Difference&)>& report);

}  // namespace tool
