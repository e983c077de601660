// Which fields of a CSV's records go into which columns, by its header row or without one.
#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "csv_reader.h"
#include "import_options.h"

namespace tool {

struct CsvHeader {
  struct Column {
    std::string name;
    std::size_t field;  // of a record
  };
  std::vector<Column> columns;  // chosen ones, in the order asked for
  std::size_t fields = 0;       // that a record has
  bool has_trailing_delimiter = false;
  bool is_in_text = true;  // else the first record counts in its place

  // The next record with exactly `fields` fields, but for what the options allow: one that is short
  // keeps its own number. False at the end.
  bool next(CsvReader& reader, CsvRecord& record, const ImportOptions& options) const;
};

// A reader that knows the delimiter: the one given, or the one that the first line shows, of which a
// message tells.
CsvReader open_csv(CsvSource& source, ImportOptions& options);

// Reads the header row, or names the fields in its place: by --columns, by the columns of a table
// that is there, else by their numbers. Checks that options name columns that there are.
CsvHeader read_header(CsvReader& reader, const ImportOptions& options,
                      const std::vector<std::string>& table_columns);

}  // namespace tool
