// A table whose columns hold what a CSV holds: found out by reading all of it.
#pragma once

#include <string>

#include "csv_source.h"
#include "import_options.h"
#include "progress.h"
#include "tevpf.hpp"

namespace tool {

// Makes the table, or gives columns to one that has none, without rows. A Failure when one text would
// make it many times as large as the CSV.
tevpf::Table make_table_for(tevpf::File& file, const std::string& name, CsvSource& source,
                            ImportOptions& options, Progress& progress);

}  // namespace tool
