#include "selection.h"

#include <algorithm>
#include <numeric>

#include "condition.h"
#include "values.h"

namespace tool {
namespace {

// Each text is one name, or several with commas between them.
std::vector<std::string> split_names(const Columns& all, const std::vector<std::string>& texts) {
  std::vector<std::string> names;
  for (const std::string& text : texts) {
    const bool is_one_name = all.has(text);
    for (std::size_t begin = 0; begin <= text.size();) {
      const std::size_t end =
          is_one_name ? text.size() : std::min(text.find(',', begin), text.size());
      names.push_back(text.substr(begin, end - begin));
      begin = end + 1;
    }
  }
  return names;
}

std::vector<std::size_t> chosen_columns(const Columns& all, const std::vector<std::string>& texts) {
  std::vector<std::size_t> chosen;
  if (texts.empty()) {
    chosen.resize(all.size());
    std::iota(chosen.begin(), chosen.end(), std::size_t{0});
  }
  for (const std::string& name : split_names(all, texts)) chosen.push_back(all.position_of(name));
  return chosen;
}

struct SortKey {
  std::size_t column;
  bool is_downward;
};

SortKey sort_key(const Columns& all, const std::string& name) {
  const bool is_downward = name.starts_with('-') && !all.has(name);
  return {all.position_of(is_downward ? name.substr(1) : name), is_downward};
}

// What is not a number comes last in both directions.
bool goes_first(const Value& a, const Value& b, bool is_downward) {
  return is_downward && !is_nan(a) && !is_nan(b) ? comes_before(b, a) : comes_before(a, b);
}

// From the last key to the first: rows that are equal in one keep the order of those behind it.
void sort_rows(std::vector<std::size_t>& rows, const tevpf::Table& table,
               const std::vector<SortKey>& keys) {
  for (auto key = keys.rbegin(); key != keys.rend(); ++key) {
    std::vector<Value> values;
    values.reserve(table.size());
    for (const tevpf::RowView row : table) values.push_back(row.value(key->column));
    std::stable_sort(rows.begin(), rows.end(), [&](std::size_t a, std::size_t b) {
      return goes_first(values[a], values[b], key->is_downward);
    });
  }
}

// Rows --from to --to of these.
void cut(std::vector<std::size_t>& rows, const Arguments& arguments) {
  if (arguments.to != 0) rows.resize(std::min(arguments.to, rows.size()));
  const std::size_t skipped = arguments.from == 0 ? 0 : std::min(arguments.from - 1, rows.size());
  rows.erase(rows.begin(), rows.begin() + static_cast<std::ptrdiff_t>(skipped));
}

std::vector<std::size_t> rows_that_match(tevpf::File& file, const tevpf::Element& element,
                                         const Arguments& arguments) {
  if (arguments.where) return rows_where(file, element, *arguments.where);
  std::vector<std::size_t> rows(file.table(element.name).size());
  std::iota(rows.begin(), rows.end(), std::size_t{0});
  return rows;
}

}  // namespace

Selection select(tevpf::File& file, const tevpf::Element& element, const Arguments& arguments) {
  const tevpf::Table table = file.table(element.name);
  const Columns all(file, table);
  const std::vector<std::size_t> columns = chosen_columns(all, arguments.columns);
  std::vector<SortKey> keys;
  for (const std::string& name : split_names(all, arguments.sort)) {
    keys.push_back(sort_key(all, name));
  }
  std::vector<std::size_t> rows = rows_that_match(file, element, arguments);
  sort_rows(rows, table, keys);
  cut(rows, arguments);
  if (arguments.limit) {
    rows.resize(std::min(static_cast<std::size_t>(*arguments.limit), rows.size()));
  }
  return {all, columns, rows};
}

std::vector<std::size_t> rows_to_change(tevpf::File& file, const tevpf::Element& element,
                                        const Arguments& arguments) {
  if (!arguments.where && arguments.from == 0 && arguments.to == 0 && !arguments.all) {
    throw Failure(kUsage,
                  "which rows is not said: --where chooses them by a condition, --from and "
                  "--to by their numbers, --all takes all");
  }
  std::vector<std::size_t> rows = rows_that_match(file, element, arguments);
  const auto is_outside = [&](std::size_t row) {
    return row + 1 < arguments.from || (arguments.to != 0 && row >= arguments.to);
  };
  std::erase_if(rows, is_outside);
  return rows;
}

}  // namespace tool
