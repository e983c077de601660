// tevpf cp: copies an element within its file.
#include "commands.h"

namespace tool {

ExitStatus run_cp(const Arguments& arguments) {
  check_new_name(*arguments.new_name, "the new name");
  change_file(arguments.target(), Missing::kRefused, [&](tevpf::File& file) {
    const tevpf::Element element = find_element(file, arguments.element, arguments.kind());
    if (element.kind == tevpf::Kind::list) {
      file.copy_list(element.name, *arguments.new_name);
    } else {
      file.copy_table(element.name, *arguments.new_name);
    }
  });
  return kDone;
}

}  // namespace tool
