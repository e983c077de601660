#include "texts.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <string_view>

#include "buffer.h"
#include "text.h"

namespace tevpf_python {

py::list list_of(const std::vector<std::string>& texts) {
  py::list result(texts.size());
  for (std::size_t i = 0; i < texts.size(); ++i) {
    PyList_SET_ITEM(result.ptr(), static_cast<Py_ssize_t>(i), to_str(texts[i]).release().ptr());
  }
  return result;
}

TextFields::TextFields(const tevpf::RowLayout& layout) : row_size_(layout.row_size()) {
  for (tevpf::RowField& field : layout.fields()) {
    if (field.type == tevpf::Type::string) fields_.push_back(std::move(field));
  }
}

namespace {

// Clears what lies behind the first zero of a field, eight bytes at a time.
void clear_end(std::byte* text, std::size_t size) noexcept {
  constexpr std::uint64_t kOnes = 0x0101010101010101, kHighs = 0x8080808080808080;
  bool ended = false;
  for (; size >= sizeof(std::uint64_t); text += sizeof(std::uint64_t), size -= sizeof kOnes) {
    std::uint64_t word;
    std::memcpy(&word, text, sizeof word);
    // The lowest bit that is set is the highest bit of the first byte that is zero.
    const std::uint64_t zeros = (word - kOnes) & ~word & kHighs;
    if (zeros != 0) word &= ((zeros & (~zeros + 1)) >> 7) - 1;
    if (ended) word = 0;
    ended = ended || zeros != 0;
    std::memcpy(text, &word, sizeof word);
  }
  for (; size > 0; ++text, --size) {
    ended = ended || *text == std::byte{0};
    if (ended) *text = std::byte{0};
  }
}

}  // namespace

void TextFields::clear_ends(std::span<std::byte> rows) const noexcept {
  for (const tevpf::RowField& field : fields_) {
    for (std::size_t at = field.offset; at < rows.size(); at += row_size_) {
      clear_end(rows.data() + at, field.size);
    }
  }
}

// ---- From Python --------------------------------------------------------------------------------

namespace {

// None, not-a-number, and pandas' NA.
bool is_missing(PyObject* value) noexcept {
  if (value == Py_None) return true;
  if (PyFloat_Check(value)) return std::isnan(PyFloat_AS_DOUBLE(value));
  return std::string_view(Py_TYPE(value)->tp_name).ends_with("NAType");
}

// A sequence whose items can be looked at one after the other.
py::object fast(const py::sequence& texts) {
  auto items = py::reinterpret_steal<py::object>(PySequence_Fast(texts.ptr(), "no sequence"));
  if (!items) throw py::error_already_set();
  return items;
}

[[noreturn]] void refuse(std::size_t row, const tevpf::RowField& field, TEVPF_STATUS status,
                         const std::string& item, const std::string& problem) {
  throw tevpf::Error(status, item, status == PF_BADTYPE ? "string" : field.column,
                     "row " + std::to_string(row) + ": " + problem);
}

std::string_view check(std::size_t row, const tevpf::RowField& field, std::string_view text) {
  const std::string start = "'" + field.column + "': ";
  if (text.size() >= field.size) {
    refuse(row, field, PF_RANGE, std::string(text),
           start + "'" + std::string(text) + "' has " + std::to_string(text.size()) +
               " characters; at most " + std::to_string(field.size - 1) + " are possible");
  }
  if (text.find('\0') != std::string_view::npos) {
    refuse(row, field, PF_BADARG, std::string(text),
           start + "a text cannot contain a NUL character");
  }
  return text;
}

void store_text(std::size_t row, const tevpf::RowField& field, PyObject* value, std::byte* place) {
  if (is_missing(value)) return;
  if (!PyUnicode_Check(value)) {
    refuse(row, field, PF_BADTYPE, "column " + field.column,
           "column '" + field.column + "' is of type string");
  }
  Py_ssize_t size = 0;
  if (const char* const utf8 = PyUnicode_AsUTF8AndSize(value, &size)) {
    const std::string_view text = check(row, field, {utf8, static_cast<std::size_t>(size)});
    std::memcpy(place, text.data(), text.size());
    return;
  }
  PyErr_Clear();
  const std::string bytes = to_bytes(value);
  std::memcpy(place, check(row, field, bytes).data(), bytes.size());
}

}  // namespace

std::size_t widest(const py::sequence& texts) {
  const py::object items = fast(texts);
  std::size_t result = 1;
  for (Py_ssize_t i = 0; i < PySequence_Fast_GET_SIZE(items.ptr()); ++i) {
    PyObject* const text = PySequence_Fast_GET_ITEM(items.ptr(), i);
    if (!PyUnicode_Check(text)) continue;
    const bool is_ascii = PyUnicode_IS_READY(text) && PyUnicode_IS_ASCII(text);
    const std::size_t size =
        is_ascii ? static_cast<std::size_t>(PyUnicode_GET_LENGTH(text)) : to_bytes(text).size();
    result = std::max(result, size);
  }
  return result;
}

void store_texts(const tevpf::RowLayout& layout, std::size_t field, py::handle rows,
                 const py::sequence& texts) {
  const std::vector<tevpf::RowField> fields = layout.fields();
  if (field >= fields.size() || fields[field].type != tevpf::Type::string) {
    throw py::type_error("the column holds numbers");
  }
  const WritableBuffer buffer(rows);
  const py::object items = fast(texts);
  const auto count = static_cast<std::size_t>(PySequence_Fast_GET_SIZE(items.ptr()));
  if (count * layout.row_size() != buffer.bytes().size()) {
    throw py::value_error("there must be one text for each row");
  }
  std::byte* place = buffer.bytes().data() + fields[field].offset;
  for (std::size_t row = 0; row < count; ++row, place += layout.row_size()) {
    store_text(row, fields[field],
               PySequence_Fast_GET_ITEM(items.ptr(), static_cast<Py_ssize_t>(row)), place);
  }
}

}  // namespace tevpf_python
