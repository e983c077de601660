// Random sequences of all table operations on the library and on a plain model: vectors of values, and
// indexes kept by the documented rules in the simplest way. After every step the status, both texts of
// a refusal, every row, index, default value and the cursor are compared, and the invariants checked.
#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <cstdio>
#include <random>
#include <utility>

#include "support/temp_file.h"

namespace {

using tevpf_test::broken_rule;

// Every number of the five types is a double; the column tells which of the two counts.
struct Value {
  double number = 0;
  std::string text;
  bool operator==(const Value&) const = default;
};
using Row = std::vector<Value>;

bool is_real(int type) { return type == PF_TYPE_REAL || type == PF_TYPE_DOUBLE; }

struct Column {
  TEVPF_COL_DEF def{};
  double max = 0, min = 0, tolerance = 0;
  int precision = 1;
  std::vector<int> index;

  bool is_text() const { return def.type == PF_TYPE_STRING; }
  bool is_unique() const { return def.idx_flag && def.unq_flag; }
};

// A number as the type has it.
double rounded(int type, double x) { return type == PF_TYPE_REAL ? double{float(x)} : x; }

void set_limits(Column& c, double max, double min, int precision) {
  c.max = c.is_text() ? 0 : rounded(c.def.type, max);
  c.min = c.is_text() ? 0 : rounded(c.def.type, min);
  c.precision = is_real(c.def.type) ? precision : 1;
  c.tolerance = is_real(c.def.type) ? std::pow(10.0, -(precision + 1)) : 0;
  auto& l = c.def.limits;
  std::memset(&l, 0, sizeof l);
  if (c.def.type == PF_TYPE_INT) l.i32 = {int(max), int(min)};
  if (c.def.type == PF_TYPE_SHORT) l.i16 = {std::int16_t(max), std::int16_t(min)};
  if (c.def.type == PF_TYPE_REAL) l.f32 = {float(max), float(min), precision};
  if (c.def.type == PF_TYPE_DOUBLE) l.f64 = {max, min, precision};
}

struct Result {
  TEVPF_STATUS status = PF_NORMAL;
  ErrorTexts texts = kUntouched;
  bool failed() const { return status != PF_NORMAL; }
};

Result empty_texts(TEVPF_STATUS status) { return {status, kEmpty}; }

std::string text_of(const Column& c, const Value& v) {
  char buffer[64];
  if (c.is_text()) return v.text;
  std::snprintf(buffer, sizeof buffer, is_real(c.def.type) ? "%g" : "%.0f", v.number);
  return buffer;
}

int compare_values(const Column& c, const Value& a, const Value& b, double tolerance) {
  if (c.is_text()) {
    std::string left = a.text, right = b.text;
    const auto star = right.find('*');
    if (star != std::string::npos && star + 1 == right.size()) {
      right.resize(star);
      left = left.substr(0, star);
    }
    const int order = left.compare(right);
    return order < 0 ? -1 : order > 0;
  }
  if (a.number > b.number) return a.number - tolerance > b.number;
  return a.number < b.number && a.number + tolerance < b.number ? -1 : 0;
}
int compare_values(const Column& c, const Value& a, const Value& b) {
  return compare_values(c, a, b, c.tolerance);
}

Value least(const Column& c) { return {c.is_text() ? 0 : c.min, ""}; }

bool in_range(const Column& c, const Value& v, double tolerance) {
  return c.is_text() || (compare_values(c, v, {c.max, ""}, tolerance) <= 0 &&
                         compare_values(c, v, {c.min, ""}, tolerance) >= 0);
}

// ---- The model -----------------------------------------------------------------------------------

struct Model {
  std::vector<Column> columns;
  std::vector<Row> rows;
  Row defaults;
  int cur = -1, next = 0, search = -1, free_rows = 0, free_cols = 0;
  int dup_row = 0, dsp_wid = 0;
  bool interactive = false;
  static constexpr int kInitial = 5, kIncrement = 3;

  int count() const { return int(rows.size()); }
  const Value& at(int row, int column) const { return rows[size_t(row)][size_t(column)]; }
  Column& col(int i) { return columns[size_t(i)]; }
  int row_at(int position) { return search < 0 ? position : col(search).index[size_t(position)]; }
  int column_named(const std::string& name) const {
    for (size_t i = 0; i < columns.size(); ++i) {
      if (name == columns[i].def.name) return int(i);
    }
    return -1;
  }

  // The documented probes.
  bool find(int column, const std::vector<int>& index, int first, const Value& key, int& pos) {
    const auto order = [&](int p) {
      return compare_values(col(column), at(index[size_t(p)], column), key);
    };
    int low = first, high = int(index.size()) - 1;
    while (low <= high) {
      const int middle = first + ((low - first) + (high - first)) / 2;
      const int answer = order(middle);
      if (answer == 0) {
        for (pos = middle; pos > first && order(pos - 1) == 0; --pos) {
        }
        return true;
      }
      (answer < 0 ? low = middle + 1 : high = middle - 1);
    }
    pos = low;
    return false;
  }

  std::vector<int> sorted(int column) {
    std::vector<int> index;
    for (int i = 0; i < count(); ++i) index.push_back(i);
    std::stable_sort(index.begin(), index.end(), [&](int a, int b) {
      return compare_values(col(column), at(a, column), at(b, column), 0) < 0;
    });
    return index;
  }

  void remake_formats() {
    dsp_wid = columns.empty() ? 0 : -1;
    for (const Column& c : columns) {
      dsp_wid += 2 + std::max(c.def.width, int(std::strlen(c.def.name)));
    }
  }

  Result check_value(int column, const Value& value) {
    const Column& c = col(column);
    if (!in_range(c, value, c.tolerance)) return {PF_RANGE, {text_of(c, value), ""}};
    int pos = 0;
    if (!c.is_unique() || !find(column, c.index, 0, value, pos)) return {};
    dup_row = c.index[size_t(pos)];
    return {PF_DUPLICATE, {"value " + text_of(c, value), std::string("column ") + c.def.name}};
  }

  // owner: a row that may hold the values already, -2: any row may; the texts of a duplicate stay.
  Result check_row(const Row& row, int owner) {
    Result passed;
    for (size_t i = 0; i < row.size(); ++i) {
      const Result r = check_value(int(i), row[i]);
      if (r.status == PF_DUPLICATE && (owner == -2 || dup_row == owner)) {
        passed.texts = r.texts;
      } else if (r.failed()) {
        return r;
      }
    }
    return passed;
  }

  void insert_entries(int row) {
    for (int c = 0; c < int(columns.size()); ++c) {
      if (!col(c).def.idx_flag) continue;
      int pos = 0;
      find(c, col(c).index, 0, at(row, c), pos);
      col(c).index.insert(col(c).index.begin() + pos, row);
    }
  }

  Result add(const Row& row, int place) {
    if (free_rows == 0) free_rows = rows.empty() ? kInitial : kIncrement;
    if (!interactive) {
      if (const Result r = check_row(row, -1); r.failed()) return r;
    }
    place = std::clamp(place, 0, count());
    for (Column& c : columns) {
      for (int& entry : c.index) entry += entry >= place;
    }
    rows.insert(rows.begin() + place, row);
    insert_entries(place);
    --free_rows;
    return {};
  }

  void erase(int row) {
    for (Column& c : columns) {
      std::erase(c.index, row);
      for (int& entry : c.index) entry -= entry > row;
    }
    rows.erase(rows.begin() + row);
    ++free_rows;
  }

  Result replace(const Row& row) {
    if (cur < 0) return empty_texts(PF_NOCURROW);
    const int n = row_at(cur);
    const Result r = check_row(row, n);
    if (r.failed()) return r;
    for (int c = 0; c < int(columns.size()); ++c) {
      if (!col(c).def.idx_flag) continue;
      if (compare_values(col(c), at(n, c), row[size_t(c)]) == 0) continue;
      std::erase(col(c).index, n);
      int pos = 0;
      find(c, col(c).index, 0, row[size_t(c)], pos);
      col(c).index.insert(col(c).index.begin() + pos, n);
    }
    rows[size_t(n)] = row;
    return r;
  }

  Result move(int from, int to) {
    if (search >= 0) return {PF_SEARCHSET};
    if (from < 0 || from >= count() || count() < 2) {
      return {PF_BADPOS, {std::to_string(from), std::to_string(count())}};
    }
    const Model before = *this;
    const Row row = rows[size_t(from)];
    erase(from);
    const Result r = add(row, to);
    const int holder = dup_row;
    if (r.failed()) *this = before;
    dup_row = holder;
    return r;
  }

  Result at_position(int pos, TEVPF_STATUS refusal) {
    if (pos < 0 || pos >= count()) {
      if (refusal == PF_NOMORE) return {PF_NOMORE};
      return {refusal, std::to_string(pos), std::to_string(count())};
    }
    cur = pos;
    next = pos + 1;
    return {};
  }

  Result by_value(int mode, int column, const Value& key) {
    const Result missing = {PF_NOTFOUND, {text_of(col(column), key), ""}};
    if (rows.empty()) return empty_texts(PF_NOTFOUND);
    if (column == search) {
      int pos = 0;
      const bool found = find(column, col(column).index, next, key, pos);
      if (!found && (mode != 1 || pos >= count())) return missing;
      return at_position(pos, PF_BADPOS);
    }
    for (int p = next; p < count(); ++p) {
      if (compare_values(col(column), at(row_at(p), column), key) == 0) {
        return at_position(p, PF_BADPOS);
      }
    }
    return missing;
  }

  Result define(const Column& column) {
    const TEVPF_COL_DEF& def = column.def;
    if (column.is_unique() && !rows.empty()) return empty_texts(PF_BADUNIQUE);
    columns.push_back(column);
    Column& added = columns.back();
    if (!def.idx_flag) added.def.unq_flag = 0;
    added.def.spare_byte = 0;
    for (Row& row : rows) row.push_back(least(added));
    defaults.push_back(least(added));
    if (def.idx_flag) added.index = sorted(int(columns.size()) - 1);
    free_rows = 0;
    if (free_cols == 0) free_cols = 3;
    --free_cols;
    return {};
  }

  bool any_neighbours(int column, const std::vector<int>& index, double tolerance, int order) {
    for (size_t i = 0; i + 1 < index.size(); ++i) {
      const int answer =
          compare_values(col(column), at(index[i], column), at(index[i + 1], column), tolerance);
      if (answer == order) return true;
    }
    return false;
  }

  Result redefine(int place, const Column& changed) {
    Column& old = col(place);
    const TEVPF_COL_DEF& def = changed.def;
    if (def.type != old.def.type && !rows.empty()) return {PF_TYPECHG};
    for (int i = 0; i < count(); ++i) {
      if (in_range(changed, at(i, place), old.tolerance)) continue;
      return {PF_RANGE, {text_of(old, at(i, place)), ""}};
    }
    std::vector<int> index;
    if (def.idx_flag) index = old.def.idx_flag ? old.index : sorted(place);
    if (def.idx_flag && def.unq_flag && !old.def.unq_flag &&
        any_neighbours(place, index, old.tolerance, 0)) {
      return empty_texts(PF_NOTUNIQUE);
    }
    if (!def.idx_flag && search == place) search = -1;
    const bool finer = changed.tolerance < old.tolerance;
    const bool new_width = def.width != old.def.width;
    old = changed;
    if (new_width && interactive) remake_formats();
    if (finer && any_neighbours(place, index, old.tolerance, 1)) index = sorted(place);
    old.index = index;
    for (size_t i = 0; i < columns.size(); ++i) defaults[i] = least(columns[i]);
    return {};
  }

  void remove_column(int place) {
    columns.erase(columns.begin() + place);
    defaults.erase(defaults.begin() + place);
    for (Row& row : rows) row.erase(row.begin() + place);
    free_rows = 0;
    search = search == place ? -1 : search - (search > place);
    remake_formats();
    if (!columns.empty()) return;
    rows.clear();
    cur = -1;
    next = 0;
  }

  void move_column(int from, int before) {  // before: -1 to the end
    if (columns.size() < 2) return;
    const int to = (before < 0 ? int(columns.size()) : before) - (before < 0 || before > from);
    const auto shift = [&](auto& items) {
      auto item = items[size_t(from)];
      items.erase(items.begin() + from);
      items.insert(items.begin() + to, item);
    };
    const std::string searched = search < 0 ? "" : col(search).def.name;
    shift(columns);
    shift(defaults);
    for (Row& row : rows) shift(row);
    if (search >= 0) search = column_named(searched);
    free_rows = free_cols = 0;
  }
};

// ---- Library and model side by side --------------------------------------------------------------

TEVPF_TABLE* table_named(const char* name) {
  TEVPF_TABLE* table = nullptr;
  return TEV8R1_get_table_ptr(name, &table) == PF_NORMAL ? table : nullptr;
}

Value load_value(const TEVPF_COL_DEF& def, const unsigned char* place) {
  if (def.type == PF_TYPE_STRING) return {0, reinterpret_cast<const char*>(place)};
  return tevpf::with_number(def.type, [&](auto tag) -> Value {
    return {static_cast<double>(tevpf::load<decltype(tag)>(place)), ""};
  });
}

// A value as callers hand it in; texts with their terminator.
std::vector<unsigned char> bytes_of(const TEVPF_COL_DEF& def, const Value& v) {
  if (def.type == PF_TYPE_STRING) return {v.text.c_str(), v.text.c_str() + v.text.size() + 1};
  std::vector<unsigned char> bytes(size_t(tevpf::value_size(def.type, 0)));
  tevpf::with_number(def.type, [&](auto tag) {
    tevpf::store(bytes.data(), static_cast<decltype(tag)>(v.number));
  });
  return bytes;
}

// A row as a careless caller hands it in: rubbish in the padding and behind texts, and no terminator
// behind a text as wide as its column.
std::vector<unsigned char> image(const TEVPF_TABLE& table, const Row& row) {
  std::vector<unsigned char> bytes(size_t(table.row_wid), 0xEE);
  for (size_t i = 0; i < row.size(); ++i) {
    const TEVPF_COLUMN& column = table.col_array[i];
    const auto value = bytes_of(column.def, row[i]);
    const size_t size = std::min(value.size(), size_t(tevpf_test::size_of(column) - 1) +
                                                   (column.def.type != PF_TYPE_STRING));
    std::copy_n(value.begin(), size, bytes.begin() + column.offset);
  }
  return bytes;
}

Row decode(const TEVPF_TABLE& table, const unsigned char* bytes) {
  Row row;
  for (int i = 0; i < table.num_cols; ++i) {
    row.push_back(load_value(table.col_array[i].def, bytes + table.col_array[i].offset));
  }
  return row;
}

std::string text(const Row& row) {
  std::string all;
  for (const Value& v : row) all += std::to_string(v.number) + v.text + "|";
  return all;
}

class TableModelTest : public TempFileTest, public testing::WithParamInterface<unsigned> {
 protected:
  TableModelTest() : random_(GetParam()) {
    EXPECT_EQ(TEV8R1_PF_create_elem("t", "model", PF_ELEM_TABLE), PF_NORMAL);
    TEV8R1_PF_set_memory_allocation(Model::kInitial, Model::kIncrement);
    model_.dup_row = tevpf::library.dup_row;
    table_named("t")->RESERVED[7] = 'r';
    define_column();
  }

  std::string last_;  // the operation of the last step

  void step() {
    using Self = TableModelTest;
    set_error_texts();
    static constexpr struct {
      int weight;
      void (Self::*run)();
    } kOperations[] = {
        {24, &Self::add_row},
        {10, &Self::insert_row},
        {4, &Self::add_with_defaults},
        {12, &Self::replace_row},
        {10, &Self::delete_row},
        {1, &Self::delete_all_rows},
        {5, &Self::move_row},
        {8, &Self::next_row},
        {6, &Self::row_by_pos},
        {1, &Self::reset},
        {10, &Self::row_by_value},
        {3, &Self::get_value},
        {3, &Self::define_search},
        {3, &Self::set_defaults},
        {1, &Self::interactive},
        {2, &Self::define_column},
        {5, &Self::redefine_column},
        {1, &Self::delete_column},
        {2, &Self::move_column},
        {1, &Self::copy},
        {1, &Self::reopen},
        {2, &Self::column_values},
        {2, &Self::check_value},
    };
    int total = 0;
    for (const auto& operation : kOperations) total += operation.weight;
    int pick = below(total);
    for (const auto& operation : kOperations) {
      if ((pick -= operation.weight) < 0) return (this->*operation.run)();
    }
  }

  // The first difference between library and model, or an empty text.
  std::string difference() {
    const TEVPF_TABLE& t = *table_named("t");
    if (!complaint_.empty()) return complaint_;
    if (const char* rule = broken_rule(t)) return rule;
    if (t.num_cols != int(model_.columns.size()) || t.num_rows != model_.count()) return "counts";
    // Slots without rows may go with a change of layout.
    if (t.num_rows == 0 && t.free_rows == 0) model_.free_rows = 0;
    if (t.free_rows != model_.free_rows) return "free_rows " + std::to_string(t.free_rows);
    if (t.free_cols != model_.free_cols) return "free_cols";
    if (t.RESERVED[7] != 'r') return "RESERVED";
    if (t.dsp_wid != model_.dsp_wid) return "dsp_wid " + std::to_string(t.dsp_wid);
    if (tevpf::library.dup_row != model_.dup_row) return "dup_row";
    if (t.cur_row != model_.cur || t.next_row != model_.next) return "cursor";
    if ((t.cur_col == nullptr ? -1 : t.cur_col - t.col_array) != model_.search) return "search";
    for (int i = 0; i < t.num_rows; ++i) {
      const Row row = decode(t, t.row_data + std::int64_t{i} * t.row_wid);
      if (row != model_.rows[size_t(i)]) return "row " + std::to_string(i) + ": " + text(row);
    }
    for (int i = 0; i < t.num_cols; ++i) {
      if (const char* wrong = column_difference(t, i)) return wrong;
    }
    if (t.num_cols > 0 && decode(t, t.dft_row) != model_.defaults) return "default row";
    return "";
  }

 private:
  int below(int n) { return n < 1 ? 0 : int(random_() % unsigned(n)); }
  bool chance(int percent) { return below(100) < percent; }

  const char* column_difference(const TEVPF_TABLE& t, int i) {
    const TEVPF_COLUMN& column = t.col_array[i];
    const Column& expected = model_.col(i);
    TEVPF_COL_DEF def = column.def;
    const char* wanted = expected.def.description;
    if (wanted != nullptr && def.description != nullptr) {
      if (std::strcmp(def.description, wanted) != 0) return "description";
      def.description = expected.def.description;
    }
    if (std::memcmp(&def, &expected.def, sizeof def) != 0) return "definition";
    if (!def.idx_flag) return nullptr;
    const std::vector<int> entries(column.idx_ptr, column.idx_ptr + t.num_rows);
    return entries == expected.index ? nullptr : "index";
  }

  void expect(const std::string& operation, const Result& expected, TEVPF_STATUS status) {
    last_ = operation;
    char code[64];
    std::snprintf(code, sizeof code, ": status %08x, not %08x", status, expected.status);
    if (status != expected.status) complaint_ = operation + code;
    if (!complaint_.empty() || error_texts() == expected.texts) return;
    complaint_ = operation + ": " + testing::PrintToString(error_texts());
  }

  Value random_value(const Column& c) {
    if (c.is_text()) {
      Value v;
      for (int n = below(c.def.width + 1); n > 0; --n) v.text += "aab\xC3"[below(4)];
      return v;
    }
    if (chance(2)) return {chance(50) ? c.max + 1 : c.min - 1, ""};
    // Some reals differ by less than the tolerance, in chains.
    const int steps = chance(70) ? 4 : int(c.max - c.min) + 1;
    return {rounded(c.def.type, c.min + below(steps) + below(4) * 0.7 * c.tolerance), ""};
  }

  Row random_row() {
    Row row;
    for (const Column& c : model_.columns) row.push_back(random_value(c));
    return row;
  }

  // Mostly a value that some row holds, or a part of it as a pattern; some texts are longer than any.
  Value random_key(int column) {
    if (model_.rows.empty() || chance(30)) return random_value(model_.col(column));
    Value key = model_.at(below(model_.count()), column);
    if (!model_.col(column).is_text()) return key;
    if (chance(40)) key.text = key.text.substr(0, size_t(below(int(key.text.size()) + 1))) + "*";
    if (chance(10)) key.text += std::array{"a", "\xFF", "*", "b*"}[size_t(below(4))];
    return key;
  }

  int any_column() { return below(int(model_.columns.size())); }
  bool no_columns() const { return model_.columns.empty(); }

  void add_row() { insert(PF_END_POS); }
  void insert_row() { insert(below(model_.count() + 4) - 2); }
  void insert(int place) {
    if (no_columns()) return;
    const Row row = random_row();
    const auto bytes = image(*table_named("t"), row);
    expect("add at " + std::to_string(place) + ": " + text(row), model_.add(row, place),
           TEV8R1_PF_add_row_by_pos("t", bytes.data(), place));
  }
  void add_with_defaults() {
    if (no_columns()) return;
    Row row = random_row();
    auto bytes = image(*table_named("t"), row);
    std::vector<std::int32_t> supplied;
    for (size_t i = 0; i < row.size(); ++i) {
      supplied.push_back(below(2));
      if (supplied[i] == 0) row[i] = model_.defaults[i];
    }
    expect("add with defaults " + text(row), model_.add(row, PF_END_POS),
           TEV8R1_PF_add_row_with_dft("t", bytes.data(), supplied.data()));
    for (size_t i = 0; i < row.size(); ++i) {
      const TEVPF_COLUMN& column = table_named("t")->col_array[i];
      if (supplied[i] == 0 && load_value(column.def, bytes.data() + column.offset) != row[i]) {
        complaint_ = "the buffer does not keep the default";
      }
    }
  }
  void replace_row() {
    if (no_columns()) return;
    Row row = random_row();
    if (model_.cur >= 0 && chance(70)) {  // change one value only
      const Row old = model_.rows[size_t(model_.row_at(model_.cur))];
      const auto kept = size_t(any_column());
      const Value changed = row[kept];
      row = old;
      row[kept] = changed;
    }
    const auto bytes = image(*table_named("t"), row);
    expect("replace " + text(row), model_.replace(row), TEV8R1_PF_replace_row("t", bytes.data()));
  }
  void delete_row() {
    Result expected = empty_texts(PF_NOCURROW);
    if (model_.cur >= 0) {
      model_.erase(model_.row_at(model_.cur));
      model_.cur = -1;
      --model_.next;
      expected = {};
    }
    expect("delete row", expected, TEV8R1_PF_delete_row("t"));
  }
  // What was reserved for rows stays, while columns without rows may become any others.
  void delete_all_rows() {
    if (chance(70)) return;
    while (model_.count() > 0 && complaint_.empty()) {
      model_.at_position(0, PF_BADPOS);
      TEV8R1_PF_get_row_by_pos("t", 0, row_buffer().data());
      delete_row();
    }
    for (int i = 0; i < 3 && complaint_.empty(); ++i) redefine_column();
  }
  void move_row() {
    if (model_.search >= 0 && chance(60)) {
      model_.search = -1;
      TEV8R1_PF_define_table_search("t", nullptr);
    }
    const int from = below(model_.count() + 2) - 1;
    const int to = chance(10) ? PF_END_POS : below(model_.count() + 2) - 1;
    expect("move row " + std::to_string(from) + " to " + std::to_string(to), model_.move(from, to),
           TEV8R1_PF_move_row("t", from, to));
  }
  void delivered(const std::string& operation, const Result& expected, TEVPF_STATUS status,
                 const std::vector<unsigned char>& out) {
    expect(operation, expected, status);
    if (status != PF_NORMAL || !complaint_.empty()) return;
    const Row row = decode(*table_named("t"), out.data());
    if (row != model_.rows[size_t(model_.row_at(model_.cur))]) complaint_ = operation + ": row";
    if (TEV8R1_convert_row("t", model_.cur) != model_.row_at(model_.cur)) complaint_ = "convert";
  }
  std::vector<unsigned char> row_buffer() {
    return std::vector<unsigned char>(size_t(table_named("t")->row_wid) + 1);
  }
  void next_row() {
    auto out = row_buffer();
    const Result expected = model_.at_position(model_.next, PF_NOMORE);
    delivered("next row", expected, TEV8R1_PF_get_next_row("t", out.data()), out);
  }
  void row_by_pos() {
    auto out = row_buffer();
    const int pos = below(model_.count() + 2) - 1;
    const Result expected = model_.at_position(pos, PF_BADPOS);
    delivered("row at " + std::to_string(pos), expected,
              TEV8R1_PF_get_row_by_pos("t", pos, out.data()), out);
  }
  void reset() {
    model_.cur = -1;
    model_.next = 0;
    expect("reset", {}, TEV8R1_PF_reset_table("t"));
  }
  void row_by_value() {
    if (no_columns()) return;
    if (chance(40)) reset();
    const int column = model_.search >= 0 && chance(60) ? model_.search : any_column();
    const int mode = below(3);
    const Value key = random_key(column);
    auto out = row_buffer();
    const Result expected = model_.by_value(mode, column, key);
    delivered("row by value " + text_of(model_.col(column), key), expected,
              TEV8R1_PF_get_row_by_value("t", std::int8_t(mode), model_.col(column).def.name,
                                         bytes_of(model_.col(column).def, key).data(), out.data()),
              out);
  }
  void get_value() {
    if (no_columns()) return;
    const Value key = random_key(0);
    const int column = any_column();
    const int cur = model_.cur, next = model_.next;
    model_.next = 0;
    const Result expected = model_.by_value(0, 0, key);
    const int found = model_.row_at(std::max(model_.cur, 0));
    model_.cur = cur;
    model_.next = next;
    std::vector<unsigned char> out(size_t(model_.col(column).def.width) + 9);
    expect("get value for " + text_of(model_.col(0), key), expected,
           TEV8R1_PF_get_value("t", model_.col(column).def.name,
                               bytes_of(model_.col(0).def, key).data(), out.data()));
    if (expected.status == PF_NORMAL &&
        load_value(model_.col(column).def, out.data()) != model_.at(found, column)) {
      complaint_ = "value found";
    }
  }
  void define_search() {
    if (no_columns()) return;
    const int column = any_column();
    const std::string name = model_.col(column).def.name;
    Result expected;
    if (!model_.col(column).def.idx_flag) {
      expected = {PF_BADSEARCH, {name, ""}};
    } else {
      model_.search = column;
    }
    expect("search " + name, expected, TEV8R1_PF_define_table_search("t", name.c_str()));
  }
  void set_defaults() {
    if (no_columns()) return;
    const Row row = random_row();
    const auto bytes = image(*table_named("t"), row);
    const Result expected = model_.interactive ? Result{} : model_.check_row(row, -2);
    if (expected.status == PF_NORMAL) model_.defaults = row;
    expect("set defaults " + text(row), expected, TEV8R1_PF_set_dft_row("t", bytes.data()));
    auto out = row_buffer();
    TEV8R1_PF_inq_dft_row("t", out.data());
    if (decode(*table_named("t"), out.data()) != model_.defaults) complaint_ = "default row read";
  }
  void interactive() {
    model_.interactive = !model_.interactive && chance(30);
    expect("interactive", {},
           model_.interactive ? TEV8R1_set_interactive_table("t") : TEV8R1_turn_off_interactive());
  }

  // Every column has a name of its own; other refusals of definitions are tested elsewhere.
  Column random_column(int type) {
    Column c;
    TEVPF_COL_DEF& def = c.def;
    def.type = type;
    std::snprintf(def.name, sizeof def.name, "c%d", ++names_);
    static constexpr const char* kDescriptions[] = {nullptr, "", "short", "longer than short"};
    def.description = const_cast<char*>(kDescriptions[below(4)]);
    std::snprintf(def.units, sizeof def.units, "u%d", names_ % 100);
    def.spare_byte = std::int8_t(below(3));
    def.width = 1 + below(12);
    def.idx_flag = std::int8_t(chance(60));
    def.unq_flag = std::int8_t(chance(30));
    const double min = below(3);
    set_limits(c, below(3) + (chance(80) ? 200 : 5), min, 1 + below(4));
    return c;
  }
  void define_column() {
    if (model_.columns.size() > 6) return;
    const Column c = random_column(PF_TYPE_INT + below(5));
    expect(std::string("define ") + c.def.name, model_.define(c), TEV8R1_PF_def_column("t", c.def));
  }
  void redefine_column() {
    if (no_columns()) return;
    const int place = any_column();
    const std::string name = model_.col(place).def.name;
    const TEVPF_COL_DEF& old = model_.col(place).def;
    Column c =
        random_column(chance(model_.rows.empty() ? 50 : 10) ? PF_TYPE_INT + below(5) : old.type);
    if (chance(70)) std::strcpy(c.def.name, old.name);
    if (c.is_text() && !model_.rows.empty()) c.def.width = old.width;
    if (chance(60)) c.def.idx_flag = old.idx_flag;
    if (chance(60) && c.def.type == old.type) {
      const Column& o = model_.col(place);
      set_limits(c, o.max, o.min, chance(40) ? 1 + below(4) : o.precision);
    }
    expect("redefine " + name, model_.redefine(place, c),
           TEV8R1_PF_modify_col_def("t", name.c_str(), c.def));
  }
  void delete_column() {
    if (no_columns()) return;
    const int place = any_column();
    const std::string name = model_.col(place).def.name;
    model_.remove_column(place);
    expect("delete " + name, {}, TEV8R1_PF_delete_col("t", name.c_str()));
  }
  void move_column() {
    if (no_columns()) return;
    const int from = any_column(), before = below(int(model_.columns.size()) + 1) - 1;
    const std::string name = model_.col(from).def.name;
    const std::string other = before < 0 ? "" : model_.col(before).def.name;
    model_.move_column(from, before);
    expect("move " + name + " before " + other, {},
           TEV8R1_PF_move_col("t", name.c_str(), before < 0 ? nullptr : other.c_str()));
  }

  // The copy takes the place of its source: whatever they shared would be gone.
  void copy() {
    expect("copy", {}, TEV8R1_PF_copy_table("t", "copy"));
    TEV8R1_PF_delete_table("t");
    TEV8R1_modify_elem_name(PF_ELEM_TABLE, "copy", "t");
    model_.free_rows = model_.free_cols = 0;
  }
  void reopen() {
    expect("save", {}, TEV8R1_PF_save(nullptr));
    TEV8R1_PF_close(0);
    expect("reopen", {}, TEV8R1_PF_open(path_.c_str()));
    model_.cur = model_.search = -1;
    model_.next = model_.free_rows = model_.free_cols = 0;
    for (size_t i = 0; i < model_.columns.size(); ++i) {
      model_.defaults[i] = least(model_.columns[i]);
    }
  }
  void column_values() {
    if (no_columns()) return;
    const int column = any_column();
    const TEVPF_COLUMN& stored = table_named("t")->col_array[column];
    const auto size = size_t(tevpf_test::size_of(stored));
    std::vector<unsigned char> out(size * model_.rows.size() + 1);
    expect("column values", {model_.rows.empty() ? PF_NOMORE : PF_NORMAL},
           TEV8R1_PF_get_col_values("t", stored.def.name, out.data()));
    for (int i = 0; i < model_.count(); ++i) {
      if (load_value(stored.def, out.data() + size_t(i) * size) != model_.at(i, column)) {
        complaint_ = "column values";
      }
    }
  }
  void check_value() {
    if (no_columns()) return;
    const int column = any_column();
    const Value value = random_key(column);
    const Column& c = model_.col(column);
    expect("check " + text_of(c, value), model_.check_value(column, value),
           TEV8R1_validate_row_value("t", c.def.name, bytes_of(c.def, value).data()));
  }

  std::mt19937 random_;
  Model model_;
  std::string complaint_;
  int names_ = 0;
};

TEST_P(TableModelTest, RandomSequencesEqualAPlainModel) {
  for (int i = 0; i < 1500; ++i) {
    step();
    ASSERT_EQ(difference(), "") << "step " << i << ": " << last_;
  }
}

INSTANTIATE_TEST_SUITE_P(Seeds, TableModelTest, testing::Range(1u, 21u));

}  // namespace
