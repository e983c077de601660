// tevpf set: changes the value of one parameter, within its bounds.
#include <cstring>

#include "commands.h"
#include "elements.h"
#include "messages.h"
#include "text.h"

namespace tool {
namespace {

// The address of a value in its binary form.
const void* binary(const Value& value) {
  return std::visit(
      [](const auto& v) -> const void* {
        if constexpr (std::is_same_v<std::decay_t<decltype(v)>, std::string>) {
          return v.c_str();
        } else {
          return &v;
        }
      },
      value);
}

}  // namespace

ExitStatus run_set(const Arguments& arguments) {
  PfFile file = PfFile::open_to_change(arguments.file);
  const Element list = file.find(arguments.element, Kind::kList);
  const Parameter parameter = find_parameter(file, list.name, arguments.parameter);
  const auto refuse = [&](Parsed parsed) {
    throw Failure(kRefused, visible(file.path()) + ": " + in_quotes(parameter.name) + " of list " +
                                in_quotes(list.name) + " stays as it is: " +
                                refused_value(arguments.value, parameter.type, parsed,
                                              parameter.bounds, parameter.units));
  };
  Value value;
  const Parsed parsed = parse_value(parameter.type, arguments.value, value);
  if (parsed != Parsed::kValue) refuse(parsed);
  const TEVPF_STATUS status =
      TEV8R1_PF_modify_param(list.name.c_str(), parameter.name.c_str(), binary(value));
  if (status == PF_RANGE) refuse(Parsed::kOutOfRange);
  require(status, file.path(), "set the parameter");
  file.save();
  return kDone;
}

}  // namespace tool
