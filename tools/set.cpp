// tevpf set: changes the value of one parameter, within its bounds.
#include "commands.h"
#include "files.h"
#include "text.h"
#include "values.h"

namespace tool {

ExitStatus run_set(const Arguments& arguments) {
  tevpf::File file = open_to_change(arguments.file);
  const tevpf::Element list = find_element(file, arguments.element, tevpf::Kind::list);
  const tevpf::Parameter parameter = find_parameter(file, list.name, arguments.parameter);
  const auto refuse = [&](Parsed parsed) {
    throw Failure(kRefused, visible(file.name()) + ": " + in_quotes(parameter.name()) +
                                " of list " + in_quotes(list.name) + " stays as it is: " +
                                refused_value(arguments.value, parsed, parameter));
  };
  Value value;
  const Parsed parsed = parse_value(parameter.type(), arguments.value, value);
  if (parsed != Parsed::kValue) refuse(parsed);
  try {
    file.list(list.name).set(parameter.name(), value);
  } catch (const tevpf::Error& error) {
    if (error.status() != PF_RANGE) throw;
    refuse(Parsed::kOutOfRange);
  }
  save(file);
  return kDone;
}

}  // namespace tool
