// Values between Python and the library.
#pragma once

#include <pybind11/pybind11.h>

#include <string>
#include <string_view>
#include <tevpf.hpp>
#include <variant>

namespace tevpf_python {

namespace py = pybind11;

// "int16", "int32", "float32", "float64" and "str": names that numpy.dtype takes, too.
const char* name_of(tevpf::Type type) noexcept;
tevpf::Type type_named(std::string_view name);  // ValueError

py::object to_python(const tevpf::Value& value);

// The value of a field of a row.
py::object to_python(tevpf::Type type, const unsigned char* place);

// A value as Python hands it in: a str, an int, a float, or what offers __index__ or __float__ (the
// scalars of numpy, fractions). Everything else is a TypeError.
class Given {
 public:
  explicit Given(py::handle value);

  // Good as long as this object is.
  tevpf::Cell cell() const {
    return std::visit([](const auto& given) { return tevpf::Cell(given); }, given_);
  }

 private:
  std::variant<std::int64_t, double, std::string> given_;
};

// The value that a new parameter of a type starts with.
tevpf::Value to_value(tevpf::Type type, const Given& given, std::string_view name);

// A parameter and a column in Python: the fields of their classes there, in that order.
//   parameter  name, value, type, units, min, max, precision, description
//   column     name, type, units, min, max, precision, width, indexed, unique, description
// None for bounds, precision and width means those of a new definition.
py::tuple to_python(const tevpf::Parameter& parameter);
py::tuple to_python(const tevpf::Column& column);
tevpf::Parameter to_parameter(const py::tuple& fields);
tevpf::Column to_column(const py::tuple& fields);

}  // namespace tevpf_python
