// Lists and tables as JSON: whole, or the part of a table that is shown. The manual page describes
// the form; import reads it.
#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "find.h"
#include "output.h"
#include "tevpf.hpp"

namespace tool {

// {"name": ..., "type": ...}: without what a new definition has by itself.
std::string parameter_json(const tevpf::Parameter& parameter);
std::string column_json(const tevpf::Column& column);

void write_list_json(Output& output, const tevpf::List& list, const tevpf::Element& element);

// Those columns and rows of a table, in that order. Rows are written one by one.
void write_table_json(Output& output, const tevpf::Table& table, const tevpf::Element& element,
                      const Columns& all, const std::vector<std::size_t>& columns,
                      const std::vector<std::size_t>& rows);

// Everything that the file stores of the element.
void write_element_json(Output& output, const tevpf::File& file, const tevpf::Element& element);

// {"elements": [...]}: all elements of the file, one after the other.
void write_file_json(Output& output, const tevpf::File& file);

}  // namespace tool
