// Conditions and assignments on rows: SQL expressions over the columns of a table.
#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "tevpf.hpp"

namespace tool {

// Numbers of the rows for which the condition is true, in storage order.
std::vector<std::size_t> rows_where(tevpf::File& file, const tevpf::Element& table,
                                    const std::string& condition);

// Changes these rows, all of them or none, by assignments: "melting = 1538, name = upper(name)".
void update_rows(tevpf::File& file, const tevpf::Element& table,
                 const std::vector<std::size_t>& rows, const std::string& changes);

}  // namespace tool
