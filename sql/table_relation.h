// A table in SQL: its columns and rows as they are.
#pragma once

#include <cstddef>
#include <optional>
#include <vector>

#include "index_order.h"
#include "relation.h"
#include "table_shape.h"
#include "tevpf.hpp"

namespace sql {

class SharedFile;

class TableRelation : public Relation {
 public:
  TableRelation(SharedFile& file, const tevpf::Table& table);

  std::string declaration() const override;
  void plan(sqlite3_index_info& info) const override;
  std::unique_ptr<Cursor> open() override;
  RowIds::Id insert(Values values, bool replaces) override;
  void update(RowIds::Id id, Values values, bool replaces) override;
  void remove(RowIds::Id id) override;
  void revert(const Change& change) override;
  std::size_t size() const override { return table_.size(); }

  const tevpf::Table& table() const noexcept { return table_; }
  const TableShape& shape() const noexcept { return shape_; }
  IndexOrder& order_of(std::size_t column) { return *orders_[column]; }  // of an indexed column

 private:
  void fill(tevpf::Row& row, Values values) const;
  // Removes the rows but one that hold a unique value of this row.
  void remove_equal(const tevpf::Row& row, std::optional<RowIds::Id> but);
  void replace_unchecked(std::size_t number, const tevpf::Row& row);
  void insert_unchecked(std::size_t number, const tevpf::Row& row);
  void values_added(std::size_t number);
  [[noreturn]] void refuse(const tevpf::Error& error, std::size_t number) const;

  SharedFile& file_;
  tevpf::Table table_;
  TableShape shape_;
  std::vector<std::optional<IndexOrder>> orders_;  // by column; none without index
};

}  // namespace sql
