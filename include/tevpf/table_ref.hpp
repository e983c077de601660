// A table of an open file as tables and ranges of rows hold it. Not for direct use.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "open_file.hpp"
#include "row.hpp"

namespace tevpf {
inline namespace v1 {
namespace detail {

class TableRef {
 public:
  TableRef(OpenFilePtr file, Name name) : file_(std::move(file)), name_(name) { ready(); }

  const Name& name() const noexcept { return name_; }
  void set_name(Name name) noexcept { name_ = name; }
  const LayoutPtr& layout() const noexcept { return layout_; }  // good after ready()

  // Makes the file current; gives the table's name as the C interface takes it.
  const char* select() const {
    file_->select();
    return name_.c_str();
  }
  // The same ahead of an operation that may refuse without texts.
  const char* select_for_change() const {
    file_->select();
    tevpf_clear_error();
    return name_.c_str();
  }

  // Makes the file current and the layout true; gives the number of rows. The row size is looked at
  // each time: no column that C code added meanwhile lets a row overrun its buffer.
  std::size_t ready() {
    const char* const table = select();
    if (layout_ == nullptr || layout_->version != layout_changes) [[unlikely]] {
      read_layout();
    }
    Info info = inquire(table);
    if (!agrees(info)) [[unlikely]] {
      read_layout();
    }
    return static_cast<std::size_t>(info.rows);
  }

  // Copies rows from a position on, in the order of a column or (null) in storage order; gives how
  // many there were, `count` at most.
  std::size_t read(const char* order, std::size_t first, std::size_t count, unsigned char* rows,
                   std::int32_t* numbers) const {
    auto copied = static_cast<std::int32_t>(count);
    check_columns(tevpf_get_rows(select(), order, static_cast<std::int32_t>(first), &copied,
                                 static_cast<std::int32_t>(layout_->row_size), rows, numbers));
    return static_cast<std::size_t>(copied);
  }

  // Whether this is the layout that the table has now; with it, rows can be read that way.
  bool has_layout(const LayoutPtr& layout) {
    if (layout->version == layout_changes) return true;
    ready();
    return layout_ == layout || layout_->is_same(*layout);
  }
  [[noreturn]] void raise_changed() const {
    const std::string name(name_.view());
    throw Error(PF_TYPECHG, name, {}, "the columns of table '" + name + "' have changed meanwhile");
  }

  // The position, in the order of an indexed column, of the first row whose value is not less than
  // the key; behind the last row when there is none.
  std::size_t lower_bound(const Place& column, const Value& key) const;

  // The row number of the first row whose value is equal to the key, with the row; or Row::none.
  std::size_t find(const Place& column, const Value& key, bool is_prefix, unsigned char* row) const;

 private:
  struct Info {
    std::int32_t columns = 0, rows = 0, row_size = 0, display_width = 0, current_row = 0;
  };

  static Info inquire(const char* table) {
    Info info;
    check(TEV8R1_PF_inq_table_info(table, &info.columns, &info.rows, &info.row_size,
                                   &info.display_width, &info.current_row));
    return info;
  }
  bool agrees(const Info& info) const noexcept {
    return static_cast<std::size_t>(info.columns) == layout_->places.size() &&
           static_cast<std::size_t>(info.row_size) == layout_->row_size;
  }
  void read_layout();
  // Passes a failure of reading on; PF_BADARG says that C code has changed the columns.
  void check_columns(TEVPF_STATUS status) const {
    if (status == PF_NORMAL) return;
    if (status == PF_BADARG) raise_changed();
    raise(status);
  }

  OpenFilePtr file_;
  Name name_;
  LayoutPtr layout_;
};

// ---- Implementation -----------------------------------------------------------------------------

inline void TableRef::read_layout() {
  const char* const table = name_.c_str();
  auto layout = std::make_shared<Layout>();
  layout->version = layout_changes;
  layout->row_size = static_cast<std::size_t>(inquire(table).row_size);
  std::int32_t count = 0;
  std::int32_t* offsets = nullptr;
  check(TEV8R1_PF_inq_col_offsets(table, &count, &offsets));
  const Block<std::int32_t> owned(offsets);
  layout->places.reserve(static_cast<std::size_t>(count));
  for (std::int32_t i = 0; i < count; ++i) {
    TEVPF_COL_DEF def;
    check(TEV8R1_PF_inq_col_def_by_pos(table, i, &def));
    const Block<char> description(def.description);
    std::int32_t size = 0;
    check(TEV8R1_compute_size(def.type, def.width, &size));
    layout->places.push_back(
        {Name(def.name), static_cast<Type>(def.type), offsets[i], size, def.idx_flag != 0});
  }
  layout_ = std::move(layout);
}

// A text that ends in "*" would be taken for a pattern.
inline bool is_pattern(const Value& key) {
  const auto* const text = std::get_if<std::string>(&key);
  return text != nullptr && !text->empty() && text->find('*') == text->size() - 1;
}

inline std::size_t TableRef::lower_bound(const Place& column, const Value& key) const {
  const bool has_star = is_pattern(key);
  Value searched = key;
  if (has_star) std::get<std::string>(searched).pop_back();
  std::vector<unsigned char> row(layout_->row_size);
  std::int32_t position = 0;
  std::int32_t number = 0;
  const TEVPF_STATUS status =
      tevpf_find_row(select(), column.name.c_str(), 1, bytes_of(searched), 0,
                     static_cast<std::int32_t>(layout_->row_size), row.data(), &position, &number);
  if (status == PF_NOTFOUND) return static_cast<std::size_t>(inquire(name_.c_str()).rows);
  check_columns(status);
  auto result = static_cast<std::size_t>(position);
  // Between the text without its star and the text itself others may lie.
  while (has_star &&
         load<std::string_view>(row.data() + column.offset) < std::get<std::string>(key)) {
    if (read(column.name.c_str(), ++result, 1, row.data(), nullptr) == 0) break;
  }
  return result;
}

inline std::size_t TableRef::find(const Place& column, const Value& key, bool is_prefix,
                                  unsigned char* row) const {
  const char* const table = select();
  const bool must_be_equal = !is_prefix && is_pattern(key);
  std::int32_t position = -1;
  std::int32_t number = 0;
  do {
    const TEVPF_STATUS status =
        tevpf_find_row(table, column.name.c_str(), 0, bytes_of(key), position + 1,
                       static_cast<std::int32_t>(layout_->row_size), row, &position, &number);
    if (status == PF_NOTFOUND) return Row::none;
    check_columns(status);
  } while (must_be_equal &&
           load<std::string_view>(row + column.offset) != std::get<std::string>(key));
  return static_cast<std::size_t>(number);
}

}  // namespace detail
}  // namespace v1
}  // namespace tevpf
