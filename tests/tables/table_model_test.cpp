// Random sequences of all table operations on the library and on a plain model: vectors of values, and
// indexes kept by the documented rules in the simplest way. After every step the status, both texts of
// a refusal, every row, index, default value and the cursor are compared, and the invariants checked.
#include <algorithm>
#include <cmath>
#include <numeric>
#include <random>
#include <utility>

#include "support/table_fixture.h"

namespace tevpf {
namespace {

// A number's bytes as rows hold them, or a text without its terminator.
using Value = std::string;
using Row = std::vector<Value>;

struct Column {
  TEVPF_COL_DEF def{};
  Bounds bounds{0, 0, 1};
  double tolerance = 0;
  std::vector<int> index;

  bool is_text() const { return def.type == kText; }
  bool is_unique() const { return def.idx_flag && def.unq_flag; }
};

Value value_of(int type, double x) {
  Value bytes(size_t(value_size(type, 0)), 0);
  with_number(type, [&](auto tag) { store(bytes.data(), static_cast<decltype(tag)>(x)); });
  return bytes;
}
double number(const Column& c, const Value& v) {
  return with_number(c.def.type, [&](auto tag) { return double(load<decltype(tag)>(v.data())); });
}

struct Result {
  TEVPF_STATUS status = PF_NORMAL;
  ErrorTexts texts = kUntouched;
  bool failed() const { return status != PF_NORMAL; }
};

std::string as_text(const Column& c, const Value& v) {
  char buffer[64];
  if (c.is_text()) return v;
  std::snprintf(buffer, sizeof buffer, is_floating_type(c.def.type) ? "%g" : "%.0f", number(c, v));
  return buffer;
}

int order_of(double a, double b, double tolerance) {
  if (a > b) return a - tolerance > b;
  return a < b && a + tolerance < b ? -1 : 0;
}

int compare_values(const Column& c, const Value& a, const Value& b, double tolerance) {
  if (!c.is_text()) return order_of(number(c, a), number(c, b), tolerance);
  const bool pattern = b.find('*') + 1 == b.size() && !b.empty();
  const auto length = pattern ? b.size() - 1 : std::string::npos;
  const int order = a.substr(0, length).compare(b.substr(0, length));
  return order < 0 ? -1 : order > 0;
}
int compare_values(const Column& c, const Value& a, const Value& b) {
  return compare_values(c, a, b, c.tolerance);
}

Value least(const Column& c) { return c.is_text() ? "" : value_of(c.def.type, c.bounds.min); }

bool in_range(const Column& c, const Value& v, double tolerance) {
  return c.is_text() || (order_of(number(c, v), c.bounds.max, tolerance) <= 0 &&
                         order_of(number(c, v), c.bounds.min, tolerance) >= 0);
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

  void reset_defaults() {
    for (size_t i = 0; i < columns.size(); ++i) defaults[i] = least(columns[i]);
  }

  // The documented probes.
  bool find(int column, int first, const Value& key, int& pos) {
    const std::vector<int>& index = col(column).index;
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
    std::vector<int> index(rows.size());
    std::iota(index.begin(), index.end(), 0);
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
    if (!in_range(c, value, c.tolerance)) return {PF_RANGE, {as_text(c, value), ""}};
    int pos = 0;
    if (!c.is_unique() || !find(column, 0, value, pos)) return {};
    dup_row = c.index[size_t(pos)];
    return {PF_DUPLICATE, {"value " + as_text(c, value), std::string("column ") + c.def.name}};
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

  void insert_entry(int column, int row) {
    std::vector<int>& index = col(column).index;
    int pos = 0;
    find(column, 0, at(row, column), pos);
    index.insert(index.begin() + pos, row);
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
    for (int c = 0; c < int(columns.size()); ++c) {
      if (col(c).def.idx_flag) insert_entry(c, place);
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

  Result replace(const Row& row) {
    if (cur < 0) return {PF_NOCURROW, kEmpty};
    const int n = row_at(cur);
    const Result r = check_row(row, n);
    if (r.failed()) return r;
    const Row old = std::exchange(rows[size_t(n)], row);
    for (int c = 0; c < int(columns.size()); ++c) {
      if (!col(c).def.idx_flag || compare_values(col(c), old[size_t(c)], at(n, c)) == 0) continue;
      std::erase(col(c).index, n);
      insert_entry(c, n);
    }
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
    const Result missing = {PF_NOTFOUND, {as_text(col(column), key), ""}};
    if (rows.empty()) return {PF_NOTFOUND, kEmpty};
    if (column == search) {
      int pos = 0;
      const bool found = find(column, next, key, pos);
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
    if (column.is_unique() && !rows.empty()) return {PF_BADUNIQUE, kEmpty};
    columns.push_back(column);
    Column& added = columns.back();
    if (!def.idx_flag) added.def.unq_flag = 0;
    added.def.desc_byte = added.def.spare_byte = 0;
    for (Row& row : rows) row.push_back(least(added));
    defaults.push_back(least(added));
    if (def.idx_flag) added.index = sorted(int(columns.size()) - 1);
    free_rows = 0;
    if (free_cols == 0) free_cols = 3;
    --free_cols;
    return {};
  }

  bool any_neighbours(int column, const std::vector<int>& index, double tolerance, int order) {
    return std::adjacent_find(index.begin(), index.end(), [&](int a, int b) {
             return compare_values(col(column), at(a, column), at(b, column), tolerance) == order;
           }) != index.end();
  }

  Result redefine(int place, const Column& changed) {
    Column& old = col(place);
    const TEVPF_COL_DEF& def = changed.def;
    if (def.type != old.def.type && !rows.empty()) return {PF_TYPECHG};
    for (int i = 0; i < count(); ++i) {
      if (in_range(changed, at(i, place), old.tolerance)) continue;
      return {PF_RANGE, {as_text(old, at(i, place)), ""}};
    }
    std::vector<int> index;
    if (def.idx_flag) index = old.def.idx_flag ? old.index : sorted(place);
    if (def.idx_flag && def.unq_flag && !old.def.unq_flag &&
        any_neighbours(place, index, old.tolerance, 0)) {
      return {PF_NOTUNIQUE, kEmpty};
    }
    if (!def.idx_flag && search == place) search = -1;
    const bool finer = changed.tolerance < old.tolerance;
    const bool new_width = def.width != old.def.width;
    old = changed;
    old.def.desc_byte = 0;
    if (new_width && interactive) remake_formats();
    if (finer && any_neighbours(place, index, old.tolerance, 1)) index = sorted(place);
    old.index = index;
    reset_defaults();
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
    shift(columns);
    shift(defaults);
    for (Row& row : rows) shift(row);
    if (search == from) {
      search = to;
    } else {
      search += (search < from && search >= to) - (search > from && search <= to);
    }
    free_rows = free_cols = 0;
  }
};

// ---- Library and model side by side --------------------------------------------------------------

Value load_value(const TEVPF_COL_DEF& def, const void* place) {
  const auto* bytes = static_cast<const char*>(place);
  return def.type == kText ? Value(bytes) : Value(bytes, size_t(value_size(def.type, 0)));
}

// A row as a careless caller hands it in: rubbish in the padding and behind texts, and no terminator
// behind a text as wide as its column.
std::string image(const TEVPF_TABLE& table, const Row& row) {
  std::string bytes(size_t(table.row_wid), '\xEE');
  for (size_t i = 0; i < row.size(); ++i) {
    const TEVPF_COL_DEF& def = table.col_array[i].def;
    const size_t size =
        def.type == kText ? std::min(row[i].size() + 1, size_t(def.width)) : row[i].size();
    std::copy_n(row[i].c_str(), size, &bytes[size_t(table.col_array[i].offset)]);
  }
  return bytes;
}

Row decode(const TEVPF_TABLE& table, const void* bytes) {
  Row row;
  for (int i = 0; i < table.num_cols; ++i) {
    const TEVPF_COLUMN& column = table.col_array[i];
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

  std::string last_;  // the operation of the last step

  void step() {
    using Self = TableModelTest;
    set_error_texts();
    static constexpr struct {
      int weight;
      bool needs_columns;
      void (Self::*run)();
    } kOperations[] = {
        {34, true, &Self::add_row},
        {4, true, &Self::add_with_defaults},
        {12, true, &Self::replace_row},
        {10, false, &Self::delete_row},
        {1, false, &Self::delete_all_rows},
        {5, false, &Self::move_row},
        {8, false, &Self::next_row},
        {6, false, &Self::row_by_pos},
        {1, false, &Self::reset},
        {10, true, &Self::row_by_value},
        {3, true, &Self::get_value},
        {3, true, &Self::define_search},
        {3, true, &Self::set_defaults},
        {1, false, &Self::interactive},
        {2, false, &Self::define_column},
        {5, true, &Self::redefine_column},
        {1, true, &Self::delete_column},
        {2, true, &Self::move_column},
        {1, false, &Self::copy},
        {1, false, &Self::reopen},
        {2, true, &Self::column_values},
        {2, true, &Self::check_value},
    };
    int total = 0;
    for (const auto& operation : kOperations) total += operation.weight;
    int pick = below(total);
    for (const auto& operation : kOperations) {
      if ((pick -= operation.weight) >= 0) continue;
      if (!operation.needs_columns || !model_.columns.empty()) (this->*operation.run)();
      return;
    }
  }

  // The first difference between library and model, or an empty text.
  std::string difference() {
    const TEVPF_TABLE& t = table();
    if (!complaint_.empty()) return complaint_;
    if (t.num_cols != int(model_.columns.size()) || t.num_rows != model_.count()) return "counts";
    // Slots without rows may go with a change of layout.
    if (t.num_rows == 0 && t.free_rows == 0) model_.free_rows = 0;
    if (t.free_rows != model_.free_rows) return "free_rows " + std::to_string(t.free_rows);
    if (t.free_cols != model_.free_cols) return "free_cols";
    if (t.RESERVED[7] != 'r') return "RESERVED";
    if (t.dsp_wid != model_.dsp_wid) return "dsp_wid " + std::to_string(t.dsp_wid);
    if (library.dup_row != model_.dup_row) return "dup_row";
    if (t.cur_row != model_.cur || t.next_row != model_.next) return "cursor";
    if ((t.cur_col == nullptr ? -1 : t.cur_col - t.col_array) != model_.search) return "search";
    for (int i = 0; i < t.num_rows; ++i) {
      if (decode(t, row_at(t, i)) != model_.rows[size_t(i)]) return "row " + std::to_string(i);
    }
    for (int i = 0; i < t.num_cols; ++i) {
      if (const char* wrong = column_difference(t, i)) return wrong;
    }
    if (t.num_cols > 0 && decode(t, t.dft_row) != model_.defaults) return "default row";
    return HasFailure() ? "a broken rule" : "";
  }

 private:
  int below(int n) { return n < 1 ? 0 : int(random_() % unsigned(n)); }
  bool chance(int percent) { return below(100) < percent; }

  const char* column_difference(const TEVPF_TABLE& t, int i) {
    const Column& expected = model_.col(i);
    TEVPF_COL_DEF def = t.col_array[i].def;
    const char* wanted = expected.def.description;
    if (wanted != nullptr && def.description != nullptr) {
      if (std::strcmp(def.description, wanted) != 0) return "description";
      def.description = expected.def.description;
    }
    if (std::memcmp(&def, &expected.def, sizeof def) != 0) return "definition";
    return !def.idx_flag || order(i) == expected.index ? nullptr : "index";
  }

  void expect(const std::string& operation, const Result& expected, TEVPF_STATUS status) {
    last_ = operation;
    if (!complaint_.empty() || (status == expected.status && error_texts() == expected.texts)) {
      return;
    }
    complaint_ = testing::PrintToString(error_texts()) + ", status " + std::to_string(status);
  }

  Value random_value(const Column& c) {
    if (c.is_text()) {
      Value v;
      for (int n = below(c.def.width + 1); n > 0; --n) v += "aab\xC3"[below(4)];
      return v;
    }
    const auto [min, max, precision] = c.bounds;
    if (chance(2)) return value_of(c.def.type, chance(50) ? max + 1 : min - 1);
    // Some reals differ by less than the tolerance, in chains.
    const int steps = chance(70) ? 4 : int(max - min) + 1;
    return value_of(c.def.type, min + below(steps) + below(4) * 0.7 * c.tolerance);
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
    static constexpr const char* kEnds[] = {"a", "\xFF", "*", "b*"};
    if (chance(40)) key = key.substr(0, size_t(below(int(key.size()) + 1))) + "*";
    if (chance(10)) key += kEnds[below(4)];
    return key;
  }

  int any_column() { return below(int(model_.columns.size())); }

  void add_row() {
    const int place = chance(70) ? PF_END_POS : below(model_.count() + 4) - 2;
    const Row row = random_row();
    expect("add at " + std::to_string(place), model_.add(row, place),
           TEV8R1_PF_add_row_by_pos("t", image(table(), row).data(), place));
  }
  void add_with_defaults() {
    Row row = random_row();
    std::string bytes = image(table(), row);
    std::vector<std::int32_t> supplied;
    for (size_t i = 0; i < row.size(); ++i) {
      supplied.push_back(below(2));
      if (supplied[i] == 0) row[i] = model_.defaults[i];
    }
    expect("add with defaults", model_.add(row, PF_END_POS),
           TEV8R1_PF_add_row_with_dft("t", bytes.data(), supplied.data()));
    const Row buffer = decode(table(), (bytes + '\0').data());
    for (size_t i = 0; i < row.size(); ++i) {
      if (supplied[i] == 0 && buffer[i] != row[i]) complaint_ = "the buffer lacks a default";
    }
  }
  void replace_row() {
    Row row = random_row();
    if (model_.cur >= 0 && chance(70)) {  // change one value only
      const auto changed = size_t(any_column());
      Row old = model_.rows[size_t(model_.row_at(model_.cur))];
      old[changed] = row[changed];
      row = old;
    }
    expect("replace", model_.replace(row), TEV8R1_PF_replace_row("t", image(table(), row).data()));
  }
  void delete_row() {
    Result expected{PF_NOCURROW, kEmpty};
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
                 const std::string& out) {
    expect(operation, expected, status);
    if (status != PF_NORMAL || !complaint_.empty()) return;
    const int row = model_.row_at(model_.cur);
    if (decode(table(), out.data()) != model_.rows[size_t(row)]) complaint_ = "row delivered";
    if (TEV8R1_convert_row("t", model_.cur) != row) complaint_ = "convert";
  }
  static std::string row_buffer() { return std::string(size_t(table().row_wid) + 1, '\0'); }
  void next_row() {
    std::string out = row_buffer();
    delivered("next row", model_.at_position(model_.next, PF_NOMORE),
              TEV8R1_PF_get_next_row("t", out.data()), out);
  }
  void row_by_pos() {
    std::string out = row_buffer();
    const int pos = below(model_.count() + 2) - 1;
    delivered("row at " + std::to_string(pos), model_.at_position(pos, PF_BADPOS),
              TEV8R1_PF_get_row_by_pos("t", pos, out.data()), out);
  }
  void reset() {
    model_.cur = -1;
    model_.next = 0;
    expect("reset", {}, TEV8R1_PF_reset_table("t"));
  }
  void row_by_value() {
    if (chance(40)) reset();
    const int column = model_.search >= 0 && chance(60) ? model_.search : any_column();
    const Column& c = model_.col(column);
    const int mode = below(3);
    const Value key = random_key(column);
    std::string out = row_buffer();
    delivered(
        "row by value " + as_text(c, key), model_.by_value(mode, column, key),
        TEV8R1_PF_get_row_by_value("t", std::int8_t(mode), c.def.name, key.c_str(), out.data()),
        out);
  }
  void get_value() {
    const Value key = random_key(0);
    const int column = any_column();
    const TEVPF_COL_DEF& def = model_.col(column).def;
    Model searched = model_;
    searched.next = 0;
    const Result expected = searched.by_value(0, 0, key);
    std::string out(size_t(def.width) + 9, '\0');
    expect("get value for " + as_text(model_.col(0), key), expected,
           TEV8R1_PF_get_value("t", def.name, key.c_str(), out.data()));
    if (expected.failed()) return;
    const Value& found = searched.at(searched.row_at(searched.cur), column);
    if (load_value(def, out.data()) != found) complaint_ = "value found";
  }
  void define_search() {
    const int column = any_column();
    const TEVPF_COL_DEF& def = model_.col(column).def;
    if (def.idx_flag) model_.search = column;
    expect("define search", def.idx_flag ? Result{} : Result{PF_BADSEARCH, {def.name, ""}},
           TEV8R1_PF_define_table_search("t", def.name));
  }
  void set_defaults() {
    const Row row = random_row();
    const Result expected = model_.interactive ? Result{} : model_.check_row(row, -2);
    if (!expected.failed()) model_.defaults = row;
    expect("set defaults", expected, TEV8R1_PF_set_dft_row("t", image(table(), row).data()));
    std::string out = row_buffer();
    TEV8R1_PF_inq_dft_row("t", out.data());
    if (decode(table(), out.data()) != model_.defaults) complaint_ = "default row read";
  }
  void interactive() {
    model_.interactive = !model_.interactive && chance(30);
    expect("interactive", {},
           model_.interactive ? TEV8R1_set_interactive_table("t") : TEV8R1_turn_off_interactive());
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
    def.idx_flag = std::int8_t(chance(60));
    def.unq_flag = std::int8_t(chance(30));
    return {def, bounds, is_floating_type(type) ? std::pow(10.0, -(bounds.precision + 1)) : 0, {}};
  }
  int random_type() { return kInt + below(5); }
  Bounds random_bounds() {
    const double min = below(3);
    return {min, below(3) + (chance(80) ? 200.0 : 5.0), 1 + below(4)};
  }
  void define_column() {
    if (model_.columns.size() > 6) return;
    const Column c = random_column(random_type(), random_bounds());
    expect(std::string("define ") + c.def.name, model_.define(c), TEV8R1_PF_def_column("t", c.def));
  }
  void redefine_column() {
    if (model_.columns.empty()) return;
    const int place = any_column();
    const Column old = model_.col(place);
    const int type = chance(model_.rows.empty() ? 50 : 10) ? random_type() : old.def.type;
    Bounds bounds = random_bounds();
    if (chance(60) && type == old.def.type) {
      bounds = {old.bounds.min, old.bounds.max, chance(40) ? 1 + below(4) : old.bounds.precision};
    }
    Column c = random_column(type, bounds);
    if (chance(70)) std::strcpy(c.def.name, old.def.name);
    if (c.is_text() && !model_.rows.empty()) c.def.width = old.def.width;
    if (chance(60)) c.def.idx_flag = old.def.idx_flag;
    expect(std::string("redefine ") + old.def.name, model_.redefine(place, c),
           redefine(old.def.name, c.def));
  }
  void delete_column() {
    const int place = any_column();
    const std::string name = model_.col(place).def.name;
    model_.remove_column(place);
    expect("delete " + name, {}, TEV8R1_PF_delete_col("t", name.c_str()));
  }
  void move_column() {
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
    save_and_reopen();
    last_ = "reopen";
    model_.cur = model_.search = -1;
    model_.next = model_.free_rows = model_.free_cols = 0;
    model_.reset_defaults();
    for (Column& c : model_.columns) c.def.spare = 0;  // never stored
  }
  void column_values() {
    const int column = any_column();
    const TEVPF_COL_DEF& def = model_.col(column).def;
    const auto size = size_t(value_size(def.type, def.width));
    std::string out(size * model_.rows.size() + 1, '\0');
    expect("column values", {model_.rows.empty() ? PF_NOMORE : PF_NORMAL},
           TEV8R1_PF_get_col_values("t", def.name, out.data()));
    for (int i = 0; i < model_.count(); ++i) {
      if (load_value(def, &out[size_t(i) * size]) != model_.at(i, column)) complaint_ = "values";
    }
  }
  void check_value() {
    const int column = any_column();
    const Value value = random_key(column);
    const Column& c = model_.col(column);
    expect("check " + as_text(c, value), model_.check_value(column, value),
           TEV8R1_validate_row_value("t", c.def.name, value.c_str()));
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
}  // namespace tevpf
