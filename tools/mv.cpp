// tevpf mv: renames an element.
#include "commands.h"
#include "messages.h"

namespace tool {

ExitStatus run_mv(const Arguments& arguments) {
  check_new_name(arguments.new_name, "the new name");
  PfFile file = PfFile::open_to_change(arguments.file);
  const Element element = file.find(arguments.element, arguments.kind());
  const std::int32_t type = element.kind == Kind::kList ? PF_ELEM_LIST : PF_ELEM_TABLE;
  require(TEV8R1_modify_elem_name(type, element.name.c_str(), arguments.new_name.c_str()),
          file.path(), "rename the element");
  file.save();
  return kDone;
}

}  // namespace tool
