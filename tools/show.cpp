// tevpf show: a list or a table for people (aligned text) or programs (JSON).
#include <algorithm>
#include <numeric>

#include "commands.h"
#include "elements.h"
#include "json.h"
#include "output.h"
#include "text.h"
#include "text_table.h"

namespace tool {
namespace {

using Align = TextTable::Align;

// ---- Lists ----

void show_list(Output& output, const std::vector<Parameter>& parameters) {
  TextTable text;
  for (const char* heading : {"name", "value", "units", "bounds", "description"}) {
    text.add_column(heading, Align::kLeft);
  }
  text.write(output, parameters.size(), [&](std::size_t row, std::size_t column) {
    const Parameter& p = parameters[row];
    switch (column) {
      case 0:
        return p.name;
      case 1:
        return display_text(p.value, p.precision);
      case 2:
        return p.units;
      case 3:
        return bounds_text(p.bounds, {});
      default:
        return p.description;
    }
  });
}

Json bounds_json(Json json, const std::optional<Bounds>& bounds, std::int32_t precision) {
  if (bounds) {
    json["min"] = value_json(bounds->min);
    json["max"] = value_json(bounds->max);
  }
  if (precision > 0) json["precision"] = precision;
  return json;
}

Json parameter_json(const Parameter& p) {
  Json json = {{"name", p.name}, {"type", type_word(p.type)}, {"value", value_json(p.value)}};
  json = bounds_json(std::move(json), p.bounds, p.precision);
  json["units"] = p.units;
  json["description"] = p.description;
  return json;
}

// ---- Tables ----

Json column_json(const Column& c) {
  Json json = {{"name", c.name}, {"type", type_word(c.type)}, {"width", c.width}};
  json = bounds_json(std::move(json), c.bounds, c.precision);
  json["units"] = c.units;
  json["description"] = c.description;
  json["indexed"] = c.indexed;
  json["unique"] = c.unique;
  return json;
}

// The columns to show, each --columns being one name or several with commas between them.
std::vector<std::size_t> chosen_columns(const Table& table, const std::vector<std::string>& names) {
  const std::vector<Column>& all = table.columns();
  std::vector<std::size_t> chosen;
  if (names.empty()) {
    chosen.resize(all.size());
    std::iota(chosen.begin(), chosen.end(), std::size_t{0});
  }
  for (const std::string& name : names) {
    const bool is_one_name =
        std::any_of(all.begin(), all.end(), [&](const Column& c) { return c.name == name; });
    for (std::size_t begin = 0; begin <= name.size();) {
      const std::size_t end =
          is_one_name ? name.size() : std::min(name.find(',', begin), name.size());
      chosen.push_back(table.column_position(name.substr(begin, end - begin)));
      begin = end + 1;
    }
  }
  return chosen;
}

// The rows to show, in the order asked for.
std::vector<std::size_t> chosen_rows(Table& table, const Arguments& arguments) {
  std::vector<std::size_t> rows(table.row_count());
  std::iota(rows.begin(), rows.end(), std::size_t{0});
  if (!arguments.sort.empty()) {
    const std::size_t column = table.column_position(arguments.sort);
    std::vector<Value> keys;
    keys.reserve(rows.size());
    for (const std::size_t row : rows) {
      table.read_row(row);
      keys.push_back(table.cell(column));
    }
    std::stable_sort(rows.begin(), rows.end(),
                     [&](std::size_t a, std::size_t b) { return comes_before(keys[a], keys[b]); });
  }
  const std::size_t last = arguments.to == 0 ? rows.size() : std::min(arguments.to, rows.size());
  const std::size_t first = arguments.from == 0 ? 0 : std::min(arguments.from - 1, last);
  return {rows.begin() + static_cast<std::ptrdiff_t>(first),
          rows.begin() + static_cast<std::ptrdiff_t>(last)};
}

void show_table(Output& output, Table& table, const std::vector<std::size_t>& columns,
                const std::vector<std::size_t>& rows) {
  TextTable text;
  for (const std::size_t column : columns) {
    const Column& c = table.columns()[column];
    text.add_column(c.units.empty() ? c.name : c.name + " [" + c.units + "]",
                    is_number(c.type) ? Align::kRight : Align::kLeft);
  }
  text.write(output, rows.size(), [&](std::size_t row, std::size_t column) {
    if (column == 0) table.read_row(rows[row]);
    return display_text(table.cell(columns[column]), table.columns()[columns[column]].precision);
  });
}

// Rows are written one by one, so that a large table needs no JSON in memory.
void show_table_json(Output& output, Table& table, const Element& element,
                     const std::vector<std::size_t>& columns,
                     const std::vector<std::size_t>& rows) {
  Json definitions = Json::array();
  for (const std::size_t column : columns) {
    definitions.push_back(column_json(table.columns()[column]));
  }
  output.write("{\"table\": " + json_text(element.name) +
               ",\n\"description\": " + json_text(element.description) +
               ",\n\"columns\": " + json_text(definitions, 1) + ",\n\"rows\": [");
  for (std::size_t i = 0; i < rows.size(); ++i) {
    table.read_row(rows[i]);
    Json row = Json::object();
    for (const std::size_t column : columns) {
      row[table.columns()[column].name] = value_json(table.cell(column));
    }
    output.write((i == 0 ? "\n" : ",\n") + json_text(row));
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
  const PfFile file = PfFile::open_to_read(arguments.file);
  const Element element = file.find(arguments.element, arguments.kind());
  Output output({}, file.path());
  if (element.kind == Kind::kList) {
    refuse_table_options(arguments);
    const std::vector<Parameter> parameters = read_list(file, element.name);
    if (arguments.json) {
      Json list = {{"list", element.name}, {"description", element.description}};
      list["parameters"] = Json::array();
      for (const Parameter& p : parameters) list["parameters"].push_back(parameter_json(p));
      output.write(json_text(list, 1) + "\n");
    } else {
      show_list(output, parameters);
    }
  } else {
    Table table(file, element.name);
    const std::vector<std::size_t> columns = chosen_columns(table, arguments.columns);
    const std::vector<std::size_t> rows = chosen_rows(table, arguments);
    if (arguments.json) {
      show_table_json(output, table, element, columns, rows);
    } else {
      show_table(output, table, columns, rows);
    }
  }
  output.finish();
  return finish_reading(file);
}

}  // namespace tool
