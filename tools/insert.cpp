// tevpf insert: adds one row to a table.
#include "commands.h"
#include "row_values.h"
#include "text.h"

namespace tool {
namespace {

// Columns that are not named get the empty text, no number, or their smallest value.
tevpf::Row row_of(const tevpf::File& file, const tevpf::Table& table, const Arguments& arguments) {
  const Subject subject{visible(file.name()) + ": table " + in_quotes(arguments.element),
                        "stays as it is"};
  const Columns columns(file, table);
  tevpf::Row row = table.new_row();
  for (std::size_t c = 0; c < columns.size(); ++c) {
    if (is_floating(columns[c].type()) && !columns[c].is_indexed()) {
      set_cell(row, columns, columns[c].name(), "nan", subject);
    }
  }
  for (const std::string& cell : arguments.cells) {
    const std::size_t sign = cell.find('=');
    if (sign == std::string::npos) {
      throw Failure(kUsage, in_quotes(cell) +
                                " is no COLUMN=VALUE; 'tevpf insert --help' shows "
                                "how to call it");
    }
    set_cell(row, columns, cell.substr(0, sign), cell.substr(sign + 1), subject);
  }
  return row;
}

}  // namespace

ExitStatus run_insert(const Arguments& arguments) {
  change_file(arguments.target(), Missing::kRefused, [&](tevpf::File& file) {
    const tevpf::Element element = find_element(file, arguments.element, tevpf::Kind::table);
    tevpf::Table table = file.table(element.name);
    const tevpf::Row row = row_of(file, table, arguments);
    const std::size_t place = arguments.position;
    if (place > table.size() + 1) {
      throw Failure(kRefused, visible(file.name()) + ": there is no position " +
                                  std::to_string(place) + "; the last one is " +
                                  std::to_string(table.size() + 1));
    }
    place == 0 ? table.append(row) : table.insert(place - 1, row);
  });
  return kDone;
}

}  // namespace tool
