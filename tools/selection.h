// Which columns and rows of a table a command works on, and in which order.
#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "commands.h"
#include "find.h"

namespace tool {

// Columns by position, rows by number.
struct Selection {
  Columns all;
  std::vector<std::size_t> columns, rows;
};

// By --columns, --where, --sort, --from, --to and --limit, in this order.
Selection select(tevpf::File& file, const tevpf::Element& element, const Arguments& arguments);

// The rows that --where and the numbers --from and --to choose to be changed. Without any of them,
// --all is needed: a forgotten condition must not empty a table.
std::vector<std::size_t> rows_to_change(tevpf::File& file, const tevpf::Element& element,
                                        const Arguments& arguments);

}  // namespace tool
