// Failures of the library as exceptions of the package.
#include "bindings.h"
#include "text.h"

namespace tevpf_python {
namespace {

// tevpf.errors knows which class stands for a status.
void set_python_error(const tevpf::Error& error) {
  const char* const status = tevpf_status_name(error.status());
  const py::object exception =
      py::module_::import("tevpf.errors")
          .attr("from_status")(status == nullptr ? "" : status, to_str(error.item()),
                               to_str(error.value()), to_str(error.what()));
  PyErr_SetObject(py::type::handle_of(exception).ptr(), exception.ptr());
}

void translate(std::exception_ptr failure) {
  try {
    if (failure) std::rethrow_exception(failure);
  } catch (const tevpf::Error& error) {
    try {
      set_python_error(error);
    } catch (py::error_already_set& other) {
      other.restore();
    }
  }
}

}  // namespace

void bind_errors(py::module_&) { py::register_local_exception_translator(translate); }

}  // namespace tevpf_python
