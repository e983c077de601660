// tevpf get: the value of one parameter, exactly and nothing else; with --json its definition, too.
#include "commands.h"
#include "element_json.h"
#include "files.h"
#include "output.h"
#include "platform.h"
#include "text.h"
#include "values.h"

namespace tool {

ExitStatus run_get(const Arguments& arguments) {
  const tevpf::File file = open_to_read(arguments.file);
  const tevpf::Element list = find_element(file, arguments.element, tevpf::Kind::list);
  const tevpf::Parameter parameter = find_parameter(file, list.name, *arguments.member);
  const std::string value = exact_text(parameter.value());
  if (arguments.json) {
    print(parameter_json(parameter) + "\n");
  } else {
    // A script gets the very bytes; a terminal must not act upon them.
    print((is_terminal(stdout) ? visible(value) : value) + "\n");
  }
  return finish_reading(file);
}

}  // namespace tool
