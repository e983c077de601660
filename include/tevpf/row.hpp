// Rows of a table, and the places of columns in them.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <initializer_list>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "open_file.hpp"
#include "value.hpp"

namespace tevpf {
inline namespace v1 {

namespace detail {

// Where a column's values lie in a row.
struct Place {
  Name name;
  Type type;
  std::int32_t offset;
  std::int32_t size;  // of a value, in bytes
  bool is_indexed;
  bool operator==(const Place&) const = default;
};

// What reading and making rows takes to know of a table's columns.
struct Layout {
  std::vector<Place> places;
  std::size_t row_size = 0;
  std::uint64_t version = 0;  // layout_changes when it was read

  bool is_same(const Layout& other) const {
    return row_size == other.row_size && places == other.places;
  }
  const Place* find(std::string_view column) const noexcept {
    for (const Place& place : places) {
      if (place.name.view() == column) return &place;
    }
    return nullptr;
  }
  const Place& at(std::string_view column) const {
    const Place* const place = find(column);
    if (place == nullptr) throw Error(PF_NOCOLUMN, std::string(column), {});
    return *place;
  }
  const Place& at(std::size_t position) const {
    if (position < places.size()) return places[position];
    throw Error(PF_BADPOS, std::to_string(position), std::to_string(places.size()));
  }
  // The place of a column of exactly that type.
  template <Readable T>
  const Place& typed(const Place& place) const {
    if (place.type != type_of<T>) raise_type({"column", place.name.view()}, place.type);
    return place;
  }
};

using LayoutPtr = std::shared_ptr<const Layout>;

inline Value value_at(const Place& place, const unsigned char* row) {
  return with_type(place.type, [&](auto tag) -> Value {
    return load<typename decltype(tag)::type>(row + place.offset);
  });
}

}  // namespace detail

// What all rows offer for reading. Columns are named, or counted from 0 in column order; both cost
// O(columns), fields of a typed range nothing. PF_NOCOLUMN, PF_BADPOS: there is no such column.
template <class Self>
class RowReading {
 public:
  std::size_t size() const noexcept { return self().layout().places.size(); }

  // The value, of exactly the type T. A std::string_view looks into the row: it is good as long as
  // the row is.   PF_BADTYPE
  template <Readable T, class Which>
  T get(const Which& column) const {
    const detail::Layout& layout = self().layout();
    const detail::Place& place = layout.typed<T>(layout.at(which(column)));
    return detail::load<T>(self().bytes() + place.offset);
  }
  template <class Which>
  Value value(const Which& column) const {
    return detail::value_at(self().layout().at(which(column)), self().bytes());
  }

 private:
  const Self& self() const noexcept { return static_cast<const Self&>(*this); }
  template <class Which>
  static auto which(const Which& column) {
    if constexpr (std::integral<Which>) {
      return static_cast<std::size_t>(column);
    } else {
      return std::string_view(column);
    }
  }
};

class RowReader;
class RowIterator;

// A row while its range is read: good until the range's next step.
class RowView : public RowReading<RowView> {
 public:
  // The row's number in storage order, by which Table replaces and removes rows.
  std::size_t number() const noexcept;

 private:
  friend class RowReading<RowView>;
  friend class RowIterator;
  friend class Row;
  RowView(const RowReader& reader, const unsigned char* bytes) : reader_(&reader), bytes_(bytes) {}
  const detail::Layout& layout() const noexcept;
  const unsigned char* bytes() const noexcept { return bytes_; }

  const RowReader* reader_;
  const unsigned char* bytes_;
};

// A row on its own: found, or made to be added. Setting values changes this copy; Table::replace and
// Table::append hand it to the table, whose columns must still be those that the row was made for.
class Row : public RowReading<Row> {
 public:
  explicit Row(const RowView& view);

  // The number of the row that this is a copy of; of a new row the number is that of no row.
  static constexpr std::size_t none = static_cast<std::size_t>(-1);
  std::size_t number() const noexcept { return number_; }

  // An integer or a fraction becomes a value of the column's type, see Cell. Bounds and uniqueness
  // are checked when the row is handed to the table.
  //   PF_NOCOLUMN
  //   PF_BADTYPE  the Error's item() names the column
  //   PF_RANGE    beyond the type's range, or a text longer than the column is wide; value() is the
  //               column's name
  Row& set(std::string_view column, const Cell& value) {
    store(layout_->at(column), value);
    return *this;
  }
  Row& set(std::size_t column, const Cell& value) {
    store(layout_->at(column), value);
    return *this;
  }

 private:
  friend class RowReading<Row>;
  friend class Table;
  explicit Row(detail::LayoutPtr layout)
      : layout_(std::move(layout)), bytes_(layout_->row_size + 1) {}

  const detail::Layout& layout() const noexcept { return *layout_; }
  const unsigned char* bytes() const noexcept { return bytes_.data(); }
  unsigned char* bytes() noexcept { return bytes_.data(); }

  void store(const detail::Place& place, const Cell& value);

  detail::LayoutPtr layout_;
  std::vector<unsigned char> bytes_;  // one more than the row has: never empty
  std::size_t number_ = none;
};

// ---- Implementation -----------------------------------------------------------------------------

namespace detail {

// A text that is wider than its column.
[[noreturn]] inline void raise_width(const Place& place, std::string_view text) {
  const std::string column(place.name.view());
  throw Error(PF_RANGE, std::string(text), column,
              "'" + column + "': '" + std::string(text) + "' has " + std::to_string(text.size()) +
                  " characters; at most " + std::to_string(place.size - 1) + " are possible");
}

inline void store_value(const Place& place, const Cell& value, unsigned char* row) {
  const Subject subject{"column", place.name.view()};
  with_type(place.type, [&](auto tag) {
    using T = typename decltype(tag)::type;
    if constexpr (Number<T>) {
      const T number = to_number<T>(value, subject);
      std::memcpy(row + place.offset, &number, sizeof number);
    } else {
      const std::string_view text = to_text(value, subject);
      const auto size = static_cast<std::size_t>(place.size);
      if (text.size() >= size) raise_width(place, text);
      if (!text.empty()) std::memcpy(row + place.offset, text.data(), text.size());
      std::memset(row + place.offset + text.size(), 0, size - text.size());
    }
  });
}

}  // namespace detail

inline void Row::store(const detail::Place& place, const Cell& value) {
  detail::store_value(place, value, bytes_.data());
}

}  // namespace v1
}  // namespace tevpf
