// tevpf update: changes what rows of a table hold.
#include "commands.h"
#include "condition.h"
#include "selection.h"
#include "text.h"

namespace tool {

ExitStatus run_update(const Arguments& arguments) {
  std::size_t count = 0;
  change_file(arguments.target(), Missing::kRefused, [&](tevpf::File& file) {
    const tevpf::Element element = find_element(file, arguments.element, tevpf::Kind::table);
    const std::vector<std::size_t> rows = rows_to_change(file, element, arguments);
    update_rows(file, element, rows, arguments.changes);
    count = rows.size();
  });
  report(arguments.target(), counted(count, "row") + " updated");
  return kDone;
}

}  // namespace tool
