// A table in SQL: its columns and rows as they are.
#pragma once

#include <cstddef>
#include <optional>

#include "table_view.h"

namespace sql {

class TableRelation : public TableView {
 public:
  TableRelation(Journal& journal, const tevpf::Table& table)
      : TableView(table), journal_(journal) {}

  std::string declaration() const override;
  void plan(sqlite3_index_info& info) const override;
  std::unique_ptr<Cursor> open() override;
  RowIds::Id insert(Values values, bool replaces) override;
  void update(RowIds::Id id, Values values, bool replaces) override;
  void remove(RowIds::Id id) override;
  void revert(const Change& change) override;

 private:
  void fill(tevpf::Row& row, Values values) const;
  // Removes the rows but one that hold a unique value of this row.
  void remove_equal(const tevpf::Row& row, std::optional<RowIds::Id> but);
  void replace_unchecked(std::size_t number, const tevpf::Row& row);
  void insert_unchecked(std::size_t number, const tevpf::Row& row);
  void values_added(std::size_t number);
  [[noreturn]] void refuse(const tevpf::Error& error, std::size_t number) const;

  Journal& journal_;
};

}  // namespace sql
