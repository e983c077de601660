// tevpf info: what FILE holds, one line an element.
#include "commands.h"
#include "files.h"
#include "json.h"
#include "output.h"
#include "text.h"
#include "text_table.h"

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
  Json lists = Json::array(), tables = Json::array();
  for (const tevpf::Element& element : elements) {
    const Sizes sizes = sizes_of(file, element);
    Json entry = {{"name", element.name}, {"description", element.description}};
    if (element.kind == tevpf::Kind::list) {
      entry["parameters"] = sizes.parameters;
      lists.push_back(entry);
    } else {
      entry["rows"] = sizes.rows;
      entry["columns"] = sizes.columns;
      entry["row_bytes"] = sizes.row_bytes;
      tables.push_back(entry);
    }
  }
  const Json all = {
      {"file", file.name()}, {"bytes", size_on_disk(file)}, {"lists", lists}, {"tables", tables}};
  output.write(json_text(all, 2) + "\n");
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

}  // namespace

ExitStatus run_info(const Arguments& arguments) {
  const tevpf::File file = open_to_read(arguments.file);
  const std::vector<tevpf::Element> elements = file.elements();
  Output output({}, file.name());
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
