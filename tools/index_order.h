// What a file stores of a table beside its definitions and rows, so that a copy of the table is stored
// in the same bytes: the order in which an index has rows of equal values, and the display width.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "tevpf.hpp"

namespace tool {

// Row numbers in the order of the column's index; empty when the column has none, or when adding the
// rows one by one gives that very order.
std::vector<std::size_t> order_to_keep(const tevpf::Table& table, const tevpf::Column& column);

// Gives the column's index that order, as far as rows of equal values can change places. An order that
// does not fit the rows, because they were changed since, is left alone.
void restore_order(tevpf::Table& table, const tevpf::Column& column,
                   const std::vector<std::size_t>& order);

// Characters of a row as reports show it; 0: no report has been made yet.
std::int32_t display_width_of(const tevpf::Table& table);
void restore_display_width(const tevpf::Table& table);  // makes a report, and throws it away

}  // namespace tool
