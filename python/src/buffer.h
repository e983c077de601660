// The bytes of a Python object that offers them in one piece, such as a numpy array.
#pragma once

#include <pybind11/pybind11.h>

#include <cstddef>
#include <span>

namespace tevpf_python {

namespace py = pybind11;

template <int flags>
class BasicBuffer {
 public:
  explicit BasicBuffer(py::handle object) {
    if (PyObject_GetBuffer(object.ptr(), &view_, flags) != 0) throw py::error_already_set();
  }
  ~BasicBuffer() { PyBuffer_Release(&view_); }
  BasicBuffer(const BasicBuffer&) = delete;
  BasicBuffer& operator=(const BasicBuffer&) = delete;

  std::span<std::byte> bytes() const noexcept {
    return {static_cast<std::byte*>(view_.buf), static_cast<std::size_t>(view_.len)};
  }

 private:
  Py_buffer view_;
};

using Buffer = BasicBuffer<PyBUF_SIMPLE>;
using WritableBuffer = BasicBuffer<PyBUF_WRITABLE>;

}  // namespace tevpf_python
