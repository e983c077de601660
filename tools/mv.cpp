// tevpf mv: renames an element.
#include "commands.h"
#include "files.h"

namespace tool {

ExitStatus run_mv(const Arguments& arguments) {
  check_new_name(arguments.new_name, "the new name");
  tevpf::File file = open_to_change(arguments.file);
  const tevpf::Element element = find_element(file, arguments.element, arguments.kind());
  if (element.kind == tevpf::Kind::list) {
    file.list(element.name).rename_list(arguments.new_name);
  } else {
    file.table(element.name).rename_table(arguments.new_name);
  }
  save(file);
  return kDone;
}

}  // namespace tool
