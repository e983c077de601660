// tevpf info: what FILE holds, one line an element; or how an element is defined.
#include "commands.h"
#include "element_json.h"
#include "files.h"
#include "json.h"
#include "output.h"
#include "platform.h"
#include "text.h"
#include "text_table.h"
#include "values.h"

namespace tool {
namespace {

struct Sizes {
  std::size_t parameters = 0, rows = 0, columns = 0, row_bytes = 0;
};

Sizes sizes_of(const tevpf::File& file, const tevpf::Element& element) {
  if (element.kind == tevpf::Kind::list) return {file.list(element.name).size(), 0, 0, 0};
  const tevpf::Table table = file.table(element.name);
  return {0, table.size(), table.columns().size(), table.row_size()};
}

void write_json(Output& output, const tevpf::File& file,
                const std::vector<tevpf::Element>& elements) {
  std::string lists, tables;
  JsonLines list_lines(lists), table_lines(tables);
  for (const tevpf::Element& element : elements) {
    const Sizes sizes = sizes_of(file, element);
    JsonObject json;
    json.add_text("name", element.name);
    json.add_text("description", element.description);
    if (element.kind == tevpf::Kind::list) {
      json.add("parameters", std::to_string(sizes.parameters));
      list_lines.add(json.text());
    } else {
      json.add("rows", std::to_string(sizes.rows));
      json.add("columns", std::to_string(sizes.columns));
      json.add("row_bytes", std::to_string(sizes.row_bytes));
      table_lines.add(json.text());
    }
  }
  list_lines.finish();
  table_lines.finish();
  JsonObject all;
  all.add_text("file", file.name());
  all.add("bytes", std::to_string(size_on_disk(file)));
  output.write("{" + all.text().substr(1, all.text().size() - 2) + ",\n\"lists\": " + lists +
               ",\n\"tables\": " + tables + "}\n");
}

void write_lines(Output& output, const tevpf::File& file,
                 const std::vector<tevpf::Element>& elements) {
  using Align = TextTable::Align;
  std::vector<std::vector<std::string>> lines;
  for (const tevpf::Element& element : elements) {
    const Sizes sizes = sizes_of(file, element);
    lines.push_back(
        element.kind == tevpf::Kind::list
            ? std::vector<std::string>{"list", element.name, counted(sizes.parameters, "parameter"),
                                       "", "", element.description}
            : std::vector<std::string>{"table", element.name, counted(sizes.rows, "row"),
                                       counted(sizes.columns, "column"),
                                       counted(sizes.row_bytes, "byte") + " a row",
                                       element.description});
  }
  TextTable text;
  for (const Align align :
       {Align::kLeft, Align::kLeft, Align::kRight, Align::kRight, Align::kRight, Align::kLeft}) {
    text.add_column("", align);
  }
  text.write(output, lines.size(),
             [&](std::size_t row, std::size_t column) { return lines[row][column]; });
}

// How a list or a table is defined: a line for each parameter or column.
template <class Definition>
std::vector<std::string> definition_line(const Definition& definition, const std::string& width,
                                         const std::string& index) {
  return {definition.name(),
          tevpf::to_string(definition.type()),
          width,
          definition.units(),
          bounds_text(definition.bounds(), {}),
          definition.precision() > 0 ? std::to_string(definition.precision()) : "",
          index,
          definition.description()};
}

void write_definitions(Output& output, const tevpf::File& file, const tevpf::Element& element) {
  std::vector<std::vector<std::string>> lines;
  if (element.kind == tevpf::Kind::list) {
    for (const tevpf::Parameter& p : file.list(element.name)) {
      lines.push_back(definition_line(p, "", ""));
    }
  } else {
    for (const tevpf::Column& c : file.table(element.name).columns()) {
      lines.push_back(definition_line(c, std::to_string(c.width()),
                                      c.is_unique()    ? "unique"
                                      : c.is_indexed() ? "yes"
                                                       : ""));
    }
  }
  std::vector<const char*> headings = {"name",   "type",      "width", "units",
                                       "bounds", "precision", "index", "description"};
  const bool is_list = element.kind == tevpf::Kind::list;
  TextTable text;
  std::vector<std::size_t> shown;
  for (std::size_t i = 0; i < headings.size(); ++i) {
    const std::string_view heading = headings[i];
    if (is_list && (heading == "width" || heading == "index")) continue;
    shown.push_back(i);
    const bool is_number = heading == "width" || heading == "precision";
    text.add_column(headings[i], is_number ? TextTable::Align::kRight : TextTable::Align::kLeft);
  }
  text.write(output, lines.size(),
             [&](std::size_t row, std::size_t column) { return lines[row][shown[column]]; });
}

void write_names(Output& output, const tevpf::File& file, const tevpf::Element& element) {
  if (element.kind == tevpf::Kind::list) {
    for (const tevpf::Parameter& p : file.list(element.name)) {
      output.write(visible(p.name()) + "\n");
    }
  } else {
    for (const tevpf::Column& c : file.table(element.name).columns()) {
      output.write(visible(c.name()) + "\n");
    }
  }
}

void write_definitions_json(Output& output, const tevpf::File& file,
                            const tevpf::Element& element) {
  std::string text;
  JsonLines lines(text);
  if (element.kind == tevpf::Kind::list) {
    for (const tevpf::Parameter& p : file.list(element.name)) lines.add(parameter_json(p));
  } else {
    for (const tevpf::Column& c : file.table(element.name).columns()) lines.add(column_json(c));
  }
  lines.finish();
  output.write(text + "\n");
}

ExitStatus info_of_element(const Arguments& arguments) {
  const tevpf::File file = open_to_read(arguments.file);
  const tevpf::Element element = find_element(file, arguments.element, arguments.kind());
  Output output({}, path_of(file.name()));
  if (arguments.json) {
    write_definitions_json(output, file, element);
  } else if (arguments.names) {
    write_names(output, file, element);
  } else {
    write_definitions(output, file, element);
  }
  output.finish();
  return finish_reading(file);
}

}  // namespace

ExitStatus run_info(const Arguments& arguments) {
  if (!arguments.element.empty()) return info_of_element(arguments);
  const tevpf::File file = open_to_read(arguments.file);
  const std::vector<tevpf::Element> elements = file.elements();
  Output output({}, path_of(file.name()));
  if (arguments.json) {
    write_json(output, file, elements);
  } else if (arguments.names) {
    for (const tevpf::Element& element : elements) output.write(visible(element.name) + "\n");
  } else {
    write_lines(output, file, elements);
  }
  output.finish();
  return finish_reading(file);
}

}  // namespace tool
