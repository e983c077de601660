#include "rows.h"

#include <pybind11/stl.h>

#include <algorithm>
#include <cstring>
#include <span>
#include <vector>

#include "bindings.h"
#include "buffer.h"
#include "text.h"
#include "texts.h"
#include "values.h"

namespace tevpf_python {
namespace {

using tevpf::RowField;
using tevpf::RowLayout;
using tevpf::Table;

constexpr std::size_t kBlock = std::size_t{1} << 17;  // bytes: stay in the cache until looked at

// (column, type, offset, size) of each field.
py::list fields_of(const RowLayout& layout) {
  py::list result;
  for (const RowField& field : layout.fields()) {
    result.append(
        py::make_tuple(to_str(field.column), name_of(field.type), field.offset, field.size));
  }
  return result;
}

py::tuple tuple_of(const std::vector<RowField>& fields, const std::byte* row) {
  py::tuple result(fields.size());
  for (std::size_t i = 0; i < fields.size(); ++i) {
    const auto* place = reinterpret_cast<const unsigned char*>(row + fields[i].offset);
    PyTuple_SET_ITEM(result.ptr(), static_cast<Py_ssize_t>(i),
                     to_python(fields[i].type, place).release().ptr());
  }
  return result;
}

// Copies rows into a caller's buffer; behind the texts there are zeros then. Gives how many there were.
std::size_t read_rows(const Table& table, const RowLayout& layout, std::size_t first,
                      py::handle rows_out, const Text& order) {
  const WritableBuffer buffer(rows_out);
  const std::size_t row_size = layout.row_size();
  if (row_size == 0) return 0;
  const TextFields texts(layout);
  const std::size_t block = std::max<std::size_t>(kBlock / row_size, 1) * row_size;
  std::span<std::byte> room = buffer.bytes();
  std::size_t done = 0;
  while (!room.empty()) {
    const std::span<std::byte> part = room.first(std::min(block, room.size()));
    const std::size_t count = table.read_rows(layout, first + done, part, order);
    texts.clear_ends(part.first(count * row_size));
    done += count;
    if (count == 0 || count * row_size < part.size()) break;
    room = room.subspan(part.size());
  }
  return done;
}

// `count` rows from a position on, each as (number, values).
py::list read_tuples(const Table& table, const RowLayout& layout, std::size_t first,
                     std::size_t count, const Text& order) {
  std::vector<std::byte> rows(count * layout.row_size());
  std::vector<std::int32_t> numbers(count);
  const std::size_t read = table.read_rows(layout, first, rows, order, numbers);
  const std::vector<RowField> fields = layout.fields();
  py::list result;
  for (std::size_t i = 0; i < read; ++i) {
    result.append(
        py::make_tuple(numbers[i], tuple_of(fields, rows.data() + i * layout.row_size())));
  }
  return result;
}

void append_rows(Table& table, const RowLayout& layout, py::handle rows) {
  const Buffer buffer(rows);
  table.append_rows(layout, buffer.bytes());
}

// The values of a column of numbers, in storage order, into a buffer. Gives how many there are.
std::size_t read_column(const Table& table, const Text& column, py::handle values_out) {
  const WritableBuffer buffer(values_out);
  const std::span<std::byte> bytes = buffer.bytes();
  return tevpf::detail::with_type(table.definition(column).type(), [&](auto tag) -> std::size_t {
    using T = typename decltype(tag)::type;
    if constexpr (tevpf::Number<T>) {
      return table.column(column,
                          std::span(reinterpret_cast<T*>(bytes.data()), bytes.size() / sizeof(T)));
    } else {
      throw py::type_error("the column holds texts");
    }
  });
}

}  // namespace

py::tuple row_tuple(const tevpf::Row& row) {
  py::tuple result(row.size());
  for (std::size_t i = 0; i < row.size(); ++i) result[i] = to_python(row.value(i));
  return result;
}

void bind_rows(py::module_& module) {
  module.def("widest", widest);
  py::class_<RowLayout>(module, "RowLayout")
      .def_property_readonly("row_size", &RowLayout::row_size)
      .def("fields", fields_of)
      .def("store_texts", store_texts);
}

void bind_row_blocks(py::class_<Table>& bound) {
  bound.def("row_layout", &Table::row_layout)
      .def("read_rows", read_rows)
      .def("read_tuples", read_tuples)
      .def("append_rows", append_rows)
      .def("read_column", read_column)
      .def("read_texts", [](const Table& table, const Text& column) {
        return list_of(table.column<std::string>(column));
      });
}

}  // namespace tevpf_python
