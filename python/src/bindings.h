// What the parts of the extension module tevpf._core share: each binds one class or subject.
//
// The module is the C++ interface as plain functions, values in tuples; the package's Python code makes
// mappings, sequences and pictures of it. All functions hold the interpreter's lock, and none runs
// Python code between two calls of the library that belong together: the library is one thread's.
#pragma once

#include <pybind11/pybind11.h>

#include <tevpf.hpp>

namespace tevpf_python {

namespace py = pybind11;

void bind_errors(py::module_& module);
void bind_rows(py::module_& module);
void bind_tables(py::module_& module);
void bind_lists(py::module_& module);
void bind_files(py::module_& module);

}  // namespace tevpf_python
