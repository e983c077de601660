// How a read of a table goes: through all rows, to one row by its rowid, or along an index.
#pragma once

#include <cstddef>

#include "sqlite.h"
#include "table_shape.h"

namespace sql {

struct Plan {
  enum class Access { all, row, index };
  Access access = Access::all;
  int column = 0;  // of the index
  // What of the column is asked for; arguments come in this order.
  bool is_equal = false, has_least = false, has_greatest = false, has_prefix = false;
  bool is_ordered = false, is_descending = false;  // rows must come in that order

  int number() const noexcept;
  static Plan from(int number) noexcept;
};

// Chooses the plan, for SQLite to compare by its cost: about one for each row that is read.
void choose_plan(const TableShape& shape, std::size_t rows, sqlite3_index_info& info);

}  // namespace sql
