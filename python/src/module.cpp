#include "bindings.h"

PYBIND11_MODULE(_core, module) {
  module.doc() = "The C++ interface of libtevpf; the package tevpf stands on it.";
  module.attr("VERSION") = std::to_string(TEVPF_VERSION_MAJOR) + '.' +
                           std::to_string(TEVPF_VERSION_MINOR) + '.' +
                           std::to_string(TEVPF_VERSION_PATCH);
  tevpf_python::bind_errors(module);
  tevpf_python::bind_rows(module);
  tevpf_python::bind_tables(module);
  tevpf_python::bind_lists(module);
  tevpf_python::bind_files(module);
}
