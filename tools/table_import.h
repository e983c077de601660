// Rows from CSV into a table of the open file. Columns are found by the names in the header row;
// for a table that is not there, or has no columns, they are made to fit what the fields hold.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

#include "tevpf.hpp"

namespace tool {

struct CsvText {
  std::string_view text, name;
};

// Adds all rows to the table of that name, behind those that are there, and returns their number. A
// Failure names the line; the file in memory then holds a part of them and must not be saved.
std::size_t import_csv(tevpf::File& file, const std::string& name, const CsvText& csv);

}  // namespace tool
