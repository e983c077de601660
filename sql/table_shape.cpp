#include "table_shape.h"

#include <cmath>

#include "names.h"

namespace sql {
namespace {

double tolerance_of(const tevpf::Column& column) {
  const bool is_floating =
      column.type() == tevpf::Type::float32 || column.type() == tevpf::Type::float64;
  return is_floating ? std::pow(10.0, -(column.precision() + 1.0)) : 0;
}

std::int32_t size_of(const tevpf::Column& column) {
  std::int32_t size = 0;
  tevpf::detail::check(
      TEV8R1_compute_size(static_cast<std::int32_t>(column.type()), column.width(), &size));
  return size;
}

}  // namespace

TableShape::TableShape(const tevpf::Table& table) : row_size(table.row_size()) {
  const std::vector<tevpf::Column> columns = table.columns();
  const std::vector<std::string> names = column_names(columns);
  std::int32_t count = 0;
  std::int32_t* offsets = nullptr;
  tevpf::detail::check(
      TEV8R1_PF_inq_col_offsets(std::string(table.name()).c_str(), &count, &offsets));
  const tevpf::detail::Block<std::int32_t> owned(offsets);
  fields.reserve(columns.size());
  for (std::size_t i = 0; i < columns.size(); ++i) {
    const tevpf::Column& c = columns[i];
    fields.push_back({c.name(), names[i], c.type(), offsets[i], size_of(c), c.is_indexed(),
                      c.is_unique(), tolerance_of(c)});
  }
}

}  // namespace sql
