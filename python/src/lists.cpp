#include <pybind11/stl.h>
#include <pybind11/stl/filesystem.h>

#include "bindings.h"
#include "text.h"
#include "values.h"

namespace tevpf_python {
namespace {

using tevpf::List;

py::object find_prefix(const List& list, const Text& prefix) {
  const std::optional<tevpf::Parameter> found = list.find_prefix(prefix);
  if (!found) return py::none();
  return to_python(*found);
}

// All parameters, read before Python sees the first one.
py::list parameters(const List& list) {
  std::vector<tevpf::Parameter> all;
  for (const tevpf::Parameter& parameter : list) all.push_back(parameter);
  py::list result;
  for (const tevpf::Parameter& parameter : all) result.append(to_python(parameter));
  return result;
}

void add(List& list, const py::tuple& fields, std::optional<std::size_t> position) {
  const tevpf::Parameter parameter = to_parameter(fields);
  if (position) {
    list.insert(*position, parameter);
  } else {
    list.add(parameter);
  }
}

}  // namespace

void bind_lists(py::module_& module) {
  py::class_<List>(module, "List")
      .def_property_readonly("name", [](const List& list) { return to_str(list.name()); })
      .def_property_readonly("description",
                             [](const List& list) { return Text{list.description()}; })
      .def_property_readonly("size", &List::size)
      .def("parameter",
           [](const List& list, const Text& name) { return to_python(list.at(name.bytes)); })
      .def("parameters", parameters)
      .def("position", [](const List& list, const Text& name) { return list.position(name.bytes); })
      .def("find_prefix", find_prefix)
      .def("set", [](List& list, const Text& name,
                     py::handle value) { list.set(name.bytes, Given(value).cell()); })
      .def("add", add)
      .def("redefine",
           [](List& list, const py::tuple& fields) { list.redefine(to_parameter(fields)); })
      .def("rename", [](List& list, const Text& name,
                        const Text& new_name) { list.rename(name.bytes, new_name); })
      .def("move", [](List& list, const Text& name,
                      std::size_t position) { list.move(name.bytes, position); })
      .def("remove", [](List& list, const Text& name) { list.remove(name.bytes); })
      .def("rename_list", [](List& list, const Text& name) { list.rename_list(name); })
      .def("describe", [](List& list, const Text& text) { list.describe(text); })
      .def("dump", &List::dump);
}

}  // namespace tevpf_python
