#include "values.h"

#include "text.h"

namespace tevpf_python {

const char* name_of(tevpf::Type type) noexcept {
  switch (type) {
    case tevpf::Type::int32:
      return "int32";
    case tevpf::Type::int16:
      return "int16";
    case tevpf::Type::float32:
      return "float32";
    case tevpf::Type::float64:
      return "float64";
    case tevpf::Type::string:
      break;
  }
  return "str";
}

tevpf::Type type_named(std::string_view name) {
  for (const tevpf::Type type : {tevpf::Type::int32, tevpf::Type::int16, tevpf::Type::float32,
                                 tevpf::Type::float64, tevpf::Type::string}) {
    if (name == name_of(type)) return type;
  }
  throw py::value_error("there is no type '" + std::string(name) +
                        "'; there are int16, int32, float32, float64 and str");
}

// ---- Values -------------------------------------------------------------------------------------

namespace {

template <class T>
py::object number_or_text(const T& value) {
  if constexpr (std::is_integral_v<T>) {
    return py::int_(value);
  } else if constexpr (std::is_floating_point_v<T>) {
    return py::float_(static_cast<double>(value));
  } else {
    return to_str(value);
  }
}

[[noreturn]] void refuse(py::handle value) {
  throw py::type_error("a value is a number or a str, not " +
                       std::string(py::str(py::type::handle_of(value).attr("__name__"))));
}

// An integer; beyond 64 bits the nearest double.
std::variant<std::int64_t, double, std::string> to_integer(py::handle value) {
  int overflow = 0;
  const long long number = PyLong_AsLongLongAndOverflow(value.ptr(), &overflow);
  if (overflow == 0) return std::int64_t{number};
  const double wide = PyLong_AsDouble(value.ptr());
  if (PyErr_Occurred() != nullptr) throw py::error_already_set();
  return wide;
}

}  // namespace

py::object to_python(const tevpf::Value& value) {
  return std::visit([](const auto& v) { return number_or_text(v); }, value);
}

py::object to_python(tevpf::Type type, const unsigned char* place) {
  if (type == tevpf::Type::string) return to_str(tevpf::detail::load<std::string_view>(place));
  return tevpf::detail::with_type(type, [place](auto tag) {
    return number_or_text(tevpf::detail::load<typename decltype(tag)::type>(place));
  });
}

Given::Given(py::handle value) {
  PyObject* const object = value.ptr();
  if (PyUnicode_Check(object)) {
    given_ = to_bytes(value);
  } else if (PyFloat_Check(object)) {
    given_ = PyFloat_AS_DOUBLE(object);
  } else if (PyIndex_Check(object)) {
    const auto number = py::reinterpret_steal<py::object>(PyNumber_Index(object));
    if (!number) throw py::error_already_set();
    given_ = to_integer(number);
  } else if (PyObject_HasAttrString(object, "__float__") != 0) {
    const auto number = py::reinterpret_steal<py::object>(PyNumber_Float(object));
    if (!number) throw py::error_already_set();
    given_ = PyFloat_AS_DOUBLE(number.ptr());
  } else {
    refuse(value);
  }
}

tevpf::Value to_value(tevpf::Type type, const Given& given, std::string_view name) {
  return tevpf::detail::to_value(type, given.cell(), {"parameter", name});
}

// ---- Definitions --------------------------------------------------------------------------------

namespace {

template <class T>
py::object bound(const tevpf::Definition<T>& definition, tevpf::Value tevpf::Bounds::*which) {
  if (!definition.bounds()) return py::none();
  return to_python((*definition.bounds()).*which);
}

template <class T>
py::object precision_of(const tevpf::Definition<T>& definition) {
  if (definition.precision() == 0) return py::none();
  return py::int_(definition.precision());
}

// What parameters and columns have in common.
struct Common {
  py::handle units, min, max, precision, description;
};

Given given_or(py::handle value, const tevpf::Value& standing) {
  return Given(value.is_none() ? to_python(standing) : py::reinterpret_borrow<py::object>(value));
}

template <class T>
void apply(const Common& given, T& definition) {
  definition.units(to_bytes(given.units)).description(to_bytes(given.description));
  if (!given.min.is_none() || !given.max.is_none()) {
    if (!definition.bounds()) definition.bounds(0, 0);  // of a string: refuses
    const tevpf::Bounds standing = *definition.bounds();
    const Given min = given_or(given.min, standing.min);
    const Given max = given_or(given.max, standing.max);
    definition.bounds(min.cell(), max.cell());
  }
  if (!given.precision.is_none()) definition.precision(given.precision.cast<std::int32_t>());
}

}  // namespace

py::tuple to_python(const tevpf::Parameter& parameter) {
  using tevpf::Bounds;
  return py::make_tuple(to_str(parameter.name()), to_python(parameter.value()),
                        name_of(parameter.type()), to_str(parameter.units()),
                        bound(parameter, &Bounds::min), bound(parameter, &Bounds::max),
                        precision_of(parameter), to_str(parameter.description()));
}

py::tuple to_python(const tevpf::Column& column) {
  using tevpf::Bounds;
  return py::make_tuple(to_str(column.name()), name_of(column.type()), to_str(column.units()),
                        bound(column, &Bounds::min), bound(column, &Bounds::max),
                        precision_of(column), column.width(), column.is_indexed(),
                        column.is_unique(), to_str(column.description()));
}

tevpf::Parameter to_parameter(const py::tuple& fields) {
  const std::string name = to_bytes(fields[0]);
  const Given given(fields[1]);
  const tevpf::Type type = type_named(to_bytes(fields[2]));
  tevpf::Parameter result(name, to_value(type, given, name));
  apply({fields[3], fields[4], fields[5], fields[6], fields[7]}, result);
  return result;
}

tevpf::Column to_column(const py::tuple& fields) {
  tevpf::Column result(to_bytes(fields[0]), type_named(to_bytes(fields[1])));
  apply({fields[2], fields[3], fields[4], fields[5], fields[9]}, result);
  if (!fields[6].is_none()) result.width(fields[6].cast<std::int32_t>());
  if (fields[7].cast<bool>()) result.indexed();
  if (fields[8].cast<bool>()) result.unique();
  return result;
}

}  // namespace tevpf_python
