#include "table_cursor.h"

#include <algorithm>
#include <cmath>
#include <numeric>
#include <string>

#include "refusal.h"
#include "values.h"

namespace sql {
namespace {

using Key = IndexOrder::Key;

// What a plan's arguments ask for of a column.
struct Wanted {
  std::optional<Key> least, greatest;
  bool is_nothing = false;  // no value compares so with NULL
  bool is_limited() const noexcept { return least || greatest; }
};

// A value as a key of the column. None: values of other kinds compare with all of the column's alike, or,
// numbers with texts, after a conversion that depends on the expression; then all rows are read.
std::optional<Key> key_of(sqlite3_value* value, bool is_text) {
  if (is_text) {
    if (sqlite3_value_type(value) != SQLITE_TEXT) return std::nullopt;
    return Key{0, text_of(value)};
  }
  const int type = sqlite3_value_numeric_type(value);
  if (type != SQLITE_INTEGER && type != SQLITE_FLOAT) return std::nullopt;
  return Key{sqlite3_value_double(value)};
}

// The texts that match a pattern start with all that stands in front of its first special character.
std::optional<Key> prefix_of(sqlite3_value* value) {
  if (sqlite3_value_type(value) != SQLITE_TEXT) return std::nullopt;
  const std::string_view pattern = text_of(value);
  const std::string_view prefix = pattern.substr(0, pattern.find_first_of("*?["));
  if (prefix.empty()) return std::nullopt;
  return Key{0, prefix, true};
}

Wanted wanted(const Plan& plan, Values arguments, bool is_text) {
  Wanted result;
  for (sqlite3_value* const argument : arguments) {
    if (sqlite3_value_type(argument) == SQLITE_NULL) result.is_nothing = true;
  }
  if (result.is_nothing) return result;
  if (plan.is_equal) {
    result.least = result.greatest = key_of(arguments[0], is_text);
  } else if (plan.has_prefix) {
    result.least = result.greatest = prefix_of(arguments[0]);
  } else {
    if (plan.has_least) result.least = key_of(arguments[0], is_text);
    if (plan.has_greatest) result.greatest = key_of(arguments[plan.has_least ? 1 : 0], is_text);
  }
  return result;
}

}  // namespace

void TableCursor::filter(int number, Values arguments) {
  const Plan plan = Plan::from(number);
  is_sorted_ = false;
  is_backwards_ = plan.is_descending;
  run_ = next_run_ = {};
  version_ = relation_.version();
  switch (plan.access) {
    case Plan::Access::all:
      read_all(plan);
      break;
    case Plan::Access::row:
      read_row(arguments[0]);
      break;
    case Plan::Access::index:
      read_index(plan, arguments);
      break;
  }
  row_ = nullptr;
  if (run_.empty()) std::swap(run_, next_run_);
  if (run_.empty()) return;
  position_ = is_backwards_ ? run_.end - 1 : run_.first;
  row_ = read(position_);
}

void TableCursor::read_all(const Plan&) {
  rows_ = RowBlocks(relation_.table(), relation_.shape().row_size, {});
  run_ = {0, relation_.size()};
}

void TableCursor::read_row(sqlite3_value* id) {
  rows_ = RowBlocks(relation_.table(), relation_.shape().row_size, {});
  if (sqlite3_value_numeric_type(id) == SQLITE_NULL) return;
  if (const auto number = relation_.ids().number_of(sqlite3_value_int64(id))) {
    run_ = {*number, *number + 1};
  }
}

// NULL comes first in SQL, what is not a number last in an index.
void TableCursor::read_index(const Plan& plan, Values arguments) {
  const auto column = static_cast<std::size_t>(plan.column);
  const Field& field = relation_.shape().fields[column];
  const std::size_t size = relation_.size();
  IndexOrder& order = relation_.order_of(column);
  const Wanted asked = wanted(plan, arguments, field.is_text());
  if (asked.is_nothing) return;
  if (plan.is_ordered && !plan.is_equal && !order.is_exact(size)) return read_sorted(plan);
  if (!order.is_usable(size)) return plan.is_ordered ? read_sorted(plan) : read_all(plan);
  rows_ = RowBlocks(relation_.table(), relation_.shape().row_size, field.name);
  const IndexOrder::Range range = order.find(asked.least, asked.greatest);
  run_ = {range.first, range.end};
  if (asked.is_limited()) return;
  const IndexOrder::Range missing = order.not_numbers();
  next_run_ = {missing.first, missing.end};
  if (!is_backwards_) std::swap(run_, next_run_);
}

void TableCursor::read_sorted(const Plan& plan) {
  read_all(plan);
  const Field& field = relation_.shape().fields[static_cast<std::size_t>(plan.column)];
  sorted_.resize(run_.end);
  std::iota(sorted_.begin(), sorted_.end(), std::size_t{0});
  const auto sort_by = [&](const auto& keys, auto comes_before) {
    std::stable_sort(sorted_.begin(), sorted_.end(),
                     [&](std::size_t a, std::size_t b) { return comes_before(keys[a], keys[b]); });
  };
  if (field.is_text()) {
    std::vector<std::string> keys;
    for (std::size_t i = 0; i < run_.end; ++i) keys.emplace_back(field.text(rows_.read(i)));
    sort_by(keys, std::less<>());
  } else {
    std::vector<double> keys;
    for (std::size_t i = 0; i < run_.end; ++i) keys.push_back(field.number(rows_.read(i)));
    sort_by(keys, [](double a, double b) {
      return std::isnan(a) || std::isnan(b) ? std::isnan(a) && !std::isnan(b) : a < b;
    });
  }
  is_sorted_ = true;
}

const unsigned char* TableCursor::read(std::size_t position) {
  return is_sorted_ ? rows_.read(sorted_[position]) : rows_.read(position, is_backwards_);
}

bool TableCursor::step() noexcept {
  if (is_sorted_ || version_ != relation_.version()) return false;
  const std::size_t next = is_backwards_ ? position_ - 1 : position_ + 1;
  if (is_backwards_ ? position_ == run_.first : next >= run_.end) return false;
  const unsigned char* const row = rows_.at_hand(next);
  if (row == nullptr) return false;
  position_ = next;
  row_ = row;
  return true;
}

void TableCursor::advance() {
  if (version_ != relation_.version()) {
    rows_.forget();
    version_ = relation_.version();
  }
  if (is_backwards_) {
    run_.end = position_;
  } else {
    run_.first = position_ + 1;
  }
  if (run_.empty()) {
    run_ = next_run_;
    next_run_ = {};
  }
  row_ = nullptr;
  if (run_.empty()) return;
  position_ = is_backwards_ ? run_.end - 1 : run_.first;
  row_ = read(position_);
}

void TableCursor::deliver(sqlite3_context* context, int column) const {
  if (relation_.shape().fields.empty()) return;
  const Field& field = relation_.shape().fields[static_cast<std::size_t>(column)];
  switch (field.type) {
    case tevpf::Type::int32:
      return sqlite3_result_int(context, load<std::int32_t>(row_ + field.offset));
    case tevpf::Type::int16:
      return sqlite3_result_int(context, load<std::int16_t>(row_ + field.offset));
    case tevpf::Type::string:
      return sql::deliver(context, field.text(row_).data());  // terminated
    default:
      return sql::deliver(context, field.number(row_));
  }
}

RowIds::Id TableCursor::id() const {
  return relation_.ids().id_at(is_sorted_ ? sorted_[position_] : rows_.number(position_));
}

}  // namespace sql
