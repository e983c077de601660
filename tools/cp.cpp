// tevpf cp: copies an element, within its file or into another one.
#include "commands.h"
#include "conflict.h"
#include "text.h"
#include "transfer.h"

namespace tool {
namespace {

ExitStatus copy_within(const Arguments& arguments) {
  if (!arguments.new_name) {
    throw Failure(kUsage, "a copy within the file needs a new name; --to names another file");
  }
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

ExitStatus copy_to(const Arguments& arguments, const std::string& path) {
  const Conflict conflict = conflict_named(arguments.on_conflict);
  if (arguments.new_name) check_new_name(*arguments.new_name, "the new name");
  refuse_same_file(arguments.file, path);
  const tevpf::File source = open_undamaged(arguments.file);
  const tevpf::Element element = find_element(source, arguments.element, arguments.kind());
  const Target target{path, !arguments.no_lock};
  const bool made = change_file(target, Missing::kMade, [&](tevpf::File& file) {
    const auto name =
        name_in(file, element.kind, arguments.new_name.value_or(element.name), conflict);
    if (name) transfer(source, element, file, *name);
  });
  if (made) report(target, "made " + visible(path));
  return kDone;
}

}  // namespace

ExitStatus run_cp(const Arguments& arguments) {
  return arguments.to_file ? copy_to(arguments, *arguments.to_file) : copy_within(arguments);
}

}  // namespace tool
