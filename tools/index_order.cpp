#include "index_order.h"

#include <algorithm>
#include <cmath>
#include <string_view>

#include "platform.h"
#include "values.h"

namespace tool {
namespace {

// Within the tolerance of searches: such values have no order of their own.
bool are_equal(const Value& a, const Value& b, const tevpf::Column& column) {
  const auto number = [](const Value& value) {
    const float* const narrow = std::get_if<float>(&value);
    return narrow != nullptr ? static_cast<double>(*narrow) : std::get<double>(value);
  };
  if (!is_floating(column.type())) return a == b;
  return std::abs(number(a) - number(b)) <= std::pow(10.0, -(column.precision() + 1));
}

std::vector<std::size_t> index_order(const tevpf::Table& table, const tevpf::Column& column) {
  std::vector<std::size_t> order;
  order.reserve(table.size());
  for (const tevpf::RowView row : table.ordered_by(column.name())) order.push_back(row.number());
  return order;
}

std::vector<Value> values_of(const tevpf::Table& table, const tevpf::Column& column) {
  std::vector<Value> values;
  values.reserve(table.size());
  for (const tevpf::RowView row : table) values.push_back(row.value(column.name()));
  return values;
}

bool is_permutation_of_rows(const std::vector<std::size_t>& order, std::size_t rows) {
  std::vector<bool> seen(rows);
  for (const std::size_t row : order) {
    if (row >= rows || seen[row]) return false;
    seen[row] = true;
  }
  return order.size() == rows;
}

// A value that is not equal to this one, to take a row out of its group for a moment.
std::optional<Value> another_value(const Value& value, const tevpf::Column& column) {
  if (column.type() == Type::string) {
    return Value(std::get<std::string>(value).empty() ? "x" : "");
  }
  for (const Value& bound : {column.bounds()->min, column.bounds()->max}) {
    if (!are_equal(value, bound, column)) return bound;
  }
  return std::nullopt;
}

// A report computes it.
void compute_display_width(const tevpf::Table& table) {
  tevpf::Listing listing;
  listing.last = 0;
  collect([&](const std::filesystem::path& path) { table.print(path, listing); },
          [](std::string_view) {});
}

}  // namespace

// An added row comes in front of those of the same value.
std::vector<std::size_t> order_to_keep(const tevpf::Table& table, const tevpf::Column& column) {
  if (!column.is_indexed() || column.is_unique()) return {};
  std::vector<std::size_t> order = index_order(table, column);
  const std::vector<Value> values = values_of(table, column);
  for (std::size_t i = 1; i < order.size(); ++i) {
    const Value& last = values[order[i - 1]];
    const Value& now = values[order[i]];
    const bool is_usual = last == now ? order[i - 1] > order[i] : !are_equal(last, now, column);
    if (!is_usual) return order;
  }
  return {};
}

void restore_order(tevpf::Table& table, const tevpf::Column& column,
                   const std::vector<std::size_t>& order) {
  if (!column.is_indexed() || !is_permutation_of_rows(order, table.size())) return;
  const std::vector<Value> values = values_of(table, column);
  const auto starts_group = [&](std::size_t i) {
    return !are_equal(values[order[i - 1]], values[order[i]], column);
  };
  for (std::size_t i = 1; i < order.size(); ++i) {
    if (starts_group(i) && values[order[i]] < values[order[i - 1]]) return;
  }
  const std::vector<std::size_t> now = index_order(table, column);
  for (std::size_t end = order.size(); end > 0;) {
    std::size_t begin = end - 1;
    while (begin > 0 && !starts_group(begin)) --begin;
    const auto at = [](const auto& rows, std::size_t i) {
      return rows.begin() + static_cast<std::ptrdiff_t>(i);
    };
    // Each row comes in front of those that are there: the first one last.
    const bool is_there = std::equal(at(order, begin), at(order, end), at(now, begin));
    for (std::size_t i = end; !is_there && i > begin; --i) {
      const Value& value = values[order[i - 1]];
      const std::optional<Value> other = another_value(value, column);
      if (!other) return;
      table.set(order[i - 1], column.name(), *other);
      table.set(order[i - 1], column.name(), value);
    }
    end = begin;
  }
}

std::int32_t display_width_of(const tevpf::Table& table) {
  std::int32_t columns = 0, rows = 0, row_size = 0, width = 0, current = 0;
  static_cast<void>(table.size());  // makes its file the library's current one
  const std::string name(table.name());
  tevpf::detail::check(
      TEV8R1_PF_inq_table_info(name.c_str(), &columns, &rows, &row_size, &width, &current));
  return width;
}

void add_columns(tevpf::Table& table, const std::vector<tevpf::Column>& columns,
                 std::int32_t display_width) {
  std::int64_t width = -1;  // of the columns so far, with two blanks between them
  bool is_restored = display_width == 0;
  for (const tevpf::Column& column : columns) {
    table.add_column(column);
    const auto name_size = static_cast<std::int32_t>(column.name().size());
    width += std::max(column.width(), name_size) + 2;
    const bool is_last = &column == &columns.back();
    if (is_restored || (width != display_width && !is_last)) continue;
    compute_display_width(table);
    is_restored = true;
  }
}

}  // namespace tool
