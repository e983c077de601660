#include <pybind11/stl/filesystem.h>

#include <filesystem>

#include "bindings.h"
#include "text.h"

namespace tevpf_python {
namespace {

using std::filesystem::path;
using tevpf::File;

// (name, description) of each list or of each table.
py::list elements_of(const File& file, tevpf::Kind kind) {
  py::list result;
  for (const tevpf::Element& element : file.elements()) {
    if (element.kind == kind) {
      result.append(py::make_tuple(to_str(element.name), to_str(element.description)));
    }
  }
  return result;
}

py::object damage_of(const File& file) {
  if (!file.damage()) return py::none();
  return to_str(file.damage()->what());
}

}  // namespace

void bind_files(py::module_& module) {
  py::class_<File>(module, "File")
      .def_static("open", [](const path& name) { return File::open(name); })
      .def_static("recover", &File::recover)
      .def_static("create", &File::create)
      .def_property_readonly("name", [](const File& file) { return Text{file.name()}; })
      .def_property_readonly("is_open", &File::is_open)
      .def_property_readonly("is_read_only", &File::is_read_only)
      .def_property_readonly("damage", damage_of)
      .def("save", &File::save)
      .def("save_copy", &File::save_copy)
      .def("dump", &File::dump)
      .def("close", &File::close)
      .def("lists", [](const File& file) { return elements_of(file, tevpf::Kind::list); })
      .def("tables", [](const File& file) { return elements_of(file, tevpf::Kind::table); })
      .def("list", [](const File& file, const Text& name) { return file.list(name); })
      .def("table", [](const File& file, const Text& name) { return file.table(name); })
      .def("create_list", [](File& file, const Text& name,
                             const Text& text) { return file.create_list(name, text); })
      .def("create_table", [](File& file, const Text& name,
                              const Text& text) { return file.create_table(name, text); })
      .def("copy_list", [](File& file, const Text& name,
                           const Text& copy) { return file.copy_list(name, copy); })
      .def("copy_table", [](File& file, const Text& name,
                            const Text& copy) { return file.copy_table(name, copy); })
      .def("remove_list", [](File& file, const Text& name) { file.remove_list(name); })
      .def("remove_table", [](File& file, const Text& name) { file.remove_table(name); });
}

}  // namespace tevpf_python
