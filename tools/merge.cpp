// tevpf merge: adds the elements of another file to FILE, all of them or none.
#include "commands.h"
#include "conflict.h"
#include "text.h"
#include "transfer.h"

namespace tool {

ExitStatus run_merge(const Arguments& arguments) {
  const Conflict conflict = conflict_named(arguments.on_conflict);
  refuse_same_file(arguments.other, arguments.file);
  const tevpf::File source = open_undamaged(arguments.other);
  std::string done;
  const bool made = change_file(arguments.target(), Missing::kMade, [&](tevpf::File& file) {
    std::size_t count = 0;
    std::string renamed;
    for (const tevpf::Element& element : source.elements()) {
      const auto name = name_in(file, element.kind, element.name, conflict);
      if (!name) continue;
      transfer(source, element, file, *name);
      ++count;
      if (*name != element.name) {
        renamed += "\n" + in_quotes(element.name) + " is " + in_quotes(*name) + " there";
      }
    }
    done = counted(count, "element") + " added" + renamed;
  });
  report(arguments.target(), done + (made ? "\nmade " + visible(arguments.file) : ""));
  return kDone;
}

}  // namespace tool
