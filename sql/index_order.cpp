#include "index_order.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <string>

namespace sql {

void IndexOrder::look_through_numbers() {
  double greatest = -std::numeric_limits<double>::infinity();
  for (std::size_t i = 0; i < rows_count_; ++i) {
    const double value = field_.number(rows_.read(i));
    if (std::isnan(value)) {
      ++missing_;
      continue;
    }
    if (missing_ > 0) is_sorted_ = false;
    if (value < greatest) margin_ = std::max(margin_, greatest - value);
    greatest = std::max(greatest, value);
  }
}

void IndexOrder::look_through_texts() {
  std::string last;
  for (std::size_t i = 0; i < rows_count_ && is_sorted_; ++i) {
    const std::string_view text = field_.text(rows_.read(i));
    is_sorted_ = last <= text;
    last = text;
  }
}

void IndexOrder::look_through(std::size_t rows) {
  is_known_ = false;
  rows_.forget();
  rows_count_ = rows;
  is_sorted_ = true;
  margin_ = 0;
  missing_ = 0;
  loosened_ = 0;
  field_.is_text() ? look_through_texts() : look_through_numbers();
  rows_.forget();
  is_known_ = true;
  is_counted_ = true;
}

// How many values are not numbers, after rows came and went.
std::size_t IndexOrder::recount(std::size_t rows) {
  rows_count_ = rows;
  is_counted_ = true;
  if (field_.is_text() || field_.tolerance == 0) return 0;
  const std::size_t numbers = first_not(
      0, rows, [this](const unsigned char* row) { return !std::isnan(field_.number(row)); });
  return rows - numbers;
}

bool IndexOrder::is_usable(std::size_t rows) {
  if (!is_known_ || loosened_ > 64 + rows / 64) look_through(rows);
  if (is_sorted_ && (!is_counted_ || rows_count_ != rows)) missing_ = recount(rows);
  return is_sorted_;
}

bool IndexOrder::is_exact(std::size_t rows) {
  if (!is_usable(rows)) return false;
  if (margin_ > 0 && loosened_ > 0) look_through(rows);
  return is_sorted_ && margin_ == 0;
}

// A new number stands among those that the library takes for equal, so it can pass the others by no
// more than the tolerance; twice, for what is lost in computing.
void IndexOrder::value_added(const unsigned char* row) noexcept {
  is_counted_ = false;
  if (field_.is_text()) {
    is_known_ = is_sorted_ && !field_.text(row).ends_with('*');
  } else if (field_.tolerance > 0) {
    is_known_ = !std::isnan(field_.number(row));
    margin_ += 2 * field_.tolerance;
    ++loosened_;
  }
}

// By halving: everything in front of the result was found before it.
template <class IsBefore>
std::size_t IndexOrder::first_not(std::size_t first, std::size_t end, IsBefore is_before) {
  while (first < end) {
    const std::size_t middle = first + (end - first) / 2;
    if (is_before(rows_.probe(middle))) {
      first = middle + 1;
    } else {
      end = middle;
    }
  }
  return first;
}

IndexOrder::Range IndexOrder::find(const std::optional<Key>& least,
                                   const std::optional<Key>& greatest) {
  const std::size_t end = rows_count_ - missing_;
  Range range{0, end};
  const Field& f = field_;
  if (least) {
    range.first = first_not(0, end, [&](const unsigned char* row) {
      return f.is_text() ? f.text(row) < least->text : f.number(row) < least->number - margin_;
    });
  }
  if (greatest) {
    const auto is_not_greater = [&](const unsigned char* row) {
      if (!f.is_text()) return f.number(row) <= greatest->number + margin_;
      return f.text(row) <= greatest->text ||
             (greatest->is_prefix && f.text(row).starts_with(greatest->text));
    };
    // Near the first one when few are wanted.
    std::size_t step = 1;
    while (range.first + step < end && is_not_greater(rows_.probe(range.first + step - 1))) {
      step *= 4;
    }
    range.end =
        first_not(range.first + step / 4, std::min(range.first + step, end), is_not_greater);
  }
  return range;
}

}  // namespace sql
