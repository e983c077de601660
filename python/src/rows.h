// Rows of tables as tuples, and as blocks of bytes that numpy looks into.
#pragma once

#include <pybind11/pybind11.h>

#include <tevpf.hpp>

namespace tevpf_python {

namespace py = pybind11;

// The values of a row, in column order.
py::tuple row_tuple(const tevpf::Row& row);

void bind_row_blocks(py::class_<tevpf::Table>& bound);

}  // namespace tevpf_python
