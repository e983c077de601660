// Rowids that stay the same while a transaction adds and deletes rows. At its start the rowid of a row
// is its number, counted from 1; rows are added at the end only.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

namespace sql {

// Takes no memory until the first row is deleted; then a bit for each row. Costs are O(1) before that
// and O(log rows) afterwards.
class RowIds {
 public:
  using Id = std::int64_t;

  explicit RowIds(std::size_t rows = 0) noexcept : issued_(rows) {}

  Id add();            // the id of a row added behind the others
  void remove_last();  // that row is gone again, as if it had never been added
  void remove(Id id);
  void restore(Id id);  // a removed row is back in its place

  std::optional<std::size_t> number_of(Id id) const;  // counted from 0; none: no such row
  Id id_at(std::size_t number) const;                 // of a row that is there

 private:
  static constexpr std::size_t kWord = 64;
  bool is_plain() const noexcept { return words_.empty(); }
  void count_rows();  // leaves the plain state
  void append_word(std::uint64_t word);
  void change(std::size_t word, std::int64_t by);

  std::size_t issued_;                // ids 1 to this
  std::vector<std::uint64_t> words_;  // a bit for each id: the row is there; empty: all are
  std::vector<std::int64_t> sums_;    // over words, as a Fenwick tree: entry i is at i + 1
};

}  // namespace sql
