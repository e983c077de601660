// New columns and other definitions of columns, in tables with rows, too.
#pragma once

#include <string>

#include "definition_options.h"
#include "tevpf.hpp"

namespace tool {

// Adds a column. Rows that are there get --default; without it no value: what is not a number in a
// real or double column, the empty text, or the integer nearest to 0 within the bounds, which
// indexed reals and doubles get, too.
void add_column(tevpf::Table& table, const std::string& name, const DefinitionOptions& options,
                const Subject& subject);

// Changes a column as the options say. Where the library does not change a column of a table with
// rows (another type, another width of a string), the rows are taken out and put back in with
// their values as the new type has them.
void change_column(tevpf::Table& table, const std::string& name, const DefinitionOptions& options,
                   const Subject& subject);

}  // namespace tool
