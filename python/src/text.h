// Texts. The library's are bytes, taken for UTF-8; bytes that are not become lone surrogates in a str
// and bytes again on the way back, so every text survives.
#pragma once

#include <pybind11/pybind11.h>

#include <string>
#include <string_view>
#include <utility>

namespace tevpf_python {

namespace py = pybind11;

inline py::str to_str(std::string_view text) {
  PyObject* const result =
      PyUnicode_DecodeUTF8(text.data(), static_cast<Py_ssize_t>(text.size()), "surrogateescape");
  if (result == nullptr) throw py::error_already_set();
  return py::reinterpret_steal<py::str>(result);
}

// The bytes of a str; the handle must be one.
inline std::string to_bytes(py::handle text) {
  Py_ssize_t size = 0;
  if (const char* const utf8 = PyUnicode_AsUTF8AndSize(text.ptr(), &size)) {
    return {utf8, static_cast<std::size_t>(size)};
  }
  PyErr_Clear();  // it holds surrogates
  const auto bytes = py::reinterpret_steal<py::bytes>(
      PyUnicode_AsEncodedString(text.ptr(), "utf-8", "surrogateescape"));
  if (!bytes) throw py::error_already_set();
  return bytes;
}

// A text as argument or result of a bound function.
struct Text {
  std::string bytes;
  operator std::string_view() const noexcept { return bytes; }
};

}  // namespace tevpf_python

namespace pybind11::detail {

template <>
struct type_caster<tevpf_python::Text> {
  PYBIND11_TYPE_CASTER(tevpf_python::Text, const_name("str"));

  bool load(handle source, bool) {
    if (!PyUnicode_Check(source.ptr())) return false;
    value.bytes = tevpf_python::to_bytes(source);
    return true;
  }
  static handle cast(const tevpf_python::Text& text, return_value_policy, handle) {
    return tevpf_python::to_str(text.bytes).release();
  }
};

}  // namespace pybind11::detail
