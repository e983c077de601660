// Rows from CSV into a table of the open file. Columns are found by the names in the header row; for
// a table that is not there, or has no columns, they are made to fit what the fields hold.
#pragma once

#include <cstddef>
#include <string>

#include "csv_source.h"
#include "import_options.h"
#include "progress.h"
#include "tevpf.hpp"

namespace tool {

// How indexes of the table are kept while rows are added.
enum class Indexes {
  kAtOnce,   // built when all rows are there: fast, but says nothing of a row that is refused
  kRowByRow  // slow, and it knows which row
};

// Indexes could not be built at once. The file in memory must not be saved; the import can be tried
// row by row on the file as it was.
struct IndexesRefused {};

// Adds all rows to the table of that name, behind those that are there, and returns their number. A
// Failure names the line; the file in memory then holds a part of them and must not be saved.
std::size_t import_rows(tevpf::File& file, const std::string& name, CsvSource& source,
                        ImportOptions& options, Indexes indexes, Progress& progress);

}  // namespace tool
