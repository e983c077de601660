// tevpf info: what FILE holds, one line an element.
#include "commands.h"
#include "elements.h"
#include "json.h"
#include "messages.h"
#include "output.h"
#include "text.h"
#include "text_table.h"

namespace tool {
namespace {

struct Sizes {
  std::size_t parameters = 0, rows = 0, columns = 0, row_bytes = 0;
};

Sizes sizes_of(const PfFile& file, const Element& element) {
  Sizes sizes;
  if (element.kind == Kind::kList) {
    std::int32_t count = 0;
    require(TEV8R1_PF_inq_num_params(element.name.c_str(), &count), file.path(), "read the list");
    sizes.parameters = static_cast<std::size_t>(count);
  } else {
    const Table table(file, element.name);
    sizes = {0, table.row_count(), table.columns().size(), table.row_size()};
  }
  return sizes;
}

void write_json(Output& output, const PfFile& file, const std::vector<Element>& elements) {
  Json lists = Json::array(), tables = Json::array();
  for (const Element& element : elements) {
    const Sizes sizes = sizes_of(file, element);
    Json entry = {{"name", element.name}, {"description", element.description}};
    if (element.kind == Kind::kList) {
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
      {"file", file.path()}, {"bytes", file.size()}, {"lists", lists}, {"tables", tables}};
  output.write(json_text(all, 2) + "\n");
}

void write_lines(Output& output, const PfFile& file, const std::vector<Element>& elements) {
  using Align = TextTable::Align;
  std::vector<std::vector<std::string>> lines;
  for (const Element& element : elements) {
    const Sizes sizes = sizes_of(file, element);
    lines.push_back(
        element.kind == Kind::kList
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
  const PfFile file = PfFile::open_to_read(arguments.file);
  const std::vector<Element> elements = file.elements();
  Output output({}, file.path());
  if (arguments.json) {
    write_json(output, file, elements);
  } else if (arguments.names) {
    for (const Element& element : elements) output.write(visible(element.name) + "\n");
  } else {
    write_lines(output, file, elements);
  }
  output.finish();
  return finish_reading(file);
}

}  // namespace tool
