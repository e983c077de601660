// Texts that become values of a row.
#pragma once

#include <string>

#include "definition_options.h"
#include "find.h"

namespace tool {

// Sets the value of a column, within its bounds. An empty text is what is not a number in a real or
// double column without index.
void set_cell(tevpf::Row& row, const Columns& columns, const std::string& column,
              const std::string& text, const Subject& subject);

}  // namespace tool
