// Ranges of rows: all rows of a table in storage order or in that of an indexed column, whole or as
// tuples of some of their fields.
#pragma once

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <iterator>
#include <memory>
#include <optional>
#include <ranges>
#include <string_view>
#include <tuple>
#include <utility>
#include <vector>

#include "row.hpp"
#include "table_ref.hpp"

namespace tevpf {
inline namespace v1 {

// Reads rows ahead, some kilobytes at a time, so that a step costs little beside copying the row. Rows
// that the C++ interface changes meanwhile are read again at once, those that C code changes with the
// next block.
class RowReader {
 public:
  struct Block {
    const unsigned char* begin;
    const unsigned char* end;
  };

  // order: a name of no column for storage order. layout: what the rows must have.
  RowReader(detail::TableRef table, detail::Name order, detail::LayoutPtr layout)
      : table_(std::move(table)), order_(order), layout_(std::move(layout)) {}

  // The rows from a position on; none behind the last one. What was read before is gone.
  Block read(std::size_t first);
  // The same from the position of a row of the block that was read last, or from behind its end.
  Block read_from(const unsigned char* row) { return read(first_ + index_of(row)); }

  // Of a row of the block that was read last.
  std::size_t number_of(const unsigned char* row) const noexcept {
    const std::size_t index = index_of(row);
    return numbers_ == nullptr ? first_ + index : static_cast<std::size_t>(numbers_[index]);
  }

  const detail::LayoutPtr& layout() const noexcept { return layout_; }

 private:
  static constexpr std::size_t kFirstBlock = 16;          // rows: a loop may soon be left
  static constexpr std::size_t kLargestBlock = 1U << 13;  // bytes: stays in the nearest cache

  std::size_t index_of(const unsigned char* row) const noexcept {
    return static_cast<std::size_t>(row - rows_.get()) / layout_->row_size;
  }
  void make_room();

  detail::TableRef table_;
  detail::Name order_;
  detail::LayoutPtr layout_;
  std::unique_ptr<unsigned char[]> rows_;    // from position first_ on
  std::unique_ptr<std::int32_t[]> numbers_;  // of these rows; null in storage order
  std::size_t room_ = 0;                     // rows that there is room for
  std::size_t first_ = 0;
};

namespace detail {

// What the two iterators share: movable, not copyable. Where it stands is known here alone, so that it
// can be kept in registers.
template <class Self>
class RowStep {
 public:
  using iterator_concept = std::input_iterator_tag;
  using difference_type = std::ptrdiff_t;

  Self& operator++() {
    row_ += step_;
    if (row_ == end_ || changes_ != row_changes) [[unlikely]] {
      take(reader_->read_from(row_));
    }
    return static_cast<Self&>(*this);
  }
  void operator++(int) { ++*this; }
  friend bool operator==(const Self& it, std::default_sentinel_t) noexcept {
    return it.row_ == it.end_;
  }

 protected:
  RowStep(std::unique_ptr<RowReader> reader, std::size_t first)
      : reader_(std::move(reader)), step_(reader_->layout()->row_size) {
    take(reader_->read(first));
  }
  const RowReader& reader() const noexcept { return *reader_; }
  const unsigned char* row() const noexcept { return row_; }

 private:
  void take(RowReader::Block block) noexcept {
    row_ = block.begin;
    end_ = block.end;
    changes_ = row_changes;
  }

  std::unique_ptr<RowReader> reader_;
  std::size_t step_;
  const unsigned char* row_;
  const unsigned char* end_;
  std::uint64_t changes_;  // row_changes when the block was read
};

}  // namespace detail

class RowIterator : public detail::RowStep<RowIterator> {
 public:
  using value_type = RowView;
  RowView operator*() const noexcept { return {reader(), row()}; }

 private:
  friend class RowRange;
  using RowStep::RowStep;
};

template <Readable... Ts>
class FieldIterator : public detail::RowStep<FieldIterator<Ts...>> {
 public:
  using value_type = std::tuple<Ts...>;
  value_type operator*() const { return read(this->row(), std::index_sequence_for<Ts...>{}); }

 private:
  template <Readable...>
  friend class FieldRange;
  using Offsets = std::array<std::int32_t, sizeof...(Ts)>;
  FieldIterator(std::unique_ptr<RowReader> reader, std::size_t first, const Offsets& offsets)
      : detail::RowStep<FieldIterator>(std::move(reader), first), offsets_(offsets) {}

  template <std::size_t... I>
  value_type read(const unsigned char* row, std::index_sequence<I...>) const {
    return {detail::load<Ts>(row + offsets_[I])...};
  }

  Offsets offsets_;
};

template <Readable... Ts>
class FieldRange;

// Rows, one after the other: an input range (and view) of RowView. Making it costs nothing; begin()
// reads the first block. The table's cursor and search column, which only C code sees, stay.
//
// Rows and columns of other tables, and other files, may be changed meanwhile, and rows of this one
// replaced; adding, removing and moving rows, or changing values of the column that orders them,
// shifts which ones are still to come. begin() and a step throw PF_TYPECHG when the columns changed.
class RowRange : public std::ranges::view_base {
 public:
  RowIterator begin() const;
  std::default_sentinel_t end() const noexcept { return {}; }

  // The rows from the first one on whose value, in the column that orders them, is not less than the
  // key. O(log n), with each begin().   PF_BADTYPE, PF_RANGE: see Cell; PF_BADSEARCH: storage order
  RowRange from(const Cell& key) const;

  // Of each row the values of some columns, as a std::tuple:
  //   for (auto [symbol, melting] : rows.fields<std::string_view, float>("symbol", "melting"))
  // Names and types are checked here, once.   PF_NOCOLUMN; PF_BADTYPE: not exactly that type
  template <Readable... Ts, std::convertible_to<std::string_view>... Names>
  FieldRange<Ts...> fields(const Names&... columns) const;

 private:
  friend class Table;
  template <Readable...>
  friend class FieldRange;
  RowRange(detail::TableRef table, detail::Name order) : table_(std::move(table)), order_(order) {}

  // A reader, and where it has to start.
  struct Start {
    std::unique_ptr<RowReader> reader;
    std::size_t first;
  };
  Start start(const detail::LayoutPtr& layout) const;

  detail::TableRef table_;
  detail::Name order_;  // empty: storage order
  std::optional<Value> key_;
};

// Tuples of fields. A std::string_view among them is good until the next step.
template <Readable... Ts>
class FieldRange : public std::ranges::view_base {
 public:
  FieldIterator<Ts...> begin() const {
    auto [reader, first] = rows_.start(layout_);
    return {std::move(reader), first, offsets_};
  }
  std::default_sentinel_t end() const noexcept { return {}; }

 private:
  friend class RowRange;
  FieldRange(RowRange rows, detail::LayoutPtr layout,
             const std::array<std::int32_t, sizeof...(Ts)>& offsets)
      : rows_(std::move(rows)), layout_(std::move(layout)), offsets_(offsets) {}

  RowRange rows_;
  detail::LayoutPtr layout_;  // that the offsets are of
  std::array<std::int32_t, sizeof...(Ts)> offsets_;
};

// ---- Implementation -----------------------------------------------------------------------------

inline const detail::Layout& RowView::layout() const noexcept { return *reader_->layout(); }

inline std::size_t RowView::number() const noexcept { return reader_->number_of(bytes_); }

inline Row::Row(const RowView& view)
    : layout_(view.reader_->layout()),
      bytes_(view.bytes(), view.bytes() + layout_->row_size),
      number_(view.number()) {
  bytes_.push_back(0);
}

// The first block is small, all others are large.
inline void RowReader::make_room() {
  const std::size_t largest =
      std::max<std::size_t>(kLargestBlock / std::max<std::size_t>(layout_->row_size, 1), 1);
  const std::size_t wanted = room_ == 0 ? std::min(kFirstBlock, largest) : largest;
  if (wanted == room_) return;
  // Not make_unique_for_overwrite, which libc++ has only since its version 16.
  rows_.reset(new unsigned char[wanted * layout_->row_size]);
  if (!order_.view().empty()) numbers_.reset(new std::int32_t[wanted]);
  room_ = wanted;
}

inline RowReader::Block RowReader::read(std::size_t first) {
  if (!table_.has_layout(layout_)) table_.raise_changed();
  first_ = first;
  if (first >= table_.ready()) return {rows_.get(), rows_.get()};
  const char* const order = order_.view().empty() ? nullptr : order_.c_str();
  make_room();
  const std::size_t count = table_.read(order, first, room_, rows_.get(), numbers_.get());
  return {rows_.get(), rows_.get() + count * layout_->row_size};
}

inline RowRange::Start RowRange::start(const detail::LayoutPtr& layout) const {
  detail::TableRef table = table_;
  table.ready();
  std::size_t first = 0;
  if (key_) first = table.lower_bound(table.layout()->at(order_.view()), *key_);
  auto reader =
      std::make_unique<RowReader>(table, order_, layout == nullptr ? table.layout() : layout);
  return {std::move(reader), first};
}

inline RowIterator RowRange::begin() const {
  auto [reader, first] = start(nullptr);
  return RowIterator(std::move(reader), first);
}

inline RowRange RowRange::from(const Cell& key) const {
  if (order_.view().empty()) throw Error(PF_BADSEARCH, {}, {});
  const detail::Place& column = table_.layout()->at(order_.view());
  RowRange result = *this;
  result.key_ = detail::to_value(column.type, key, {"column", order_.view()});
  return result;
}

template <Readable... Ts, std::convertible_to<std::string_view>... Names>
FieldRange<Ts...> RowRange::fields(const Names&... columns) const {
  static_assert(sizeof...(Ts) == sizeof...(Names) && sizeof...(Ts) > 0, "a type for each column");
  const detail::Layout& layout = *table_.layout();
  return {
      *this, table_.layout(), {layout.typed<Ts>(layout.at(std::string_view(columns))).offset...}};
}

}  // namespace v1
}  // namespace tevpf

// The iterators own what they read: they outlive their range.
template <>
inline constexpr bool std::ranges::enable_borrowed_range<tevpf::RowRange> = true;
template <tevpf::Readable... Ts>
inline constexpr bool std::ranges::enable_borrowed_range<tevpf::FieldRange<Ts...>> = true;
