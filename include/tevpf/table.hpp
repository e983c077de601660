// Tables: rows of typed columns.
#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <filesystem>
#include <initializer_list>
#include <iterator>
#include <limits>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "column.hpp"
#include "element.hpp"
#include "row.hpp"
#include "row_layout.hpp"
#include "row_range.hpp"
#include "table_ref.hpp"
#include "value.hpp"

namespace tevpf {
inline namespace v1 {

// What of a table is printed, and how.
struct Listing {
  std::vector<std::string> columns = {};  // none: all
  std::string ordered_by = {};            // an indexed column; empty: storage order
  std::size_t first = 0, last = static_cast<std::size_t>(-1);  // positions in that order, inclusive
  bool definitions = false;                                    // those of the columns, too
};

// A table of an open file: a handle that is copied freely. It means its table by name: once the table
// has been deleted, or renamed through another handle, operations throw PF_NOELEM; once the file is
// closed, PF_NOFILE. Beside these, and std::bad_alloc, operations throw what their comment says; a
// refusal has changed nothing.
//
// Rows are numbered from 0 in storage order. Reading and finding leave the table's cursor and search
// column, which only C code sees; replacing, moving, removing and printing set them. n is the number
// of rows; costs are O(1) where none is given. A column is found in O(columns).
class Table {
 public:
  std::string_view name() const noexcept { return table_.name().view(); }

  // As listed in the file's directory. O(elements of the file).
  std::string description() const;

  std::size_t size() const { return table_.ready(); }
  bool empty() const { return size() == 0; }
  std::size_t row_size() const { return layout().row_size; }  // bytes of a row, gaps included

  // ---- Columns ----

  std::vector<Column> columns() const;               // in column order
  Column definition(std::string_view column) const;  // PF_NOCOLUMN
  bool has_column(std::string_view column) const;

  // Adds a column behind the others; existing rows get the lower bound, or the empty text. O(n).
  //   PF_DUPLICATE  the name is taken
  //   PF_BADUNIQUE  unique, but the table has rows
  //   PF_BADWIDTH   the row would grow beyond 2^31 - 1 bytes
  void add_column(const Column& column);

  // Replaces a column's definition, its name included; new rows start from the lower bounds again.
  // O(n), O(n log n) when it gets an index.
  //   PF_NOCOLUMN; PF_DUPLICATE, PF_BADWIDTH as above
  //   PF_TYPECHG, PF_BADCOLCHG  another type, or width of a string, while the table has rows
  //   PF_RANGE      a row holds a value outside the new bounds
  //   PF_NOTUNIQUE  unique, but two rows hold the same value
  void redefine(std::string_view column, const Column& definition);

  // Moves a column in front of another one, or to the end. O(n).   PF_NOCOLUMN
  void move_column(std::string_view column, std::string_view before);
  void move_column_to_end(std::string_view column);

  // Removes a column; with the last one all rows go. O(n).   PF_NOCOLUMN
  void remove_column(std::string_view column);

  // ---- Reading ----

  Row row(std::size_t number) const;  // PF_BADPOS

  // All rows in storage order, or in that of an indexed column; see RowRange. A table is a range of
  // its rows, too.   PF_NOCOLUMN; PF_BADSEARCH: no index
  RowRange rows() const { return {table_, {}}; }
  RowRange ordered_by(std::string_view column) const;
  RowIterator begin() const { return rows().begin(); }
  std::default_sentinel_t end() const noexcept { return {}; }

  // The first row whose column holds the key: in the column's own order when it is indexed, and then
  // in O(log n), else in storage order and O(n). Reals and doubles are equal within 10^-(precision+1).
  //   PF_NOCOLUMN; PF_BADTYPE: see Cell
  std::optional<Row> find(std::string_view column, const Cell& key) const;

  // The first row whose text starts so; otherwise like find.
  //   PF_BADARG  the prefix holds a "*"
  std::optional<Row> find_prefix(std::string_view column, std::string_view prefix) const;

  // One column's values of all rows in storage order. O(n).
  //   PF_NOCOLUMN; PF_BADTYPE: not exactly that type
  template <Storable T>
  std::vector<T> column(std::string_view column) const;

  // The same into storage of the caller, without the vector's zeroing; gives the number of rows.
  //   PF_BADARG  there are more rows than the storage has room for
  template <Number T>
  std::size_t column(std::string_view column, std::span<T> values_out) const;

  // ---- Rows as bytes ----
  // Beside PF_TYPECHG (the columns are no longer those of the layout):

  RowLayout row_layout() const;

  // Copies whole rows from a position on, in storage order or in that of an indexed column, as many
  // as there are and as rows_out has room for; gives how many. O(rows copied).
  //   numbers_out  receives their row numbers; empty, or room for as many as rows_out
  //   PF_NOCOLUMN; PF_BADSEARCH: no index
  //   PF_BADARG  numbers_out is too small
  std::size_t read_rows(const RowLayout& layout, std::size_t first, std::span<std::byte> rows_out,
                        std::string_view order = {},
                        std::span<std::int32_t> numbers_out = {}) const;

  // Appends rows that lie one behind the other, all or none. Refuses as append does; the sentence says
  // which row it was, counted from 0.
  //   PF_BADARG  not a whole number of rows
  //   std::bad_alloc  the first rows may have been added, when there was no memory to take them back
  void append_rows(const RowLayout& layout, std::span<const std::byte> rows);

  // ---- Changing rows ----
  // Refused beside PF_BADPOS (no such row):
  //   PF_RANGE      a value lies outside its column's bounds; the Error's value() names the column
  //   PF_DUPLICATE  a unique column holds the value already; value() is "column" and its name
  //   PF_TYPECHG    the row was made for other columns
  //   and setting values: see Row::set

  // A row to be filled in: the default row, at first the lower bounds and empty texts.
  Row new_row() const;
  void set_default_row(const Row& row);  // kept in memory only; duplicates are allowed

  // Adds a row behind the others, from values of all columns in column order, or whole. O(log n)
  // comparisons and up to O(n) moves of entries for each index.
  //   PF_BADARG  as many values as columns are needed
  void append(std::initializer_list<Cell> values) { append(make_row(values)); }
  void append(const Row& row);

  // Adds a row so that it gets that number; the ones from there on move up. O(n).
  void insert(std::size_t number, std::initializer_list<Cell> values) {
    insert(number, make_row(values));
  }
  void insert(std::size_t number, const Row& row);

  // Replaces a row; without a number the one that the row is a copy of. O(n) moves of entries for
  // each index whose value changes.
  void replace(std::size_t number, const Row& row);
  void replace(const Row& row) { replace(row.number(), row); }

  // Changes one value of a row; costs as replacing.   PF_NOCOLUMN
  void set(std::size_t number, std::string_view column, const Cell& value);

  void move(std::size_t from, std::size_t to);  // so that it gets the number `to`; O(n)
  void remove(std::size_t number);              // O(n)

  // ---- The table as an element of its file ----

  // This handle follows; others find no table of the old name.   PF_BADNAME, PF_DUPLICATE
  void rename_table(std::string_view new_name);
  void describe(std::string_view description);  // PF_BADARG: more than 79 characters

  // Text files for people to read: everything, or a formatted listing.
  //   PF_OPENFAIL; PF_NOCOLUMN; PF_BADSEARCH: the order's column has no index
  void dump(const std::filesystem::path& path) const;
  void print(const std::filesystem::path& path, const Listing& listing = {}) const;

 private:
  friend class File;
  Table(detail::OpenFilePtr file, detail::Name name) : table_(std::move(file), name) {}

  // The layout as it is now, with the file current.
  const detail::Layout& layout() const {
    table_.ready();
    return *table_.layout();
  }
  const detail::Place& typed_place(std::string_view column, Type type) const;
  Row make_row(std::initializer_list<Cell> values) const;
  std::optional<Row> find(const detail::Place& column, const Value& key, bool is_prefix) const;
  void make_current(std::size_t number) const;
  // The row's bytes, ahead of handing them to the library.
  const unsigned char* checked(const Row& row) const;
  void require_layout(const detail::LayoutPtr& layout, const char* made) const;
  void require_number(std::size_t number, std::size_t count) const;
  void check_added(TEVPF_STATUS status, const detail::Layout& layout,
                   const unsigned char* row) const;
  void check_added(TEVPF_STATUS status, const Row& row) const {
    check_added(status, *row.layout_, row.bytes());
  }
  void cut_rows(std::size_t count);
  void change_columns(TEVPF_STATUS status, std::string_view subject) const;

  mutable detail::TableRef table_;  // keeps what it knows of the columns up to date
};

// ---- Implementation: columns --------------------------------------------------------------------

inline std::string Table::description() const {
  table_.select();
  return detail::description_of(Kind::table, name());
}

inline std::vector<Column> Table::columns() const {
  std::vector<Column> result;
  const std::size_t count = layout().places.size();
  result.reserve(count);
  for (std::size_t i = 0; i < count; ++i) {
    TEVPF_COL_DEF def;
    detail::check(
        TEV8R1_PF_inq_col_def_by_pos(table_.name().c_str(), static_cast<std::int32_t>(i), &def));
    result.push_back(Column::from(def));
  }
  return result;
}

inline Column Table::definition(std::string_view column) const {
  const detail::Name name = detail::lookup_name(column, PF_NOCOLUMN);
  TEVPF_COL_DEF def;
  detail::check(TEV8R1_PF_inq_col_def(table_.select(), name.c_str(), &def));
  return Column::from(def);
}

inline bool Table::has_column(std::string_view column) const {
  return layout().find(column) != nullptr;
}

// What every change of columns ends with: what is known of them is old.
inline void Table::change_columns(TEVPF_STATUS status, std::string_view subject) const {
  ++detail::layout_changes;
  ++detail::row_changes;
  if (status != PF_NORMAL) detail::raise(status, subject);
}

inline void Table::add_column(const Column& column) {
  const TEVPF_STATUS status = TEV8R1_PF_def_column(table_.select_for_change(), column.definition());
  change_columns(status, column.name());
}

inline void Table::redefine(std::string_view column, const Column& definition) {
  const detail::Name name = detail::lookup_name(column, PF_NOCOLUMN);
  const char* const table = table_.select_for_change();
  change_columns(TEV8R1_PF_modify_col_def(table, name.c_str(), definition.definition()), column);
}

inline void Table::move_column(std::string_view column, std::string_view before) {
  const detail::Name name = detail::lookup_name(column, PF_NOCOLUMN);
  const detail::Name next = detail::lookup_name(before, PF_NOCOLUMN);
  change_columns(TEV8R1_PF_move_col(table_.select(), name.c_str(), next.c_str()), column);
}

inline void Table::move_column_to_end(std::string_view column) {
  const detail::Name name = detail::lookup_name(column, PF_NOCOLUMN);
  change_columns(TEV8R1_PF_move_col(table_.select(), name.c_str(), nullptr), column);
}

inline void Table::remove_column(std::string_view column) {
  const detail::Name name = detail::lookup_name(column, PF_NOCOLUMN);
  change_columns(TEV8R1_PF_delete_col(table_.select(), name.c_str()), column);
}

// ---- Implementation: reading --------------------------------------------------------------------

inline void Table::require_number(std::size_t number, std::size_t count) const {
  if (number < count) return;
  throw Error(PF_BADPOS, number == Row::none ? "-1" : std::to_string(number),
              std::to_string(count));
}

// Makes a row the table's current one.
inline void Table::make_current(std::size_t number) const {
  require_number(number, table_.ready());
  std::vector<unsigned char> row(table_.layout()->row_size + 1);
  detail::check(TEV8R1_PF_define_table_search(table_.name().c_str(), nullptr));
  detail::check(TEV8R1_PF_get_row_by_pos(table_.name().c_str(), static_cast<std::int32_t>(number),
                                         row.data()));
}

inline Row Table::row(std::size_t number) const {
  require_number(number, table_.ready());
  Row result(table_.layout());
  table_.read(nullptr, number, 1, result.bytes(), nullptr);
  result.number_ = number;
  return result;
}

inline RowRange Table::ordered_by(std::string_view column) const {
  const detail::Place& place = layout().at(column);
  if (!place.is_indexed) throw Error(PF_BADSEARCH, std::string(column), {});
  return {table_, place.name};
}

inline std::optional<Row> Table::find(const detail::Place& column, const Value& key,
                                      bool is_prefix) const {
  Row result(table_.layout());
  result.number_ = table_.find(column, key, is_prefix, result.bytes());
  if (result.number_ == Row::none) return std::nullopt;
  return result;
}

inline std::optional<Row> Table::find(std::string_view column, const Cell& key) const {
  const detail::Place& place = layout().at(column);
  std::optional<Value> value;
  try {
    value = detail::to_value(place.type, key, {"column", column});
  } catch (const Error& error) {
    if (error.status() != PF_RANGE) throw;
    return std::nullopt;  // beyond the type's range: no row holds it
  }
  return find(place, *value, false);
}

inline std::optional<Row> Table::find_prefix(std::string_view column,
                                             std::string_view prefix) const {
  const detail::Place& place = typed_place(column, Type::string);
  if (prefix.find_first_of(std::string_view("*\0", 2)) != std::string_view::npos) {
    throw Error(PF_BADARG, std::string(prefix), {});
  }
  return find(place, std::string(prefix) + '*', true);
}

inline const detail::Place& Table::typed_place(std::string_view column, Type type) const {
  const detail::Place& place = layout().at(column);
  if (place.type != type) detail::raise_type({"column", column}, place.type);
  return place;
}

template <Storable T>
std::vector<T> Table::column(std::string_view column) const {
  const detail::Place& place = typed_place(column, type_of<T>);
  const std::size_t rows = size();
  std::vector<T> result(rows);
  if (rows == 0) return result;
  const char* const table = table_.name().c_str();
  if constexpr (Number<T>) {
    detail::check(TEV8R1_PF_get_col_values(table, place.name.c_str(), result.data()));
  } else {
    const auto size = static_cast<std::size_t>(place.size);
    std::vector<char> texts(rows * size);
    detail::check(TEV8R1_PF_get_col_values(table, place.name.c_str(), texts.data()));
    for (std::size_t i = 0; i < rows; ++i) result[i] = texts.data() + i * size;
  }
  return result;
}

template <Number T>
std::size_t Table::column(std::string_view column, std::span<T> values_out) const {
  const detail::Place& place = typed_place(column, type_of<T>);
  const std::size_t rows = size();
  if (rows > values_out.size()) {
    throw Error(PF_BADARG, std::to_string(values_out.size()), std::to_string(rows),
                "there is no room for the values of " + std::to_string(rows) + " rows");
  }
  if (rows == 0) return 0;
  detail::check(
      TEV8R1_PF_get_col_values(table_.name().c_str(), place.name.c_str(), values_out.data()));
  return rows;
}

// ---- Implementation: changing rows --------------------------------------------------------------

inline Row Table::new_row() const {
  layout();
  Row result(table_.layout());
  detail::check(TEV8R1_PF_inq_dft_row(table_.name().c_str(), result.bytes()));
  return result;
}

inline Row Table::make_row(std::initializer_list<Cell> values) const {
  const std::size_t columns = layout().places.size();
  if (values.size() != columns) {
    throw Error(PF_BADARG, std::to_string(values.size()), std::to_string(columns),
                "table '" + std::string(name()) + "' has " + std::to_string(columns) +
                    " columns, but " + std::to_string(values.size()) + " values were given");
  }
  Row result(table_.layout());
  std::size_t i = 0;
  for (const Cell& value : values) result.set(i++, value);
  return result;
}

inline void Table::require_layout(const detail::LayoutPtr& layout, const char* made) const {
  const detail::Layout& now = this->layout();
  if (table_.layout() == layout || now.is_same(*layout)) return;
  throw Error(
      PF_TYPECHG, std::string(name()), {},
      std::string(made) + " made for other columns than table '" + std::string(name()) + "' has");
}

inline const unsigned char* Table::checked(const Row& row) const {
  require_layout(row.layout_, "the row was");
  return row.bytes();
}

// Throws when the library refused a row. For a value out of range it does not say of which column.
inline void Table::check_added(TEVPF_STATUS status, const detail::Layout& layout,
                               const unsigned char* row) const {
  if (status == PF_NORMAL) {
    ++detail::row_changes;
    return;
  }
  if (status == PF_RANGE) {
    for (const detail::Place& place : layout.places) {
      const char* const column = place.name.c_str();
      if (TEV8R1_validate_row_value(table_.name().c_str(), column, row + place.offset) ==
          PF_RANGE) {
        detail::raise(status, column);
      }
    }
  }
  detail::raise(status);
}

inline void Table::set_default_row(const Row& row) {
  const unsigned char* const bytes = checked(row);
  check_added(TEV8R1_PF_set_dft_row(table_.name().c_str(), bytes), row);
}

inline void Table::append(const Row& row) {
  const unsigned char* const bytes = checked(row);
  check_added(TEV8R1_PF_add_row(table_.name().c_str(), bytes), row);
}

inline void Table::insert(std::size_t number, const Row& row) {
  const unsigned char* const bytes = checked(row);
  const std::size_t rows = size();
  if (number != rows) require_number(number, rows);
  check_added(
      TEV8R1_PF_add_row_by_pos(table_.name().c_str(), bytes, static_cast<std::int32_t>(number)),
      row);
}

inline void Table::replace(std::size_t number, const Row& row) {
  const unsigned char* const bytes = checked(row);
  make_current(number);
  check_added(TEV8R1_PF_replace_row(table_.name().c_str(), bytes), row);
}

inline void Table::set(std::size_t number, std::string_view column, const Cell& value) {
  Row changed = row(number);
  replace(changed.set(column, value));
}

inline void Table::move(std::size_t from, std::size_t to) {
  const std::size_t rows = size();
  require_number(from, rows);
  require_number(to, rows);
  if (from == to) return;
  detail::check(TEV8R1_PF_define_table_search(table_.name().c_str(), nullptr));
  detail::check(TEV8R1_PF_move_row(table_.name().c_str(), static_cast<std::int32_t>(from),
                                   static_cast<std::int32_t>(to)));
  ++detail::row_changes;
}

inline void Table::remove(std::size_t number) {
  make_current(number);
  detail::check(TEV8R1_PF_delete_row(table_.name().c_str()));
  ++detail::row_changes;
}

// ---- Implementation: rows as bytes --------------------------------------------------------------

inline RowLayout Table::row_layout() const {
  layout();
  return RowLayout(table_.layout());
}

inline std::size_t Table::read_rows(const RowLayout& layout, std::size_t first,
                                    std::span<std::byte> rows_out, std::string_view order,
                                    std::span<std::int32_t> numbers_out) const {
  require_layout(layout.layout_, "the room for rows was");
  const detail::Name column = detail::lookup_name(order, PF_NOCOLUMN);
  const std::size_t rows = size();
  if (first >= rows || layout.row_size() == 0) return 0;
  const std::size_t count = (std::min)(rows - first, rows_out.size() / layout.row_size());
  if (!numbers_out.empty() && numbers_out.size() < count) {
    throw Error(PF_BADARG, std::to_string(numbers_out.size()), std::to_string(count),
                "there is no room for the numbers of " + std::to_string(count) + " rows");
  }
  return table_.read(order.empty() ? nullptr : column.c_str(), first, count,
                     reinterpret_cast<unsigned char*>(rows_out.data()),
                     numbers_out.empty() ? nullptr : numbers_out.data());
}

inline void Table::append_rows(const RowLayout& layout, std::span<const std::byte> rows) {
  require_layout(layout.layout_, "the rows were");
  const std::size_t row_size = layout.row_size();
  if (row_size == 0 ? !rows.empty() : rows.size() % row_size != 0) {
    throw Error(PF_BADARG, std::to_string(rows.size()), std::to_string(row_size),
                std::to_string(rows.size()) + " bytes are no rows of " + std::to_string(row_size) +
                    " bytes");
  }
  const std::size_t before = size();
  std::size_t done = 0;
  try {
    for (; done * row_size < rows.size(); ++done) {
      const auto* row = reinterpret_cast<const unsigned char*>(rows.data() + done * row_size);
      check_added(TEV8R1_PF_add_row(table_.name().c_str(), row), *layout.layout_, row);
    }
  } catch (const Error& refusal) {
    cut_rows(before);
    throw Error(refusal.status(), refusal.item(), refusal.value(),
                "row " + std::to_string(done) + ": " + refusal.what());
  } catch (...) {
    cut_rows(before);
    throw;
  }
}

// Removes rows from the end until `count` are left.
inline void Table::cut_rows(std::size_t count) {
  for (std::size_t rows = size(); rows > count; --rows) remove(rows - 1);
}

// ---- Implementation: the element ----------------------------------------------------------------

inline void Table::rename_table(std::string_view new_name) {
  const detail::Name name = detail::new_name(new_name);
  detail::check(TEV8R1_modify_elem_name(PF_ELEM_TABLE, table_.select_for_change(), name.c_str()));
  table_.set_name(name);
  ++detail::layout_changes;
}

inline void Table::describe(std::string_view description) {
  const std::string text = detail::element_description(description);
  detail::check(TEV8R1_modify_elem_desc(PF_ELEM_TABLE, table_.select(), text.c_str()));
}

inline void Table::dump(const std::filesystem::path& path) const {
  detail::check(TEV8R1_PF_dump_table(table_.select(), detail::name_of(path).c_str()));
}

inline void Table::print(const std::filesystem::path& path, const Listing& listing) const {
  using NameField = char[TEVPF_NAME_SIZE];
  const std::size_t all = layout().places.size();
  if (!listing.ordered_by.empty()) ordered_by(listing.ordered_by);
  const std::unique_ptr<NameField[]> names(new NameField[listing.columns.size() + 1]);
  for (std::size_t i = 0; i < listing.columns.size(); ++i) {
    const detail::Name name = detail::lookup_name(listing.columns[i], PF_NOCOLUMN);
    std::memcpy(names[i], name.c_str(), name.view().size() + 1);
  }
  constexpr std::size_t last_position = PF_END_POS;
  const std::size_t count = listing.columns.empty() ? all + 1 : listing.columns.size();
  const char* const order = listing.ordered_by.empty() ? nullptr : listing.ordered_by.c_str();
  detail::check(TEV8R1_PF_define_table_search(table_.name().c_str(), order));
  detail::check(TEV8R1_PF_print_table(
      table_.name().c_str(), detail::name_of(path).c_str(), listing.definitions ? 1 : 0,
      static_cast<std::int32_t>(count), names.get(),
      static_cast<std::int32_t>((std::min)(listing.first, last_position)),
      static_cast<std::int32_t>((std::min)(listing.last, last_position))));
}

}  // namespace v1
}  // namespace tevpf
