// tevpf rm: removes an element with everything it holds.
#include "commands.h"
#include "files.h"

namespace tool {

ExitStatus run_rm(const Arguments& arguments) {
  tevpf::File file = open_to_change(arguments.file);
  const tevpf::Element element = find_element(file, arguments.element, arguments.kind());
  if (element.kind == tevpf::Kind::list) {
    file.remove_list(element.name);
  } else {
    file.remove_table(element.name);
  }
  save(file);
  return kDone;
}

}  // namespace tool
