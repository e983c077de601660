#include "table_view.h"

namespace sql {

TableView::TableView(const tevpf::Table& table)
    : table_(table), shape_(table_), orders_(shape_.fields.size()) {
  for (std::size_t i = 0; i < orders_.size(); ++i) {
    if (shape_.fields[i].is_indexed) orders_[i].emplace(table_, shape_, shape_.fields[i]);
  }
}

}  // namespace sql
