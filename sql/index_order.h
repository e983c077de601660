// The library's index of a column as SQL may rely on it.
//
// SQL compares exactly. The library's order is that of the values too, but for these cases: reals and
// doubles that differ by no more than the column's tolerance may stand either way round; so may texts
// that end in "*"; and an index that a file brings is taken as it stands. Hence an index is looked
// through once, and then all of its range that may hold a value is delivered, from which SQLite picks.
#pragma once

#include <cstddef>
#include <optional>
#include <string_view>

#include "row_blocks.h"
#include "table_shape.h"

namespace sql {

class IndexOrder {
 public:
  IndexOrder(const tevpf::Table& table, const TableShape& shape, const Field& field)
      : field_(field), rows_(table, shape.row_size, field.name) {}

  // A value to be found: a number, or a text.
  struct Key {
    double number = 0;
    std::string_view text = {};
    bool is_prefix = false;  // of texts: all that start so
  };
  // Positions in the index, from first to behind the last one.
  struct Range {
    std::size_t first, end;
  };

  // Searching is of use. O(rows) when the index has not been looked through since it may have got out
  // of order.
  bool is_usable(std::size_t rows);
  // Moreover, it is in exact order, what is not a number behind all others.
  bool is_exact(std::size_t rows);

  // ---- Of an index that is usable ----
  // Where all values that are not less than one bound nor greater than the other stand; those that are
  // not numbers are left out. O(log rows).
  Range find(const std::optional<Key>& least, const std::optional<Key>& greatest);
  Range not_numbers() const noexcept { return {rows_count_ - missing_, rows_count_}; }

  // The index has been looked through: it wants to know of changes.
  bool is_known() const noexcept { return is_known_; }
  // A row holds a new value, or the table has lost a row.
  void value_added(const unsigned char* row) noexcept;
  void row_removed() noexcept { is_counted_ = false; }

 private:
  void look_through(std::size_t rows);
  void look_through_numbers();
  void look_through_texts();
  std::size_t recount(std::size_t rows);
  template <class IsBefore>
  std::size_t first_not(std::size_t first, std::size_t end, IsBefore is_before);

  const Field& field_;
  RowBlocks rows_;
  bool is_known_ = false;     // the following is true
  bool is_counted_ = false;   // of the rows as they are now
  bool is_sorted_ = false;    // texts; and no number stands behind what is none
  double margin_ = 0;         // no number stands behind one that is greater by more than this
  std::size_t loosened_ = 0;  // changes by which the margin may have become too wide
  std::size_t missing_ = 0, rows_count_ = 0;
};

}  // namespace sql
