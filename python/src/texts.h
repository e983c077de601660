// Texts in blocks of rows.
#pragma once

#include <pybind11/pybind11.h>

#include <cstddef>
#include <span>
#include <string>
#include <tevpf.hpp>
#include <vector>

namespace tevpf_python {

namespace py = pybind11;

py::list list_of(const std::vector<std::string>& texts);

// The fields of a layout that hold texts.
class TextFields {
 public:
  explicit TextFields(const tevpf::RowLayout& layout);

  // Puts zeros behind the terminators, as numpy expects them: whatever lies there means nothing.
  void clear_ends(std::span<std::byte> rows) const noexcept;

 private:
  std::size_t row_size_;
  std::vector<tevpf::RowField> fields_;
};

// The largest number of bytes among the texts of a sequence, at least 1.
std::size_t widest(const py::sequence& texts);

// Writes a sequence of texts into a field of as many rows; what is missing becomes the empty text.
//   rows  a writable buffer of zeros, one row for each text
//   PF_BADTYPE  something else in the sequence
//   PF_RANGE    a text is longer than the column is wide
//   PF_BADARG   a text holds a NUL character
void store_texts(const tevpf::RowLayout& layout, std::size_t field, py::handle rows,
                 const py::sequence& texts);

}  // namespace tevpf_python
