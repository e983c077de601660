// Lists as CSV: a record for each parameter, under a header that tells it from rows of a table.
#pragma once

#include <cstddef>
#include <string>

#include "csv_source.h"
#include "csv_writer.h"
#include "import_options.h"
#include "tevpf.hpp"

namespace tool {

void export_list(CsvWriter& writer, const tevpf::List& list, bool has_header);

// Whether the text starts with the header of an exported list.
bool is_exported_list(CsvSource& source, ImportOptions& options);

// Adds all parameters to the list of that name, which is made when it is not there, behind those that
// it has; gives their number. A Failure names the line; the file in memory must not be saved then.
std::size_t import_parameters(tevpf::File& file, const std::string& name, CsvSource& source,
                              ImportOptions& options);

}  // namespace tool
