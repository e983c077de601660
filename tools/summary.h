// What the rows of a table amount to, column by column.
#pragma once

#include <optional>

#include "output.h"
#include "selection.h"

namespace tool {

void show_summary(Output& output, const tevpf::Table& table, const Selection& selection,
                  bool as_json);

}  // namespace tool
