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

// Characters of a row as the last report showed it, or as it was when a column was last removed; 0: never.
std::int32_t display_width_of(const tevpf::Table& table);

// Adds these columns to a table that has none, and gives it that display width, as far as there was ever
// one: of all columns, or of those in front of the ones defined since.
void add_columns(tevpf::Table& table, const std::vector<tevpf::Column>& columns,
                 std::int32_t display_width);

}  // namespace tool
