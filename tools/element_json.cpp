#include "element_json.h"

#include <algorithm>

#include "index_order.h"
#include "json.h"
#include "text.h"

namespace tool {
namespace {

// What parameters and columns have in common, behind their own members.
template <class Definition>
void add_definition(JsonObject& json, const Definition& definition) {
  const tevpf::Column usual("x", definition.type());
  if (const auto& bounds = definition.bounds()) {
    if (bounds->min != usual.bounds()->min) json.add("min", value_json(bounds->min));
    if (bounds->max != usual.bounds()->max) json.add("max", value_json(bounds->max));
  }
  if (definition.precision() != usual.precision()) {
    json.add("precision", std::to_string(definition.precision()));
  }
  if (!definition.units().empty()) json.add_text("units", definition.units());
  if (!definition.description().empty()) json.add_text("description", definition.description());
}

// Writes rows as objects, or as arrays when a column's name cannot be a key.
class RowWriter {
 public:
  RowWriter(Output& output, const Columns& all, const std::vector<std::size_t>& columns)
      : output_(output), columns_(columns) {
    is_object_ = std::all_of(columns.begin(), columns.end(),
                             [&](std::size_t c) { return is_utf8(all[c].name()); });
    for (const std::size_t c : columns) {
      keys_.push_back(is_object_ ? text_json(all[c].name()) + ": " : "");
    }
  }

  template <class Row>
  void write(const Row& row) {
    line_ = is_first_ ? "\n" : ",\n";
    is_first_ = false;
    line_ += is_object_ ? '{' : '[';
    for (std::size_t i = 0; i < columns_.size(); ++i) {
      if (i > 0) line_ += ", ";
      line_ += keys_[i];
      line_ += value_json(row.value(columns_[i]));
    }
    line_ += is_object_ ? '}' : ']';
    output_.write(line_);
  }
  void finish() { output_.write(is_first_ ? "]}" : "\n]}"); }

 private:
  Output& output_;
  const std::vector<std::size_t>& columns_;
  std::vector<std::string> keys_;
  std::string line_;
  bool is_object_ = true, is_first_ = true;
};

std::string table_head(const tevpf::Element& element, const Columns& all,
                       const std::vector<std::size_t>& columns) {
  std::string text = "{\"table\": " + text_json(element.name) +
                     ", \"description\": " + text_json(element.description) + ",\n\"columns\": ";
  JsonLines lines(text);
  for (const std::size_t c : columns) lines.add(column_json(all[c]));
  lines.finish();
  return text;
}

// What makes the same bytes again beside definitions and rows.
std::string stored_details(const tevpf::Table& table, const Columns& all) {
  std::string text;
  if (const std::int32_t width = display_width_of(table)) {
    text += ",\n\"display_width\": " + std::to_string(width);
  }
  std::string orders;
  for (std::size_t c = 0; c < all.size(); ++c) {
    const std::vector<std::size_t> order = order_to_keep(table, all[c]);
    if (order.empty()) continue;
    std::string numbers;
    for (const std::size_t row : order) {
      numbers += (numbers.empty() ? "" : ", ") + std::to_string(row + 1);
    }
    JsonObject json;
    json.add_text("column", all[c].name());
    json.add("rows", "[" + numbers + "]");
    orders += (orders.empty() ? "\n" : ",\n") + json.text();
  }
  if (!orders.empty()) text += ",\n\"index_order\": [" + orders + "\n]";
  return text;
}

std::vector<std::size_t> all_columns(const Columns& all) {
  std::vector<std::size_t> columns(all.size());
  for (std::size_t c = 0; c < columns.size(); ++c) columns[c] = c;
  return columns;
}

}  // namespace

std::string parameter_json(const tevpf::Parameter& parameter) {
  JsonObject json;
  json.add_text("name", parameter.name());
  json.add_text("type", tevpf::to_string(parameter.type()));
  json.add("value", value_json(parameter.value()));
  add_definition(json, parameter);
  return json.text();
}

std::string column_json(const tevpf::Column& column) {
  JsonObject json;
  json.add_text("name", column.name());
  json.add_text("type", tevpf::to_string(column.type()));
  if (column.type() == Type::string ||
      column.width() != tevpf::Column("x", column.type()).width()) {
    json.add("width", std::to_string(column.width()));
  }
  add_definition(json, column);
  if (column.is_unique()) {
    json.add("unique", "true");
  } else if (column.is_indexed()) {
    json.add("indexed", "true");
  }
  return json.text();
}

void write_list_json(Output& output, const tevpf::List& list, const tevpf::Element& element) {
  std::string text = "{\"list\": " + text_json(element.name) +
                     ", \"description\": " + text_json(element.description) + ",\n\"parameters\": ";
  JsonLines lines(text);
  for (const tevpf::Parameter& parameter : list) lines.add(parameter_json(parameter));
  lines.finish();
  output.write(text + "}");
}

void write_table_json(Output& output, const tevpf::Table& table, const tevpf::Element& element,
                      const Columns& all, const std::vector<std::size_t>& columns,
                      const std::vector<std::size_t>& rows) {
  output.write(table_head(element, all, columns) + ",\n\"rows\": [");
  RowWriter writer(output, all, columns);
  for (const std::size_t number : rows) writer.write(table.row(number));
  writer.finish();
}

void write_element_json(Output& output, const tevpf::File& file, const tevpf::Element& element) {
  if (element.kind == tevpf::Kind::list) {
    return write_list_json(output, file.list(element.name), element);
  }
  const tevpf::Table table = file.table(element.name);
  const Columns all(file, table);
  const std::vector<std::size_t> columns = all_columns(all);
  output.write(table_head(element, all, columns) + stored_details(table, all) + ",\n\"rows\": [");
  RowWriter writer(output, all, columns);
  for (const tevpf::RowView row : table) writer.write(row);
  writer.finish();
}

void write_file_json(Output& output, const tevpf::File& file) {
  output.write("{\"elements\": [");
  const char* separator = "\n";
  for (const tevpf::Element& element : file.elements()) {
    output.write(separator);
    write_element_json(output, file, element);
    separator = ",\n";
  }
  output.write("\n]}\n");
}

}  // namespace tool
