#include "column_change.h"

#include <limits>
#include <unordered_map>
#include <vector>

#include "text.h"

namespace tool {
namespace {

Value nearest_to_zero(const tevpf::Column& column) {
  Value value = zero_of(column.type());
  if (const auto& bounds = column.bounds()) {
    if (value < bounds->min) return bounds->min;
    if (bounds->max < value) return bounds->max;
  }
  return value;
}

Value value_of_rows(const tevpf::Column& column, const DefinitionOptions& options,
                    const Subject& subject) {
  if (options.default_value) {
    const std::string& text = *options.default_value;
    if (column.type() == Type::string && text.size() > static_cast<std::size_t>(column.width())) {
      subject.refuse("--default has " + counted(text.size(), "byte") + ", the column holds " +
                     std::to_string(column.width()));
    }
    return value_within(column, text, subject);
  }
  if (column.is_indexed()) return nearest_to_zero(column);
  switch (column.type()) {
    case Type::float32:
      return std::numeric_limits<float>::quiet_NaN();
    case Type::float64:
      return std::numeric_limits<double>::quiet_NaN();
    default:
      return nearest_to_zero(column);
  }
}

std::string row_name(std::size_t number) { return "row " + std::to_string(number + 1); }

// Whether every row may stay where it is.
bool keeps_rows(const tevpf::Column& before, const tevpf::Column& now) {
  return before.type() == now.type() &&
         (now.type() != Type::string || before.width() == now.width());
}

// The value as the column would hold it.
Value converted(const Value& value, const tevpf::Column& column, std::size_t row,
                const Subject& subject) {
  const std::string text = exact_text(value);
  if (column.type() == Type::string) {
    if (text.size() > static_cast<std::size_t>(column.width())) {
      subject.refuse(row_name(row) + " holds " + in_quotes(text) + ", which has " +
                     counted(text.size(), "byte"));
    }
    return text;
  }
  Value result;
  const Parsed parsed = parse_value(column.type(), text, result);
  const bool is_missing = parsed == Parsed::kValue && is_nan(result) && !column.is_indexed();
  if (parsed != Parsed::kValue || !(is_missing || is_within(result, column.bounds()))) {
    subject.refuse(
        "in " + row_name(row) + ", " +
        refused_value(text, parsed == Parsed::kValue ? Parsed::kOutOfRange : parsed, column));
  }
  return result;
}

// Takes all rows out and puts them back in under the new definition.
void rebuild(tevpf::Table& table, std::size_t position, const tevpf::Column& definition,
             const Subject& subject) {
  std::vector<tevpf::Row> rows;
  rows.reserve(table.size());
  for (const tevpf::RowView row : table) rows.emplace_back(row);
  std::vector<Value> values;
  values.reserve(rows.size());
  for (const tevpf::Row& row : rows) {
    values.push_back(converted(row.value(position), definition, row.number(), subject));
  }
  for (std::size_t count = rows.size(); count > 0; --count) table.remove(count - 1);
  table.redefine(definition.name(), definition);
  tevpf::Row made = table.new_row();
  for (std::size_t i = 0; i < rows.size(); ++i) {
    for (std::size_t c = 0; c < made.size(); ++c) {
      made.set(c, c == position ? values[i] : rows[i].value(c));
    }
    table.append(made);
  }
}

std::size_t position_of(const tevpf::Table& table, const std::string& name) {
  const std::vector<tevpf::Column> columns = table.columns();
  std::size_t position = 0;
  while (columns[position].name() != name) ++position;
  return position;
}

// Bounds and unique values, which the library checks, too, but without saying where.
void check_rows(const tevpf::Table& table, std::size_t position, const tevpf::Column& definition,
                const Subject& subject) {
  for (const tevpf::RowView row : table) {
    const Value value = row.value(position);
    if (is_nan(value)) {
      if (definition.is_indexed()) {
        subject.refuse(row_name(row.number()) +
                       " holds no number, and an index needs one in each row");
      }
    } else if (!is_within(value, definition.bounds())) {
      subject.refuse("in " + row_name(row.number()) + ", " +
                     refused_value(exact_text(value), Parsed::kOutOfRange, definition));
    }
  }
}

[[noreturn]] void refuse_equal_rows(const tevpf::Table& table, std::size_t position,
                                    const Subject& subject) {
  std::unordered_map<std::string, std::size_t> rows;  // by their values
  for (const tevpf::RowView row : table) {
    const std::string text = exact_text(row.value(position));
    const auto [first, is_new] = rows.try_emplace(text, row.number());
    if (!is_new) {
      subject.refuse(row_name(first->second) + " and " + row_name(row.number()) + " both hold " +
                     in_quotes(text) + ", so it cannot be unique");
    }
  }
  subject.refuse("two rows hold values that are equal within the column's precision");
}

}  // namespace

void add_column(tevpf::Table& table, const std::string& name, const DefinitionOptions& options,
                const Subject& subject) {
  tevpf::Column column = define_column(name, nullptr, options, subject);
  const std::size_t rows = table.size();
  if (rows > 1 && column.is_unique()) {
    subject.refuse("the " + std::to_string(rows) +
                   " rows that are there would hold the same value; define it without --unique, "
                   "give the rows their values, then define it again with --unique");
  }
  if (rows == 0) return table.add_column(column);
  const Value value = value_of_rows(column, options, subject);
  table.add_column(tevpf::Column(column).indexed(false));
  for (std::size_t row = 0; row < rows; ++row) table.set(row, name, value);
  if (column.is_indexed()) table.redefine(name, column);
}

void change_column(tevpf::Table& table, const std::string& name, const DefinitionOptions& options,
                   const Subject& subject) {
  if (options.default_value) {
    subject.refuse("--default is for new columns; 'tevpf update' changes what rows hold");
  }
  const tevpf::Column before = table.definition(name);
  const tevpf::Column now = define_column(name, &before, options, subject);
  if (now == before) return;
  const std::size_t position = position_of(table, name);
  if (!table.empty() && !keeps_rows(before, now)) return rebuild(table, position, now, subject);
  check_rows(table, position, now, subject);
  try {
    table.redefine(name, now);
  } catch (const tevpf::Error& error) {
    if (error.status() != PF_NOTUNIQUE) throw;
    refuse_equal_rows(table, position, subject);
  }
}

}  // namespace tool
