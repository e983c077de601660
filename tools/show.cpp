// tevpf show: a list or a table for people (aligned text) or programs (JSON).
#include <algorithm>
#include <numeric>
#include <optional>

#include "commands.h"
#include "files.h"
#include "json.h"
#include "output.h"
#include "text.h"
#include "text_table.h"
#include "values.h"

namespace tool {
namespace {

using Align = TextTable::Align;

// ---- Lists ----

void show_list(Output& output, const tevpf::List& list) {
  std::vector<tevpf::Parameter> parameters;
  for (const tevpf::Parameter& p : list) parameters.push_back(p);
  TextTable text;
  for (const char* heading : {"name", "value", "units", "bounds", "description"}) {
    text.add_column(heading, Align::kLeft);
  }
  text.write(output, parameters.size(), [&](std::size_t row, std::size_t column) {
    const tevpf::Parameter& p = parameters[row];
    switch (column) {
      case 0:
        return p.name();
      case 1:
        return display_text(p.value(), p.precision());
      case 2:
        return p.units();
      case 3:
        return bounds_text(p.bounds(), {});
      default:
        return p.description();
    }
  });
}

// What parameters and columns have in common, behind their own members.
template <class Definition>
Json with_definition(Json json, const Definition& definition) {
  if (const auto& bounds = definition.bounds()) {
    json["min"] = value_json(bounds->min);
    json["max"] = value_json(bounds->max);
  }
  if (definition.precision() > 0) json["precision"] = definition.precision();
  json["units"] = definition.units();
  json["description"] = definition.description();
  return json;
}

void show_list_json(Output& output, const tevpf::List& list, const tevpf::Element& element) {
  Json json = {{"list", element.name}, {"description", element.description}};
  json["parameters"] = Json::array();
  for (const tevpf::Parameter& p : list) {
    json["parameters"].push_back(with_definition({{"name", p.name()},
                                                  {"type", tevpf::to_string(p.type())},
                                                  {"value", value_json(p.value())}},
                                                 p));
  }
  output.write(json_text(json, 1) + "\n");
}

// ---- Tables ----

Json column_json(const tevpf::Column& c) {
  Json json = with_definition(
      {{"name", c.name()}, {"type", tevpf::to_string(c.type())}, {"width", c.width()}}, c);
  json["indexed"] = c.is_indexed();
  json["unique"] = c.is_unique();
  return json;
}

// What of a table is shown: columns by position and rows by number, in the order asked for.
struct Selection {
  Columns all;
  std::vector<std::size_t> columns, rows;
};

// Each --columns is one name, or several with commas between them.
std::vector<std::size_t> chosen_columns(const Columns& all, const std::vector<std::string>& names) {
  std::vector<std::size_t> chosen;
  if (names.empty()) {
    chosen.resize(all.size());
    std::iota(chosen.begin(), chosen.end(), std::size_t{0});
  }
  for (const std::string& name : names) {
    const bool is_one_name = all.has(name);
    for (std::size_t begin = 0; begin <= name.size();) {
      const std::size_t end =
          is_one_name ? name.size() : std::min(name.find(',', begin), name.size());
      chosen.push_back(all.position_of(name.substr(begin, end - begin)));
      begin = end + 1;
    }
  }
  return chosen;
}

void sort_rows(std::vector<std::size_t>& rows, const tevpf::Table& table, std::size_t column) {
  std::vector<Value> keys;
  keys.reserve(rows.size());
  for (const tevpf::RowView row : table) keys.push_back(row.value(column));
  std::stable_sort(rows.begin(), rows.end(),
                   [&](std::size_t a, std::size_t b) { return comes_before(keys[a], keys[b]); });
}

Selection select(const tevpf::File& file, const tevpf::Table& table, const Arguments& arguments) {
  const Columns all(file, table);
  const std::vector<std::size_t> columns = chosen_columns(all, arguments.columns);
  std::vector<std::size_t> rows(table.size());
  std::iota(rows.begin(), rows.end(), std::size_t{0});
  if (!arguments.sort.empty()) sort_rows(rows, table, all.position_of(arguments.sort));
  if (arguments.to != 0) rows.resize(std::min(arguments.to, rows.size()));
  const std::size_t skipped = arguments.from == 0 ? 0 : std::min(arguments.from - 1, rows.size());
  rows.erase(rows.begin(), rows.begin() + static_cast<std::ptrdiff_t>(skipped));
  return {all, columns, rows};
}

void show_table(Output& output, const tevpf::Table& table, const Selection& selection) {
  TextTable text;
  for (const std::size_t column : selection.columns) {
    const tevpf::Column& c = selection.all[column];
    text.add_column(c.units().empty() ? c.name() : c.name() + " [" + c.units() + "]",
                    c.type() == Type::string ? Align::kLeft : Align::kRight);
  }
  std::optional<tevpf::Row> current;
  text.write(output, selection.rows.size(), [&](std::size_t row, std::size_t i) {
    if (i == 0) current = table.row(selection.rows[row]);
    const std::size_t column = selection.columns[i];
    return display_text(current->value(column), selection.all[column].precision());
  });
}

// Rows are written one by one, so that a large table needs no JSON in memory.
void show_table_json(Output& output, const tevpf::Table& table, const tevpf::Element& element,
                     const Selection& selection) {
  Json definitions = Json::array();
  for (const std::size_t column : selection.columns) {
    definitions.push_back(column_json(selection.all[column]));
  }
  output.write("{\"table\": " + json_text(element.name) +
               ",\n\"description\": " + json_text(element.description) +
               ",\n\"columns\": " + json_text(definitions, 1) + ",\n\"rows\": [");
  const char* separator = "\n";
  for (const std::size_t number : selection.rows) {
    const tevpf::Row row = table.row(number);
    Json json = Json::object();
    for (const std::size_t column : selection.columns) {
      json[selection.all[column].name()] = value_json(row.value(column));
    }
    output.write(separator + json_text(json));
    separator = ",\n";
  }
  output.write("\n]}\n");
}

void refuse_table_options(const Arguments& arguments) {
  if (arguments.columns.empty() && arguments.sort.empty() && arguments.from == 0 &&
      arguments.to == 0) {
    return;
  }
  throw Failure(kUsage, in_quotes(arguments.element) +
                            " is a list; --columns, --sort, --from and --to are for tables");
}

}  // namespace

ExitStatus run_show(const Arguments& arguments) {
  const tevpf::File file = open_to_read(arguments.file);
  const tevpf::Element element = find_element(file, arguments.element, arguments.kind());
  Output output({}, file.name());
  if (element.kind == tevpf::Kind::list) {
    refuse_table_options(arguments);
    const tevpf::List list = file.list(element.name);
    arguments.json ? show_list_json(output, list, element) : show_list(output, list);
  } else {
    const tevpf::Table table = file.table(element.name);
    const Selection selection = select(file, table, arguments);
    arguments.json ? show_table_json(output, table, element, selection)
                   : show_table(output, table, selection);
  }
  output.finish();
  return finish_reading(file);
}

}  // namespace tool
