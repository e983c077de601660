// Tables: their columns, and rows one by one.
#include <pybind11/stl.h>
#include <pybind11/stl/filesystem.h>

#include <filesystem>

#include "bindings.h"
#include "rows.h"
#include "text.h"
#include "values.h"

namespace tevpf_python {
namespace {

using tevpf::Table;

py::list columns(const Table& table) {
  py::list result;
  for (const tevpf::Column& column : table.columns()) result.append(to_python(column));
  return result;
}

void move_column(Table& table, const Text& column, const std::optional<Text>& before) {
  if (before) {
    table.move_column(column, *before);
  } else {
    table.move_column_to_end(column);
  }
}

py::object found_row(const std::optional<tevpf::Row>& row) {
  if (!row) return py::none();
  return py::make_tuple(row->number(), row_tuple(*row));
}

// (column, value) pairs into a row.
void fill(tevpf::Row& row, const py::dict& values) {
  for (const auto& [column, value] : values) {
    if (!PyUnicode_Check(column.ptr())) throw py::type_error("the name of a column is a str");
    row.set(to_bytes(column), Given(value).cell());
  }
}

void insert(Table& table, std::size_t number, const py::dict& values) {
  tevpf::Row row = table.new_row();
  fill(row, values);
  table.insert(number, row);
}

void replace(Table& table, std::size_t number, const py::dict& values) {
  tevpf::Row row = table.row(number);
  fill(row, values);
  table.replace(number, row);
}

void print(const Table& table, const std::filesystem::path& path, const std::vector<Text>& shown,
           const Text& order, bool definitions) {
  tevpf::Listing listing;
  for (const Text& column : shown) listing.columns.push_back(column.bytes);
  listing.ordered_by = order.bytes;
  listing.definitions = definitions;
  table.print(path, listing);
}

void bind_columns(py::class_<Table>& bound) {
  bound.def("columns", columns)
      .def("column",
           [](const Table& table, const Text& name) { return to_python(table.definition(name)); })
      .def("has_column",
           [](const Table& table, const Text& name) { return table.has_column(name); })
      .def("add_column",
           [](Table& table, const py::tuple& fields) { table.add_column(to_column(fields)); })
      .def("redefine", [](Table& table, const Text& name,
                          const py::tuple& fields) { table.redefine(name, to_column(fields)); })
      .def("move_column", move_column)
      .def("remove_column", [](Table& table, const Text& name) { table.remove_column(name); });
}

void bind_single_rows(py::class_<Table>& bound) {
  bound
      .def("row",
           [](const Table& table, std::size_t number) { return row_tuple(table.row(number)); })
      .def("find",
           [](const Table& table, const Text& column, py::handle key) {
             const Given given(key);
             return found_row(table.find(column, given.cell()));
           })
      .def("find_prefix",
           [](const Table& table, const Text& column, const Text& prefix) {
             return found_row(table.find_prefix(column, prefix));
           })
      .def("insert", insert)
      .def("replace", replace)
      .def("move", &Table::move)
      .def("remove", &Table::remove);
}

}  // namespace

void bind_tables(py::module_& module) {
  py::class_<Table> bound(module, "Table");
  bound.def_property_readonly("name", [](const Table& table) { return to_str(table.name()); })
      .def_property_readonly("description",
                             [](const Table& table) { return Text{table.description()}; })
      .def_property_readonly("size", &Table::size)
      .def("rename_table", [](Table& table, const Text& name) { table.rename_table(name); })
      .def("describe", [](Table& table, const Text& text) { table.describe(text); })
      .def("dump", &Table::dump)
      .def("print", print);
  bind_columns(bound);
  bind_single_rows(bound);
  bind_row_blocks(bound);
}

}  // namespace tevpf_python
