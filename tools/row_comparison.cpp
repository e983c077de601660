#include "row_comparison.h"

#include <algorithm>
#include <cmath>
#include <optional>
#include <unordered_map>
#include <variant>
#include <vector>

#include "text.h"
#include "values.h"

namespace tool {
namespace {

// A column's values of all rows.
using Values = std::variant<std::vector<std::int32_t>, std::vector<std::int16_t>,
                            std::vector<float>, std::vector<double>, std::vector<std::string>>;

struct LoadedColumn {
  tevpf::Column definition;
  Values values;

  Value at(std::size_t row) const {
    return std::visit([&](const auto& all) { return Value(all[row]); }, values);
  }
};

struct LoadedTable {
  std::vector<LoadedColumn> columns;
  std::size_t rows = 0;
};

Values load(const tevpf::Table& table, const tevpf::Column& column) {
  switch (column.type()) {
    case Type::int32:
      return table.column<std::int32_t>(column.name());
    case Type::int16:
      return table.column<std::int16_t>(column.name());
    case Type::float32:
      return table.column<float>(column.name());
    case Type::float64:
      return table.column<double>(column.name());
    case Type::string:
      break;
  }
  return table.column<std::string>(column.name());
}

// The columns that the other table has, too, in this one's order of them.
LoadedTable load(const tevpf::Table& table, const std::vector<tevpf::Column>& columns) {
  LoadedTable result{{}, table.size()};
  for (const tevpf::Column& column : columns) {
    const tevpf::Column definition = table.definition(column.name());
    result.columns.push_back({definition, load(table, definition)});
  }
  return result;
}

template <class T>
bool same(const T& a, const T& b) {
  if constexpr (std::is_floating_point_v<T>) {
    return (a == b && std::signbit(a) == std::signbit(b)) || (a != a && b != b);
  } else {
    return a == b;
  }
}

bool same(const LoadedColumn& a, std::size_t row, const LoadedColumn& b, std::size_t other) {
  if (a.values.index() != b.values.index()) {
    return exact_text(a.at(row)) == exact_text(b.at(other));
  }
  return std::visit(
      [&](const auto& all) {
        using Column = std::decay_t<decltype(all)>;
        return same(all[row], std::get<Column>(b.values)[other]);
      },
      a.values);
}

class RowComparison {
 public:
  RowComparison(std::string place, const LoadedTable& before, const LoadedTable& after,
                const ReportDifference& report)
      : place_(std::move(place)), before_(before), after_(after), report_(report) {}

  void by_number() {
    const std::size_t common = std::min(before_.rows, after_.rows);
    for (std::size_t row = 0; row < common; ++row) changed(row, row, number_of(row));
    for (std::size_t row = common; row < before_.rows; ++row) removed(row, number_of(row));
    for (std::size_t row = common; row < after_.rows; ++row) added(row, number_of(row));
  }

  void by_key(std::size_t key) {
    std::unordered_map<std::string, std::size_t> rows;  // of `after`, by their keys
    rows.reserve(after_.rows);
    for (std::size_t row = 0; row < after_.rows; ++row) {
      rows.emplace(exact_text(after_.columns[key].at(row)), row);
    }
    std::vector<bool> is_matched(after_.rows);
    bool is_in_order = true;
    std::size_t last = 0;
    for (std::size_t row = 0; row < before_.rows; ++row) {
      const std::string text = exact_text(before_.columns[key].at(row));
      const auto found = rows.find(text);
      if (found == rows.end() || is_matched[found->second]) {
        removed(row, key_of(key, text));
        continue;
      }
      is_matched[found->second] = true;
      is_in_order = is_in_order && found->second >= last;
      last = found->second;
      changed(row, found->second, key_of(key, text));
    }
    for (std::size_t row = 0; row < after_.rows; ++row) {
      if (!is_matched[row]) added(row, key_of(key, exact_text(after_.columns[key].at(row))));
    }
    if (!is_in_order) report_({place_, "order of rows", "by the first file", "by the second file"});
  }

 private:
  std::string number_of(std::size_t row) const {
    return place_ + ", row " + std::to_string(row + 1);
  }
  std::string key_of(std::size_t key, const std::string& text) const {
    return place_ + ", row " + before_.columns[key].definition.name() + "=" + visible(text);
  }
  static std::string row_text(const LoadedTable& table, std::size_t row) {
    std::string text;
    for (const LoadedColumn& column : table.columns) {
      text += (text.empty() ? "" : ", ") + visible(exact_text(column.at(row)));
    }
    return text;
  }
  void changed(std::size_t row, std::size_t other, const std::string& name) const {
    for (std::size_t c = 0; c < before_.columns.size(); ++c) {
      const LoadedColumn &old = before_.columns[c], &now = after_.columns[c];
      if (same(old, row, now, other)) continue;
      report_({name, visible(old.definition.name()), visible(exact_text(old.at(row))),
               visible(exact_text(now.at(other)))});
    }
  }
  void removed(std::size_t row, const std::string& name) const {
    report_({name, "", row_text(before_, row), std::nullopt});
  }
  void added(std::size_t row, const std::string& name) const {
    report_({name, "", std::nullopt, row_text(after_, row)});
  }

  std::string place_;
  const LoadedTable& before_;
  const LoadedTable& after_;
  const ReportDifference& report_;
};

}  // namespace

void compare_rows(const std::string& place, const tevpf::Table& before, const tevpf::Table& after,
                  const ReportDifference& report) {
  std::vector<tevpf::Column> common;
  std::optional<std::size_t> key;
  for (const tevpf::Column& column : before.columns()) {
    if (!after.has_column(column.name())) continue;
    const bool is_key = column.is_unique() && after.definition(column.name()).is_unique();
    if (is_key && !key) key = common.size();
    common.push_back(column);
  }
  const LoadedTable old = load(before, common), now = load(after, common);
  RowComparison rows(place, old, now, report);
  key ? rows.by_key(*key) : rows.by_number();
}

}  // namespace tool
