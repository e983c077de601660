// tevpf add: a new parameter, or a new empty list.
#include "commands.h"
#include "made.h"
#include "text.h"

namespace tool {
namespace {

void add_list(tevpf::File& file, const Arguments& arguments) {
  if (file.find_list(arguments.element)) {
    throw Failure(kRefused, visible(file.name()) + ": list " + in_quotes(arguments.element) +
                                " is there already; 'tevpf set' changes its description");
  }
  file.create_list(arguments.element, arguments.description.value_or(""));
}

// True: the list was made.
bool add_parameter(tevpf::File& file, const Arguments& arguments) {
  const Subject subject{visible(file.name()) + ": " + in_quotes(*arguments.member) + " of list " +
                            in_quotes(arguments.element),
                        "is not added"};
  std::optional<tevpf::List> found = file.find_list(arguments.element);
  if (found && found->contains(*arguments.member)) {
    subject.refuse("it is there already; 'tevpf set' changes it");
  }
  tevpf::List list = found ? *found : file.create_list(arguments.element);
  list.add(define_parameter(*arguments.member, nullptr, arguments.value, arguments, subject));
  if (arguments.PlaceOptions::is_given()) move_to(list, *arguments.member, arguments, subject);
  return !found;
}

void check_request(const Arguments& arguments) {
  check_new_name(arguments.element, "the list's name");
  if (arguments.member) {
    check_new_name(*arguments.member, "the parameter's name");
    if (!arguments.value) {
      throw Failure(kUsage,
                    "a new parameter needs a value behind its name: tevpf add FILE LIST "
                    "PARAM VALUE");
    }
    return;
  }
  DefinitionOptions others = arguments;
  others.description.reset();
  if (others.defines_anything() || arguments.PlaceOptions::is_given()) {
    throw Failure(kUsage, "without a parameter, only --description has a meaning");
  }
}

}  // namespace

ExitStatus run_add(const Arguments& arguments) {
  check_request(arguments);
  Made made;
  made.file = change_file(arguments.target(), Missing::kMade, [&](tevpf::File& file) {
    made.element = true;
    if (arguments.member) {
      made.element = add_parameter(file, arguments);
    } else {
      add_list(file, arguments);
    }
  });
  report_made(arguments, made, "list");
  return kDone;
}

}  // namespace tool
