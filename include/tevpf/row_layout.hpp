// Rows as plain bytes, for programs that read or make many at once.
#pragma once

#include <cstddef>
#include <string>
#include <utility>
#include <vector>

#include "row.hpp"

namespace tevpf {
inline namespace v1 {

// Where the values of a column lie in a row: at any address. A string fills its field of width + 1
// bytes up to a terminator; what lies behind the terminator means nothing.
struct RowField {
  std::string column;
  Type type;
  std::size_t offset, size;  // in bytes
};

// How the rows of a table lie in memory, from Table::row_layout. It is good until the table's columns
// change: the operations that take it throw PF_TYPECHG then.
class RowLayout {
 public:
  std::size_t row_size() const noexcept { return layout_->row_size; }  // bytes, gaps included
  std::vector<RowField> fields() const;                                // in column order

 private:
  friend class Table;
  explicit RowLayout(detail::LayoutPtr layout) : layout_(std::move(layout)) {}

  detail::LayoutPtr layout_;
};

// ---- Implementation -----------------------------------------------------------------------------

inline std::vector<RowField> RowLayout::fields() const {
  std::vector<RowField> result;
  result.reserve(layout_->places.size());
  for (const detail::Place& place : layout_->places) {
    result.push_back({std::string(place.name.view()), place.type,
                      static_cast<std::size_t>(place.offset),
                      static_cast<std::size_t>(place.size)});
  }
  return result;
}

}  // namespace v1
}  // namespace tevpf
