// Reads the rows of a table, as a plan says.
#pragma once

#include <cstddef>
#include <vector>

#include "row_blocks.h"
#include "table_plan.h"
#include "table_view.h"

namespace sql {

class TableCursor : public Cursor {
 public:
  explicit TableCursor(TableView& relation) : relation_(relation) {}

  void filter(int plan, Values arguments) override;
  bool step() noexcept override;
  void advance() override;
  bool at_end() const noexcept override { return row_ == nullptr; }
  void deliver(sqlite3_context* context, int column) const override;
  RowIds::Id id() const override;

 private:
  // Rows to come: positions from first to behind the last one.
  struct Run {
    std::size_t first = 0, end = 0;
    bool empty() const noexcept { return first >= end; }
  };

  void read_all(const Plan& plan);
  void read_row(sqlite3_value* id);
  void read_index(const Plan& plan, Values arguments);
  void read_sorted(const Plan& plan);
  const unsigned char* read(std::size_t position);

  TableView& relation_;
  RowBlocks rows_{relation_.table(), relation_.shape().row_size, {}};
  std::vector<std::size_t> sorted_;  // row numbers, where no index has their order
  bool is_sorted_ = false;
  bool is_backwards_ = false;
  Run run_, next_run_;
  std::size_t position_ = 0;  // of the current row
  const unsigned char* row_ = nullptr;
  std::uint64_t version_ = 0;  // of the relation when rows were read
};

}  // namespace sql
