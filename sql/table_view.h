// A table with what reading it takes: the places of its columns, and how far its indexes can be relied on.
#pragma once

#include <cstddef>
#include <optional>
#include <vector>

#include "index_order.h"
#include "relation.h"
#include "table_shape.h"
#include "tevpf.hpp"

namespace sql {

class TableView : public Relation {
 public:
  explicit TableView(const tevpf::Table& table);

  std::size_t size() const override { return table_.size(); }
  const tevpf::Table& table() const noexcept { return table_; }
  const TableShape& shape() const noexcept { return shape_; }
  IndexOrder& order_of(std::size_t column) { return *orders_[column]; }  // of an indexed column

 protected:
  tevpf::Table table_;
  TableShape shape_;
  std::vector<std::optional<IndexOrder>> orders_;  // by column; none without index
};

}  // namespace sql
