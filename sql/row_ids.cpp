#include "row_ids.h"

#include <bit>

namespace sql {
namespace {

std::size_t lowest_bit(std::size_t number) { return number & (~number + 1); }

}  // namespace

void RowIds::append_word(std::uint64_t word) {
  words_.push_back(word);
  const std::size_t place = words_.size();
  std::int64_t sum = std::popcount(word);
  for (std::size_t step = 1; step < lowest_bit(place); step <<= 1U) {
    sum += sums_[place - step - 1];
  }
  sums_.push_back(sum);
}

void RowIds::count_rows() {
  for (std::size_t first = 0; first <= issued_; first += kWord) {
    const std::size_t rows = issued_ - first;
    append_word(rows >= kWord ? ~std::uint64_t{0} : (std::uint64_t{1} << rows) - 1);
  }
}

void RowIds::change(std::size_t word, std::int64_t by) {
  for (std::size_t i = word + 1; i <= sums_.size(); i += lowest_bit(i)) sums_[i - 1] += by;
}

RowIds::Id RowIds::add() {
  const std::size_t place = issued_++;
  if (!is_plain()) {
    if (place / kWord == words_.size()) append_word(0);
    words_[place / kWord] |= std::uint64_t{1} << (place % kWord);
    change(place / kWord, 1);
  }
  return static_cast<Id>(issued_);
}

void RowIds::remove_last() {
  if (!is_plain()) remove(static_cast<Id>(issued_));
  --issued_;
}

void RowIds::remove(Id id) {
  if (is_plain()) count_rows();
  const auto place = static_cast<std::size_t>(id - 1);
  words_[place / kWord] &= ~(std::uint64_t{1} << (place % kWord));
  change(place / kWord, -1);
}

void RowIds::restore(Id id) {
  const auto place = static_cast<std::size_t>(id - 1);
  words_[place / kWord] |= std::uint64_t{1} << (place % kWord);
  change(place / kWord, 1);
}

std::optional<std::size_t> RowIds::number_of(Id id) const {
  if (id < 1 || static_cast<std::uint64_t>(id) > issued_) return std::nullopt;
  const auto place = static_cast<std::size_t>(id - 1);
  if (is_plain()) return place;
  const std::uint64_t word = words_[place / kWord];
  const std::uint64_t bit = std::uint64_t{1} << (place % kWord);
  if ((word & bit) == 0) return std::nullopt;
  std::int64_t before = std::popcount(word & (bit - 1));
  for (std::size_t i = place / kWord; i > 0; i -= lowest_bit(i)) before += sums_[i - 1];
  return static_cast<std::size_t>(before);
}

RowIds::Id RowIds::id_at(std::size_t number) const {
  if (is_plain()) return static_cast<Id>(number) + 1;
  std::size_t word = 0;
  auto left = static_cast<std::int64_t>(number);
  for (std::size_t step = std::bit_floor(sums_.size()); step > 0; step >>= 1U) {
    if (word + step <= sums_.size() && sums_[word + step - 1] <= left) {
      word += step;
      left -= sums_[word - 1];
    }
  }
  if (word == words_.size()) return static_cast<Id>(issued_) + 1;  // behind the last row
  std::uint64_t bits = words_[word];
  for (; left > 0; --left) bits &= bits - 1;
  return static_cast<Id>(word * kWord + static_cast<std::size_t>(std::countr_zero(bits))) + 1;
}

}  // namespace sql
