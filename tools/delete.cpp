// tevpf delete: removes rows of a table.
#include "commands.h"
#include "selection.h"
#include "text.h"

namespace tool {

ExitStatus run_delete(const Arguments& arguments) {
  std::size_t count = 0;
  change_file(arguments.target(), Missing::kRefused, [&](tevpf::File& file) {
    const tevpf::Element element = find_element(file, arguments.element, tevpf::Kind::table);
    tevpf::Table table = file.table(element.name);
    const std::vector<std::size_t> rows = rows_to_change(file, element, arguments);
    for (auto row = rows.rbegin(); row != rows.rend(); ++row) table.remove(*row);
    count = rows.size();
  });
  report(arguments.target(), counted(count, "row") + " deleted");
  return kDone;
}

}  // namespace tool
