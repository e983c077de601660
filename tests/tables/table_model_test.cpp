// Random sequences of all table operations on the library and on a plain model: vectors of values, and
// indexes kept by the documented rules in the simplest way. After every step the status, both texts of
// a refusal, every row, index, default value and the cursor are compared, and the invariants checked.
#include <algorithm>
#include <array>
#include <cmath>
#include <numeric>
#include <random>
#include <utility>

#include "support/table_fixture.h"
#include "tables/column_record.h"

namespace tevpf {
namespace {

// A number's bytes as rows hold them, or a text without its terminator.
using Value = std::string;
// The values of a row, and all its bytes where they are known: padding and what stands behind texts.
struct Row : std::vector<Value> {
  std::string bytes{};
};
using Index = std::vector<int>;

Value value_of(int type, double x) {
  Value bytes(size_t(value_size(type, 0)), 0);
  with_number(type, [&](auto tag) { store(bytes.data(), static_cast<decltype(tag)>(x)); });
  return bytes;
}

int order_of(double a, double b, double tolerance) {
  if (a > b) return a - tolerance > b;
  return a < b && a + tolerance < b ? -1 : 0;
}

struct Result {
  TEVPF_STATUS status = PF_NORMAL;
  ErrorTexts texts = kUntouched;
  bool failed() const { return status != PF_NORMAL; }
};

// ---- The model -----------------------------------------------------------------------------------

struct Column {
  TEVPF_COL_DEF def{};
  Bounds bounds{0, 0, 1};
  double tolerance = 0;
  Index index{};

  bool is_text() const { return def.type == kText; }
  bool is_unique() const { return def.idx_flag && def.unq_flag; }
  Value least() const { return is_text() ? "" : value_of(def.type, bounds.min); }

  double number(const Value& v) const {
    return with_number(def.type, [&](auto tag) { return double(load<decltype(tag)>(v.data())); });
  }
  std::string text(const Value& v) const {
    char buffer[64];
    if (is_text()) return v;
    std::snprintf(buffer, sizeof buffer, is_floating_type(def.type) ? "%g" : "%.0f", number(v));
    return buffer;
  }
  int compare(const Value& a, const Value& b, double within) const {
    if (!is_text()) return order_of(number(a), number(b), within);
    const bool pattern = b.find('*') + 1 == b.size() && !b.empty();
    const auto length = pattern ? b.size() - 1 : std::string::npos;
    const int order = a.substr(0, length).compare(b.substr(0, length));
    return order < 0 ? -1 : order > 0;
  }
  int compare(const Value& a, const Value& b) const { return compare(a, b, tolerance); }
  bool takes(const Value& v, double within) const {
    return is_text() || (order_of(number(v), bounds.max, within) <= 0 &&
                         order_of(number(v), bounds.min, within) >= 0);
  }
};

struct Model {
  std::vector<Column> columns;
  std::vector<Row> rows;
  Row defaults;
  std::string search;  // the search column's name
  int cur = -1, next = 0, free_rows = 0, free_cols = 0, dup_row = 0;
  bool interactive = false;
  static constexpr int kInitial = 5, kIncrement = 3;

  int count() const { return int(rows.size()); }
  int searched() const {
    for (size_t i = 0; i < columns.size(); ++i) {
      if (columns[i].def.name == search) return int(i);
    }
    return -1;
  }
  int row_at(int position) const {
    return search.empty() ? position : columns[searched()].index[position];
  }

  void reset_defaults() {
    for (size_t i = 0; i < columns.size(); ++i) defaults[i] = columns[i].least();
    defaults.bytes.clear();
  }

  // The documented probes.
  bool find(int column, int first, const Value& key, int& pos) const {
    const Column& c = columns[column];
    const auto order = [&](int place) { return c.compare(rows[c.index[place]][column], key); };
    int low = first, high = int(c.index.size()) - 1;
    while (low <= high) {
      pos = low + (high - low) / 2;
      const int answer = order(pos);
      if (answer == 0) {
        while (pos > first && order(pos - 1) == 0) --pos;
        return true;
      }
      (answer < 0 ? low = pos + 1 : high = pos - 1);
    }
    pos = low;
    return false;
  }

  Index sorted(int column) const {
    Index index(rows.size());
    std::iota(index.begin(), index.end(), 0);
    std::stable_sort(index.begin(), index.end(), [&](int a, int b) {
      return columns[column].compare(rows[a][column], rows[b][column], 0) < 0;
    });
    return index;
  }

  // Whether the comparison of some entry's value with the next one's gives this.
  bool any_neighbours(int column, const Index& index, double tolerance, int order) const {
    return std::adjacent_find(index.begin(), index.end(), [&](int a, int b) {
             return columns[column].compare(rows[a][column], rows[b][column], tolerance) == order;
           }) != index.end();
  }

  Result check_value(int column, const Value& value) {
    const Column& c = columns[column];
    if (!c.takes(value, c.tolerance)) return {PF_RANGE, {c.text(value), ""}};
    int pos = 0;
    if (!c.is_unique() || !find(column, 0, value, pos)) return {};
    dup_row = c.index[pos];
    return {PF_DUPLICATE, {"value " + c.text(value), std::string("column ") + c.def.name}};
  }

  // owner: a row that may hold the values already, -2: any row may; the texts of a duplicate stay.
  Result check_row(const Row& row, int owner) {
    Result passed;
    for (size_t i = 0; i < row.size(); ++i) {
      const Result r = check_value(int(i), row[i]);
      const bool may_pass = r.status == PF_DUPLICATE && (owner == -2 || dup_row == owner);
      if (r.failed() && !may_pass) return r;
      if (may_pass) passed.texts = r.texts;
    }
    return passed;
  }

  void insert_entry(int column, int row) {
    int pos = 0;
    find(column, 0, rows[row][column], pos);
    columns[column].index.insert(columns[column].index.begin() + pos, row);
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
    for (size_t c = 0; c < columns.size(); ++c) {
      if (columns[c].def.idx_flag) insert_entry(int(c), place);
    }
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

  Result delete_row() {
    if (cur < 0) return {PF_NOCURROW, kEmpty};
    erase(row_at(cur));
    cur = -1;
    --next;
    return {};
  }

  Result replace(const Row& row) {
    if (cur < 0) return {PF_NOCURROW, kEmpty};
    const int n = row_at(cur);
    const Result r = check_row(row, n);
    if (r.failed()) return r;
    const Row old = std::exchange(rows[n], row);
    for (size_t c = 0; c < columns.size(); ++c) {
      if (!columns[c].def.idx_flag || columns[c].compare(old[c], row[c]) == 0) continue;
      std::erase(columns[c].index, n);
      insert_entry(int(c), n);
    }
    return r;
  }

  Result bad_position(int pos) const {
    return {PF_BADPOS, {std::to_string(pos), std::to_string(count())}};
  }

  Result move(int from, int to) {
    if (!search.empty()) return {PF_SEARCHSET};
    if (from < 0 || from >= count() || count() < 2) return bad_position(from);
    const Model before = *this;
    const Row row = rows[from];
    erase(from);
    const Result r = add(row, to);
    const int holder = dup_row;
    if (r.failed()) *this = before;
    dup_row = holder;
    return r;
  }

  // The row at a position becomes the current one.
  Result go_to(int pos, const Result& refusal) {
    if (pos < 0 || pos >= count()) return refusal;
    cur = pos;
    next = pos + 1;
    return {};
  }

  Result by_value(int mode, int column, const Value& key) {
    const Column& c = columns[column];
    const Result missing = {PF_NOTFOUND, {c.text(key), ""}};
    if (rows.empty()) return {PF_NOTFOUND, kEmpty};
    int pos = next;
    if (c.def.name == search) {
      if (!find(column, next, key, pos) && mode != 1) return missing;
    } else {
      while (pos < count() && c.compare(rows[row_at(pos)][column], key) != 0) ++pos;
    }
    return go_to(pos, missing);
  }

  Result define(const Column& column) {
    if (column.is_unique() && !rows.empty()) return {PF_BADUNIQUE, kEmpty};
    columns.push_back(column);
    Column& added = columns.back();
    if (!added.def.idx_flag) added.def.unq_flag = 0;
    added.def.desc_byte = added.def.spare_byte = 0;
    for (Row& row : rows) row.push_back(added.least());
    defaults.push_back(added.least());
    if (added.def.idx_flag) added.index = sorted(int(columns.size()) - 1);
    free_rows = 0;
    free_cols = (free_cols == 0 ? 3 : free_cols) - 1;
    return {};
  }

  Result redefine(int place, const Column& changed) {
    Column& old = columns[place];
    const TEVPF_COL_DEF& def = changed.def;
    if (def.type != old.def.type && !rows.empty()) return {PF_TYPECHG};
    for (const Row& row : rows) {
      if (!changed.takes(row[place], old.tolerance)) return {PF_RANGE, {old.text(row[place]), ""}};
    }
    Index index;
    if (def.idx_flag) index = old.def.idx_flag ? old.index : sorted(place);
    if (changed.is_unique() && !old.def.unq_flag &&
        any_neighbours(place, index, old.tolerance, 0)) {
      return {PF_NOTUNIQUE, kEmpty};
    }
    if (search == old.def.name) search = def.idx_flag ? def.name : "";
    const bool finer = changed.tolerance < old.tolerance;
    old = changed;
    old.def.desc_byte = 0;
    if (finer && any_neighbours(place, index, old.tolerance, 1)) index = sorted(place);
    old.index = index;
    reset_defaults();
    return {};
  }

  void remove_column(int place) {
    if (search == columns[place].def.name) search.clear();
    columns.erase(columns.begin() + place);
    defaults.erase(defaults.begin() + place);
    for (Row& row : rows) row.erase(row.begin() + place);
    free_rows = 0;
    if (!columns.empty()) return;
    rows.clear();
    cur = -1;
    next = 0;
  }

  void move_column(int from, int before) {  // before: -1 to the end
    if (columns.size() < 2) return;
    const int to = (before < 0 ? int(columns.size()) : before) - (before < 0 || before > from);
    const auto shift = [&](auto& items) {
      const auto item = items[from];
      items.erase(items.begin() + from);
      items.insert(items.begin() + to, item);
    };
    shift(columns);
    shift(defaults);
    for (Row& row : rows) shift(row);
    free_rows = free_cols = 0;
  }
};

// ---- Library and model side by side --------------------------------------------------------------

Value load_value(const TEVPF_COL_DEF& def, const char* place) {
  return def.type == kText ? Value(place) : Value(place, size_t(value_size(def.type, 0)));
}

Row decode(const TEVPF_TABLE& table, const void* bytes) {
  Row row;
  for (const TEVPF_COLUMN& column : std::span(table.col_array, table.num_cols)) {
    row.push_back(load_value(column.def, static_cast<const char*>(bytes) + column.offset));
  }
  return row;
}

class TableModelTest : public TableTest, public testing::WithParamInterface<unsigned> {
 protected:
  TableModelTest() : random_(GetParam()) {
    TEV8R1_PF_set_memory_allocation(Model::kInitial, Model::kIncrement);
    model_.dup_row = library.dup_row;
    table().RESERVED[7] = 'r';
    define_column();
  }

  std::string last_;  // the last call that was compared

  void step() {
    static constexpr struct {
      int weight;
      bool needs_columns;
      void (TableModelTest::*run)();
    } kOperations[] = {
        {34, true, &TableModelTest::add_row},
        {4, true, &TableModelTest::add_with_defaults},
        {12, true, &TableModelTest::replace_row},
        {10, false, &TableModelTest::delete_row},
        {1, false, &TableModelTest::delete_all_rows},
        {5, false, &TableModelTest::move_row},
        {8, false, &TableModelTest::next_row},
        {6, false, &TableModelTest::row_by_pos},
        {1, false, &TableModelTest::reset},
        {10, true, &TableModelTest::row_by_value},
        {3, true, &TableModelTest::get_value},
        {3, true, &TableModelTest::define_search},
        {3, true, &TableModelTest::set_defaults},
        {1, false, &TableModelTest::interactive},
        {2, false, &TableModelTest::define_column},
        {5, true, &TableModelTest::redefine_column},
        {1, true, &TableModelTest::delete_column},
        {2, true, &TableModelTest::move_column},
        {1, false, &TableModelTest::copy},
        {1, false, &TableModelTest::reopen},
        {2, true, &TableModelTest::column_values},
        {2, true, &TableModelTest::hand_out},
    };
    set_error_texts();
    const auto* operation = kOperations;
    for (int pick = below(117); pick >= operation->weight; ++operation) pick -= operation->weight;
    if (!operation->needs_columns || !model_.columns.empty()) (this->*operation->run)();
  }

  void compare() {
    const TEVPF_TABLE& t = table();
    expect_no_broken_rule();
    ASSERT_EQ(t.num_cols, int(model_.columns.size()));
    ASSERT_EQ(t.num_rows, model_.count());
    // Slots without rows may go with a change of layout.
    if (t.num_rows == 0 && t.free_rows == 0) model_.free_rows = 0;
    EXPECT_EQ(t.free_rows, model_.free_rows);
    EXPECT_EQ(t.free_cols, model_.free_cols);
    EXPECT_EQ(t.RESERVED[7], 'r');
    EXPECT_EQ(library.dup_row, model_.dup_row);
    EXPECT_EQ(t.cur_row, model_.cur);
    EXPECT_EQ(t.next_row, model_.next);
    EXPECT_EQ(t.cur_col == nullptr ? "" : t.cur_col->def.name, model_.search);
    for (int i = 0; i < t.num_rows; ++i) {
      SCOPED_TRACE(testing::Message() << "row " << i);
      compare_bytes(t, tevpf::row_at(t, slot_of(t, i)), model_.rows[i]);
    }
    for (int i = 0; i < t.num_cols; ++i) {
      const Column& expected = model_.columns[i];
      TEVPF_COL_DEF def = t.col_array[i].def;
      EXPECT_STREQ(def.description, expected.def.description);
      def.description = expected.def.description;
      EXPECT_EQ(std::memcmp(&def, &expected.def, sizeof def), 0) << def.name;
      EXPECT_EQ(def.idx_flag ? order(i) : Index{}, expected.index) << def.name;
    }
    EXPECT_EQ(decode(t, t.dft_row), model_.defaults);
  }

 private:
  int below(int n) { return n < 1 ? 0 : int(random_() % unsigned(n)); }
  bool chance(int percent) { return below(100) < percent; }
  int any_column() { return below(int(model_.columns.size())); }

  // Whether both the model and the call say that it was done.
#define BOTH(expected, call) both(#call, expected, call)
  bool both(const char* call, const Result& expected, TEVPF_STATUS status) {
    last_ = call;
    expect_answer(status, expected.status, expected.texts);
    return !expected.failed() && !HasFailure();
  }

  // A buffer, and the row that was delivered into it as the model's current one.
  char* out(int bytes = table().row_wid) {
    out_.assign(bytes + 1, '\0');
    return out_.data();
  }
  void compare_row() {
    const int row = model_.row_at(model_.cur);
    compare_bytes(table(), out_.data(), model_.rows[row]);
    EXPECT_EQ(TEV8R1_convert_row("t", model_.cur), row);
  }

  static void compare_bytes(const TEVPF_TABLE& t, const void* bytes, const Row& expected) {
    ASSERT_EQ(decode(t, bytes), expected);
    if (expected.bytes.empty()) return;
    ASSERT_EQ(std::string(static_cast<const char*>(bytes), t.row_wid), expected.bytes);
  }
  // The bytes that are kept of a row that is handed in: all of them, but for a missing terminator.
  static std::string kept(std::string bytes) {
    for (const TEVPF_COLUMN& c : std::span(table().col_array, table().num_cols)) {
      char* const text = &bytes[c.offset];
      const int last = c.def.type == kText ? c.def.width : -1;
      if (last >= 0 && std::memchr(text, 0, last + 1) == nullptr) text[last] = 0;
    }
    return bytes;
  }

  // A row as a careless caller hands it in: rubbish in the padding and behind texts, and no
  // terminator behind a text as wide as its column.
  static std::string image(const Row& row) {
    const TEVPF_TABLE& t = table();
    std::string bytes(t.row_wid, '\xEE');
    for (size_t i = 0; i < row.size(); ++i) {
      const auto& [def, place] = std::pair(t.col_array[i].def, t.col_array[i].offset);
      const size_t size = row[i].size() + (def.type == kText && int(row[i].size()) < def.width);
      std::copy_n(row[i].c_str(), size, &bytes[place]);
    }
    return bytes;
  }

  Value random_value(const Column& c) {
    if (c.is_text()) {
      Value v;
      for (int n = below(c.def.width + 1); n > 0; --n) v += "aab\xC3"[below(4)];
      return v;
    }
    const auto [min, max, precision] = c.bounds;
    if (chance(2)) return value_of(c.def.type, chance(50) ? max + 1 : min - 1);
    // Some reals differ by less than the tolerance, in chains, from just below the least one on.
    const int steps = chance(70) ? 4 : int(max - min) + 1;
    return value_of(c.def.type, min + below(steps) + (below(4) - 1) * 0.7 * c.tolerance);
  }

  Row random_row() {
    Row row;
    for (const Column& c : model_.columns) row.push_back(random_value(c));
    return row;
  }

  // Mostly a value that some row holds, or a part of it as a pattern; some texts are longer than any.
  Value random_key(int column) {
    const Column& c = model_.columns[column];
    if (model_.rows.empty() || chance(30)) return random_value(c);
    Value key = model_.rows[below(model_.count())][column];
    if (!c.is_text()) return key;
    static constexpr const char* kEnds[] = {"a", "\xFF", "*", "b*"};
    if (chance(40)) key = key.substr(0, below(int(key.size()) + 1)) + "*";
    if (chance(10)) key += kEnds[below(4)];
    return key;
  }

  void add_row() {
    const int place = chance(70) ? PF_END_POS : below(model_.count() + 4) - 2;
    Row row = random_row();
    const std::string bytes = image(row);
    row.bytes = kept(bytes);
    BOTH(model_.add(row, place), TEV8R1_PF_add_row_by_pos("t", bytes.data(), place));
  }
  void add_with_defaults() {
    Row row = random_row();
    std::string bytes = image(row);
    std::vector<std::int32_t> supplied;
    for (size_t i = 0; i < row.size(); ++i) {
      supplied.push_back(
          std::array{0, 0, 1, -5}[static_cast<std::size_t>(below(4))]);  // any but 0: yes
      if (supplied[i] != 0) continue;
      row[i] = model_.defaults[i];
      const TEVPF_COLUMN& c = table().col_array[i];
      std::memcpy(&bytes[c.offset], table().dft_row + c.offset, column_size(c));
    }
    row.bytes = kept(bytes);
    const std::string completed = bytes;
    for (size_t i = 0; i < row.size(); ++i) bytes[table().col_array[i].offset] ^= supplied[i] == 0;
    BOTH(model_.add(row, PF_END_POS),
         TEV8R1_PF_add_row_with_dft("t", bytes.data(), supplied.data()));
    EXPECT_EQ(bytes, completed);
  }
  void replace_row() {
    Row row = random_row();
    if (model_.cur >= 0 && chance(70)) {  // change one value only
      const int changed = !model_.search.empty() && chance(70) ? model_.searched() : any_column();
      Row old = model_.rows[model_.row_at(model_.cur)];
      old[changed] = row[changed];
      row = old;
    }
    const std::string bytes = image(row);
    row.bytes = kept(bytes);
    BOTH(model_.replace(row), TEV8R1_PF_replace_row("t", bytes.data()));
  }
  void delete_row() { BOTH(model_.delete_row(), TEV8R1_PF_delete_row("t")); }
  // What was reserved for rows stays, while columns without rows may become any others.
  void delete_all_rows() {
    if (chance(70)) return;
    while (model_.count() > 0 && !HasFailure()) {
      row_at(0);
      delete_row();
    }
    for (int i = 0; i < 3 && !HasFailure(); ++i) redefine_column();
  }
  void move_row() {
    if (!model_.search.empty() && chance(60)) {
      model_.search.clear();
      TEV8R1_PF_define_table_search("t", nullptr);
    }
    const int from = below(model_.count() + 2) - 1;
    const int to = chance(10) ? PF_END_POS : below(model_.count() + 2) - 1;
    BOTH(model_.move(from, to), TEV8R1_PF_move_row("t", from, to));
  }
  void next_row() {
    const Result expected = model_.go_to(model_.next, {PF_NOMORE});
    if (BOTH(expected, TEV8R1_PF_get_next_row("t", out()))) compare_row();
  }
  void row_at(int pos) {
    const Result expected = model_.go_to(pos, model_.bad_position(pos));
    if (BOTH(expected, TEV8R1_PF_get_row_by_pos("t", pos, out()))) compare_row();
  }
  void row_by_pos() { row_at(below(model_.count() + 2) - 1); }
  void reset() {
    model_.cur = -1;
    model_.next = 0;
    BOTH({}, TEV8R1_PF_reset_table("t"));
  }
  void row_by_value() {  // some columns often enough for search keys
    const bool indexed = !model_.search.empty() && chance(60);
    const int column = indexed ? model_.searched() : any_column();
    const char* const name = model_.columns[column].def.name;
    for (int n = 1 + below(4); n > 0; --n) {
      if (chance(40)) reset();
      const auto mode = std::int8_t(below(3));
      const Value key = random_key(column);
      const Result expected = model_.by_value(mode, column, key);
      if (BOTH(expected, TEV8R1_PF_get_row_by_value("t", mode, name, key.c_str(), out()))) {
        compare_row();
      }
    }
  }
  void get_value() {
    const Value key = random_key(0);
    const int column = any_column();
    const TEVPF_COL_DEF& def = model_.columns[column].def;
    Model searched = model_;
    searched.next = 0;
    const Result expected = searched.by_value(0, 0, key);
    if (!BOTH(expected, TEV8R1_PF_get_value("t", def.name, key.c_str(), out()))) return;
    EXPECT_EQ(load_value(def, out_.data()), searched.rows[searched.row_at(searched.cur)][column]);
  }
  void define_search() {
    const TEVPF_COL_DEF& def = model_.columns[any_column()].def;
    const Result expected = def.idx_flag ? Result{} : Result{PF_BADSEARCH, {def.name, ""}};
    if (BOTH(expected, TEV8R1_PF_define_table_search("t", def.name))) model_.search = def.name;
  }
  void set_defaults() {
    Row row = random_row();
    const std::string bytes = image(row);
    row.bytes = kept(bytes);
    const Result expected = model_.interactive ? Result{} : model_.check_row(row, -2);
    if (BOTH(expected, TEV8R1_PF_set_dft_row("t", bytes.data()))) model_.defaults = row;
    TEV8R1_PF_inq_dft_row("t", out());
    compare_bytes(table(), out_.data(), model_.defaults);
  }
  void interactive() {
    model_.interactive = !model_.interactive && chance(30);
    model_.interactive ? TEV8R1_set_interactive_table("t") : TEV8R1_turn_off_interactive();
  }

  // Every column has a name of its own; other refusals of definitions are tested elsewhere.
  Column random_column(int type, Bounds bounds) {
    static constexpr const char* kDescriptions[] = {nullptr, "", "short", "longer than short"};
    const std::string name = "c" + std::to_string(++names_);
    TEVPF_COL_DEF def =
        described(col(name.c_str(), type, 1 + below(12), bounds), kDescriptions[below(4)]);
    std::snprintf(def.units, sizeof def.units, "u%d", names_ % 100);
    def.desc_byte = def.spare_byte = std::int8_t(below(3));
    def.spare = std::uint32_t(below(3));
    def.idx_flag = chance(60);
    def.unq_flag = chance(30);
    return {def, bounds, is_floating_type(type) ? std::pow(10.0, -(bounds.precision + 1)) : 0};
  }
  int random_type() { return kInt + below(5); }
  Bounds random_bounds() {
    const double min = below(3);
    return {min, below(3) + (chance(80) ? 200.0 : 5.0), 1 + below(4)};
  }
  void define_column() {
    if (model_.columns.size() > 6) return;
    const Column c = random_column(random_type(), random_bounds());
    if (!BOTH(model_.define(c), TEV8R1_PF_def_column("t", c.def))) return;
    const int offset = table().col_array[table().num_cols - 1].offset;
    const Value value = c.is_text() ? Value(c.def.width + 1, 0) : c.least();
    for (Row& row : model_.rows) {  // old bytes stay where they are, new ones are zero
      if (row.bytes.empty()) continue;
      row.bytes.resize(table().row_wid);
      row.bytes.replace(offset, value.size(), value);
    }
    if (model_.defaults.bytes.empty()) return;
    model_.defaults.bytes.resize(table().row_wid);
    model_.defaults.bytes.replace(offset, c.is_text() ? 1 : value.size(), value, 0,
                                  c.is_text() ? 1 : value.size());
  }
  void forget_bytes() {
    for (Row& row : model_.rows) row.bytes.clear();
    model_.defaults.bytes.clear();
  }
  void redefine_column() {
    if (model_.columns.empty()) return;
    const int place = any_column();
    const Column old = model_.columns[place];
    const int type = chance(model_.rows.empty() ? 50 : 10) ? random_type() : old.def.type;
    Bounds bounds = random_bounds();
    if (chance(60) && type == old.def.type) {
      bounds = {old.bounds.min, old.bounds.max, chance(40) ? 1 + below(4) : old.bounds.precision};
    }
    Column c = random_column(type, bounds);
    if (chance(70)) std::strcpy(c.def.name, old.def.name);
    if (c.is_text() && !model_.rows.empty()) c.def.width = old.def.width;
    if (chance(60)) c.def.idx_flag = old.def.idx_flag;
    BOTH(model_.redefine(place, c), redefine(old.def.name, c.def));
  }
  void delete_column() {
    const int place = any_column();
    const std::string name = model_.columns[place].def.name;
    model_.remove_column(place);
    forget_bytes();
    BOTH({}, TEV8R1_PF_delete_col("t", name.c_str()));
  }
  void move_column() {
    const int from = any_column(), before = below(int(model_.columns.size()) + 1) - 1;
    const std::string name = model_.columns[from].def.name;
    const std::string other = before < 0 ? "" : model_.columns[before].def.name;
    model_.move_column(from, before);
    forget_bytes();
    BOTH({}, TEV8R1_PF_move_col("t", name.c_str(), before < 0 ? nullptr : other.c_str()));
  }

  // The copy takes the place of its source: whatever they shared would be gone.
  void copy() {
    BOTH({}, TEV8R1_PF_copy_table("t", "copy"));
    TEV8R1_PF_delete_table("t");
    TEV8R1_modify_elem_name(PF_ELEM_TABLE, "copy", "t");
    model_.free_rows = model_.free_cols = 0;
  }
  void reopen() {
    save_and_reopen();
    last_ = "reopen";
    model_.search.clear();
    model_.cur = -1;
    model_.next = model_.free_rows = model_.free_cols = 0;
    model_.reset_defaults();
    for (Column& c : model_.columns) c.def.spare = 0;  // never stored
  }
  void column_values() {
    const int column = any_column();
    const TEVPF_COL_DEF& def = model_.columns[column].def;
    const auto size = int(value_size(def.type, def.width));
    char* const values = out(size * model_.count());
    BOTH({model_.rows.empty() ? PF_NOMORE : PF_NORMAL},
         TEV8R1_PF_get_col_values("t", def.name, values));
    for (int i = 0; i < model_.count(); ++i) {
      EXPECT_EQ(load_value(def, values + i * size), model_.rows[i][column]);
    }
  }
  // What callers outside get: rows in storage order, indexes as arrays of row numbers.
  void hand_out() {
    const TEVPF_TABLE& t = settled();
    EXPECT_TRUE(t.slots.order.is_identity());
    for (int i = 0; i < t.num_rows; ++i) {
      compare_bytes(t, t.row_data + std::ptrdiff_t{i} * t.row_wid, model_.rows[i]);
    }
    for (size_t i = 0; i < model_.columns.size(); ++i) {
      const Index& index = model_.columns[i].index;
      EXPECT_TRUE(std::equal(index.begin(), index.end(), t.col_array[i].idx_ptr));
    }
  }
  std::mt19937 random_;
  Model model_;
  std::string out_;
  int names_ = 0;
};

TEST_P(TableModelTest, RandomSequencesEqualAPlainModel) {
  for (int i = 0; i < 1500; ++i) {
    step();
    compare();
    ASSERT_FALSE(HasFailure()) << "step " << i << ": " << last_;
  }
}

INSTANTIATE_TEST_SUITE_P(Seeds, TableModelTest,
                         testing::Range(TEVPF_FIRST_SEED, 21u, TEVPF_SEED_STEP));

}  // namespace
}  // namespace tevpf
