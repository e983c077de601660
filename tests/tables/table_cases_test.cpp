// What random sequences do not reach: tolerances and patterns in tables of cases, the probes of a
// search, values that are no numbers, limits of counts, and every allocation of every operation failing.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdio>
#include <functional>
#include <limits>

#include "core/directory.h"
#include "core/heap.h"
#include "core/library.h"
#include "support/error_texts.h"
#include "support/table_check.h"
#include "tables/column_index.h"
#include "tables/cursor.h"
#include "tables/rows.h"

namespace {

using tevpf_test::broken_rule;

constexpr auto kLess = static_cast<TEVPF_STATUS>(-1);
constexpr TEVPF_STATUS kGreater = 1;
const double kNan = std::numeric_limits<double>::quiet_NaN();
const double kInfinity = std::numeric_limits<double>::infinity();

// The status and both texts that a call leaves.
#define EXPECT_REFUSED(call, status, ...)               \
  do {                                                  \
    set_error_texts();                                  \
    EXPECT_EQ(call, TEVPF_STATUS{status});              \
    EXPECT_EQ(error_texts(), (ErrorTexts __VA_ARGS__)); \
  } while (0)

// ---- Values --------------------------------------------------------------------------------------

TEST(CompareTest, RealsWithinTheToleranceAreEqual) {
  const struct {
    double a, b, tolerance;
    TEVPF_STATUS answer;
  } kCases[] = {
      {1.00000005, 1.0, 1e-7, PF_NORMAL}, {1.0000002, 1.0, 1e-7, kGreater},
      {0.9999998, 1.0, 1e-7, kLess},      {1.5, 1.0, 0.5, PF_NORMAL},
      {1.0, 1.5, 0.5, PF_NORMAL},         {2.0, 1.0, 0, kGreater},
      {-0.0, 0.0, 0, PF_NORMAL},          {kNan, 1.0, 1e-7, PF_NORMAL},
      {1.0, kNan, 0, PF_NORMAL},          {kInfinity, kInfinity, 0.5, PF_NORMAL},
      {-kInfinity, 3, 0.5, kLess},        {1.0, 2.0, -5, kLess},
  };
  for (const auto& c : kCases) {
    const auto a = static_cast<float>(c.a), b = static_cast<float>(c.b);
    EXPECT_EQ(TEV8R1_compare(PF_TYPE_DOUBLE, &c.a, &c.b, c.tolerance), c.answer) << c.a << c.b;
    if (c.tolerance > 1e-6) {
      EXPECT_EQ(TEV8R1_compare(PF_TYPE_REAL, &a, &b, c.tolerance), c.answer) << c.a << c.b;
    }
  }
  const std::int32_t five = 5, seven = 7;
  EXPECT_EQ(TEV8R1_compare(PF_TYPE_INT, &five, &seven, 100), kLess);
  const std::int16_t minus = -1, one = 1;
  EXPECT_EQ(TEV8R1_compare(PF_TYPE_SHORT, &one, &minus, 100), kGreater);
  EXPECT_REFUSED(TEV8R1_compare(16, &five, &seven, 0), PF_BADTYPE, {"value", "16"});
  EXPECT_REFUSED(TEV8R1_compare(10, &five, &seven, 0), PF_BADTYPE, {"value", "10"});
}

// Through the index of a wide and of a narrow column and through the search on its own, which must
// give the same: the column holds the texts in order, the key is found at `pos` or belongs there.
TEST(SearchTest, TextsAndPrefixes) {
  static const char* const kTexts[] = {"",         "A",         "AB",         "ABCDEFG",
                                       "ABCDEFGH", "ABCDEFGHI", "ABCDEFGHIJ", "ABCDEFGHIJ",
                                       "B*x",      "\xE9t\xE9"};
  constexpr std::int32_t kCount = std::size(kTexts);
  static const struct {
    const char* key;
    bool found;
    std::int32_t pos;
  } kCases[] = {
      {"", true, 0},
      {"A", true, 1},
      {"AB*", true, 2},
      {"ABC", false, 3},
      {"ABCDEFGH", true, 4},
      {"ABCDEFGHI", true, 5},
      {"ABCDEFGHIJ", true, 6},
      {"ABCDEFGHIJK", false, 8},
      {"ABCDEFGHI*", true, 5},
      {"ABCDEFGH*", true, 4},
      {"ABCDEFGHZ*", false, 8},
      {"*", true, 0},
      {"B*x", true, 8},
      {"B**", false, 8},
      {"B*", true, 8},
      {"\xE9*", true, 9},
      {"z", false, 9},
      {"\xFF", false, 10},
  };
  for (const std::int32_t width : {11, 16}) {
    TEVPF_COLUMN column{};
    column.def.type = PF_TYPE_STRING;
    column.def.width = width;
    TEVPF_TABLE table{};
    table.row_wid = width + 1;
    table.num_rows = kCount;
    std::vector<unsigned char> rows(std::size_t(kCount * table.row_wid), 0xAA);
    std::vector<std::int32_t> index;
    for (std::int32_t i = 0; i < kCount; ++i) {  // stored in reverse
      index.push_back(kCount - 1 - i);
      std::strcpy(reinterpret_cast<char*>(&rows[std::size_t(index.back() * table.row_wid)]),
                  kTexts[i]);
    }
    table.row_data = rows.data();
    column.idx_ptr = index.data();
    for (const auto& c : kCases) {
      std::int32_t pos = -1;
      const TEVPF_STATUS expected = c.found ? PF_NORMAL : PF_NOTFOUND;
      EXPECT_EQ(tevpf::search_index(table, column, 0, kCount, c.key, pos), expected) << c.key;
      EXPECT_EQ(pos, c.pos) << c.key;
      pos = -1;
      EXPECT_EQ(TEV8R1_binary_search(PF_TYPE_STRING, 0, kCount, table.row_wid, index.data(),
                                     rows.data(), c.key, &pos),
                expected)
          << c.key;
      EXPECT_EQ(pos, c.pos) << c.key;
    }
  }
}

TEST(SearchTest, ProbesOfNumbers) {
  static const struct {
    std::vector<double> values;
    double tolerance, key;
    TEVPF_STATUS status;
    std::int32_t pos;
  } kCases[] = {
      {{}, 0, 1, PF_NOTFOUND, 0},
      {{10, 20, 20, 30}, 0, 20, PF_NORMAL, 1},
      {{10, 20, 20, 30}, 0, 25, PF_NOTFOUND, 3},
      {{10, 20, 20, 30}, 0, 40, PF_NOTFOUND, 4},
      {{10, 20, 20, 30}, 0, 5, PF_NOTFOUND, 0},
      // Equality chains: the step back ends at the first entry that is less.
      {{0, 0.6, 1.2, 1.8, 2.4}, 1, 1.5, PF_NORMAL, 1},
      // An entry that is equal stands in front of one that is less: only the probes count.
      {{0.9, 0, 1.75}, 1, 1.85, PF_NORMAL, 2},
      // What is not a number equals everything.
      {{1, 2, kNan, kNan, 9}, 0, 5, PF_NORMAL, 2},
      {{1, 2, 3}, 0, kNan, PF_NORMAL, 0},
  };
  for (const auto& c : kCases) {
    const auto count = static_cast<std::int32_t>(c.values.size());
    std::vector<std::int32_t> index(c.values.size());
    for (std::int32_t i = 0; i < count; ++i) index[std::size_t(i)] = i;
    std::int32_t pos = -1;
    EXPECT_EQ(TEV8R1_binary_search(PF_TYPE_DOUBLE, c.tolerance, count, 8, index.data(),
                                   c.values.data(), &c.key, &pos),
              c.status)
        << c.key;
    EXPECT_EQ(pos, c.pos) << c.key;
    if (c.tolerance != 0 || std::isnan(c.key) ||
        std::isnan(c.values.empty() ? 0 : c.values.back()) ||
        (count == 5 && std::isnan(c.values[2]))) {
      continue;
    }
    const std::vector<std::int32_t> numbers(c.values.begin(), c.values.end());
    const auto key = static_cast<std::int32_t>(c.key);
    EXPECT_EQ(
        TEV8R1_binary_search(PF_TYPE_INT, 0, count, 4, index.data(), numbers.data(), &key, &pos),
        c.status);
    EXPECT_EQ(pos, c.pos) << c.key;
  }
  std::int32_t pos = -7;
  const std::int32_t zero = 0;
  EXPECT_REFUSED(TEV8R1_binary_search(16, 0, 1, 4, &zero, &zero, &zero, &pos), PF_CMPFAIL,
                 {kUntouched});
  EXPECT_EQ(pos, -7);
}

// ---- Tables --------------------------------------------------------------------------------------

class TableTest : public testing::Test {
 protected:
  void SetUp() override {
    path_ = testing::TempDir() + "tevpf_table_cases";
    std::remove(path_.c_str());
    ASSERT_EQ(TEV8R1_PF_open(path_.c_str()), PF_NEWFILE);
    ASSERT_EQ(TEV8R1_PF_create_elem("t", "", PF_ELEM_TABLE), PF_NORMAL);
  }
  void TearDown() override {
    TEV8R1_turn_off_interactive();
    TEV8R1_PF_set_memory_allocation(0, 0);
    EXPECT_EQ(TEV8R1_PF_close(0), PF_NORMAL);
    std::remove(path_.c_str());
  }

  static TEVPF_TABLE& table() {
    TEVPF_TABLE* table = nullptr;
    EXPECT_EQ(TEV8R1_get_table_ptr("t", &table), PF_NORMAL);
    return *table;
  }
  static TEVPF_COL_DEF definition(const char* name, int type, int width, bool indexed,
                                  bool unique) {
    TEVPF_COL_DEF def{};
    std::snprintf(def.name, sizeof def.name, "%s", name);
    def.type = type;
    def.width = width;
    def.idx_flag = indexed;
    def.unq_flag = unique;
    if (type == PF_TYPE_INT) def.limits.i32 = {1000000, 0};
    if (type == PF_TYPE_DOUBLE) def.limits.f64 = {10, 0, 6};
    return def;
  }
  static void define(const char* name, int type, int width, bool indexed, bool unique) {
    const TEVPF_COL_DEF def = definition(name, type, width, indexed, unique);
    ASSERT_EQ(TEV8R1_PF_def_column("t", def), PF_NORMAL);
  }
  template <class T>
  static TEVPF_STATUS add(T value) {
    std::vector<unsigned char> row(std::size_t(table().row_wid));
    std::memcpy(row.data(), &value, sizeof value);
    return TEV8R1_PF_add_row("t", row.data());
  }
  static TEVPF_STATUS add_text(const char* text) {
    std::vector<char> row(std::size_t(table().row_wid));
    std::strncpy(row.data(), text, row.size());
    return TEV8R1_PF_add_row("t", row.data());
  }
  static std::vector<std::int32_t> index(int column = 0) {
    const std::int32_t* entries = table().col_array[column].idx_ptr;
    return {entries, entries + table().num_rows};
  }

  std::string path_;
};

using Rows = std::vector<std::int32_t>;

TEST_F(TableTest, BoundsHoldGiveOrTakeTheTolerance) {
  define("d", PF_TYPE_DOUBLE, 8, false, false);
  EXPECT_EQ(add(10.00000005), PF_NORMAL);
  EXPECT_EQ(add(-0.00000005), PF_NORMAL);
  EXPECT_EQ(add(kNan), PF_NORMAL);
  EXPECT_REFUSED(add(10.0000002), PF_RANGE, {"10", ""});
  EXPECT_REFUSED(add(-kInfinity), PF_RANGE, {"-inf", ""});
}

TEST_F(TableTest, APatternIsADuplicateOfWhatItMatches) {
  define("name", PF_TYPE_STRING, 300, true, true);
  EXPECT_EQ(add_text("ABC"), PF_NORMAL);
  EXPECT_REFUSED(add_text("AB*"), PF_DUPLICATE, {"value AB*", "column name"});
  EXPECT_EQ(tevpf::library.dup_row, 0);
  EXPECT_EQ(add_text("AB"), PF_NORMAL);
  const std::string longest(300, 'x');
  EXPECT_EQ(add_text(longest.c_str()), PF_NORMAL);
  EXPECT_REFUSED(add_text(longest.c_str()), PF_DUPLICATE,
                 {("value " + longest).substr(0, 256), "column name"});
  EXPECT_EQ(tevpf::library.dup_row, 2);
  // The duplicate passes as a default row, but its context stays.
  std::vector<char> row(std::size_t(table().row_wid));
  std::strcpy(row.data(), "A*");
  EXPECT_REFUSED(TEV8R1_PF_set_dft_row("t", row.data()), PF_NORMAL, {"value A*", "column name"});
}

// Stored patterns stand in front of what they match and can part equal texts; what is nearby is still
// found by single steps.
TEST_F(TableTest, StoredPatternsStandInFront) {
  define("name", PF_TYPE_STRING, 8, true, false);
  for (const char* text : {"A", "A*", "A", "A", "A"}) EXPECT_EQ(add_text(text), PF_NORMAL);
  EXPECT_EQ(index(), (Rows{4, 3, 2, 1, 0}));
  std::int32_t pos = -1;
  const TEVPF_TABLE& t = table();
  EXPECT_EQ(tevpf::search_index(t, t.col_array[0], 0, 5, "A", pos), PF_NORMAL);
  EXPECT_EQ(pos, 0);
}

TEST_F(TableTest, AnIndexBuiltIsOrderedExactly) {
  define("d", PF_TYPE_DOUBLE, 8, false, false);
  TEV8R1_set_interactive_table("t");
  for (const double d : {3.0, kNan, -0.0, 1.00000004, 0.0, 1.0, kInfinity, -kInfinity}) add(d);
  TEVPF_COL_DEF def = table().col_array[0].def;
  def.idx_flag = 1;
  def.limits.f64 = {kInfinity, -kInfinity, 6};
  ASSERT_EQ(TEV8R1_PF_modify_col_def("t", "d", def), PF_NORMAL);
  EXPECT_EQ(index(), (Rows{7, 2, 4, 5, 3, 0, 6, 1}));
  EXPECT_GE(table().col_array[0].index_room, table().num_rows + table().free_rows);

  // The sort's comparison speaks of the column whose index was built last, within its tolerance.
  TEVPF_COLUMN& column = table().col_array[0];
  ASSERT_EQ(TEV8R1_create_index(&table(), &column), PF_NORMAL);
  const std::int32_t low = 7, near = 3, one = 5, high = 0;
  EXPECT_LT(TEV8R1_sort_comp(&low, &high), 0);
  EXPECT_GT(TEV8R1_sort_comp(&high, &near), 0);
  EXPECT_EQ(TEV8R1_sort_comp(&near, &one), 0);
}

TEST_F(TableTest, WithoutRowsAndColumns) {
  char row[8];
  std::int32_t value = 7, number = 0;
  void* pointer = row;
  EXPECT_REFUSED(TEV8R1_PF_get_value("t", "x", &value, &value), PF_NORMAL, {kUntouched});
  EXPECT_EQ(value, 7);
  EXPECT_REFUSED(TEV8R1_PF_get_row_by_value("t", 0, "x", &value, row), PF_NOTFOUND, {});
  EXPECT_REFUSED(TEV8R1_PF_get_col_values("t", "x", row), PF_NOMORE, {kUntouched});
  EXPECT_REFUSED(TEV8R1_PF_get_row_by_pos("t", 0, row), PF_BADPOS, {"0", "0"});
  EXPECT_EQ(TEV8R1_get_next_row_ptr(&table(), &pointer, &number), PF_NORMAL);
  EXPECT_EQ(pointer, nullptr);
  EXPECT_EQ(TEV8R1_convert_row("t", -5), -5);
  EXPECT_EQ(TEV8R1_convert_row("other", 3), -1);
  EXPECT_REFUSED(TEV8R1_set_interactive_table("other"), PF_NOELEM, {"table", "other"});
  EXPECT_EQ(tevpf::library.interactive, 0);
  define("a", PF_TYPE_INT, 5, true, false);
  EXPECT_REFUSED(TEV8R1_PF_get_value("t", "x", &value, &value), PF_NOTFOUND, {});
  add(std::int32_t{4});
  value = 4;
  EXPECT_REFUSED(TEV8R1_PF_get_value("t", "x", &value, &number), PF_NOCOLUMN, {"x", ""});
}

TEST_F(TableTest, SlotsAreCountedInTheSetIncrementsUpToTheLargestCount) {
  define("a", PF_TYPE_INT, 5, true, false);
  for (std::int32_t i = 0; i < 26; ++i) {
    EXPECT_EQ(add(i), PF_NORMAL);
    EXPECT_EQ(table().free_rows, i < 25 ? 24 - i : 9);
  }
  TEV8R1_PF_set_memory_allocation(0, 100000);
  table().free_rows = 0;
  EXPECT_EQ(TEV8R1_get_space(&table()), PF_NORMAL);
  EXPECT_EQ(table().free_rows, 32767);
  std::int32_t row;
  EXPECT_EQ(TEV8R1_PF_get_next_row("t", &row), PF_NORMAL);
  EXPECT_EQ(TEV8R1_PF_delete_row("t"), PF_NORMAL);
  EXPECT_EQ(table().free_rows, 32767);
  EXPECT_STREQ(broken_rule(table()), nullptr);
}

// A row that came in unchecked and cannot be inserted again stays where it was, entries included.
TEST_F(TableTest, AMoveThatIsRefusedChangesNothing) {
  define("a", PF_TYPE_INT, 5, true, true);
  for (const std::int32_t i : {5, 6, 7}) add(i);
  TEV8R1_set_interactive_table("t");
  for (const std::int32_t i : {6, -1}) add(i);
  TEV8R1_turn_off_interactive();
  const Rows before = index();
  const std::int16_t free_rows = table().free_rows;
  EXPECT_REFUSED(TEV8R1_PF_move_row("t", 4, 0), PF_RANGE, {"-1", ""});
  EXPECT_REFUSED(TEV8R1_PF_move_row("t", 1, PF_END_POS), PF_DUPLICATE, {"value 6", "column a"});
  EXPECT_EQ(tevpf::library.dup_row, 2);  // as the rows were without it
  EXPECT_EQ(index(), before);
  EXPECT_EQ(table().free_rows, free_rows);
  EXPECT_STREQ(broken_rule(table()), nullptr);
}

// ---- Memory --------------------------------------------------------------------------------------

// Everything that an operation that ran out of memory must leave as it was; the two element
// directories' order included.
std::string snapshot() {
  TEVPF_TABLE* t = nullptr;
  std::string all;
  for (const char* name : {"t", "copy"}) {
    if (TEV8R1_get_table_ptr(name, &t) != PF_NORMAL) continue;
    all.append(reinterpret_cast<const char*>(&t->header), sizeof t->header);
    for (const int n : {t->num_cols, t->num_rows, t->row_wid, t->dsp_wid, int{t->free_rows},
                        t->cur_row, t->next_row, int{t->mod}, int{t->extra_bytes},
                        t->cur_col == nullptr ? -1 : int(t->cur_col - t->col_array)}) {
      all += std::to_string(n) + ",";
    }
    const auto append = [&](const unsigned char* bytes, std::int64_t count) {
      all.append(reinterpret_cast<const char*>(bytes), std::size_t(count));
    };
    append(t->row_data, std::int64_t{t->num_rows} * t->row_wid);
    append(t->dft_row, t->row_wid);
    for (int i = 0; i < t->num_cols; ++i) {
      TEVPF_COLUMN column = t->col_array[i];
      if (column.def.description != nullptr) all += column.def.description;
      if (column.idx_ptr != nullptr) {
        append(reinterpret_cast<unsigned char*>(column.idx_ptr), 4 * std::int64_t{t->num_rows});
      }
      column.idx_ptr = nullptr;
      column.index_room = 0;
      column.def.description = nullptr;
      append(reinterpret_cast<unsigned char*>(&column), sizeof column);
    }
  }
  return all;
}

class TableMemoryTest : public TableTest {
 protected:
  // An indexed unique number, an indexed text and a double; `rows` rows, no spare slot.
  void fill(int rows) {
    TEV8R1_PF_delete_table("t");
    TEV8R1_PF_delete_table("copy");
    ASSERT_EQ(TEV8R1_PF_create_elem("t", "", PF_ELEM_TABLE), PF_NORMAL);
    define("a", PF_TYPE_INT, 5, true, true);
    define("s", PF_TYPE_STRING, 10, true, false);
    define("d", PF_TYPE_DOUBLE, 5, false, false);
    TEV8R1_PF_set_memory_allocation(rows, 2);
    for (int i = 0; i < rows; ++i) ASSERT_EQ(add(std::int32_t{i * 7 % 50}), PF_NORMAL);
    TEV8R1_PF_define_table_search("t", "s");
    std::int32_t row[16];
    if (rows > 0) {
      ASSERT_EQ(TEV8R1_PF_get_row_by_pos("t", rows / 2, row), PF_NORMAL);
    }
  }
  // A row whose text has no terminator.
  static std::vector<unsigned char> open_row() {
    std::vector<unsigned char> row(std::size_t(table().row_wid), 'x');
    const std::int32_t number = 999;
    const double d = 1;
    std::memcpy(row.data(), &number, sizeof number);
    std::memcpy(row.data() + table().col_array[2].offset, &d, sizeof d);
    return row;
  }
};

TEST_F(TableMemoryTest, EveryAllocationOfEveryOperationFailsOnce) {
  TEVPF_COL_DEF plain = definition("new", PF_TYPE_STRING, 9, false, false);
  TEVPF_COL_DEF indexed = definition("new", PF_TYPE_INT, 9, true, false);
  TEVPF_COL_DEF changed = definition("d2", PF_TYPE_DOUBLE, 6, true, false);
  char description[] = "described";
  plain.description = changed.description = description;
  const struct {
    const char* name;
    int rows;
    int least;  // allocations that it makes at least
    std::function<TEVPF_STATUS()> run;
  } kOperations[] = {
      {"first row", 0, 3, [] { return TEV8R1_PF_add_row("t", open_row().data()); }},
      {"add", 9, 1, [] { return add(std::int32_t{999}); }},
      {"insert", 9, 2, [] { return TEV8R1_PF_add_row_by_pos("t", open_row().data(), 3); }},
      {"replace", 9, 1, [] { return TEV8R1_PF_replace_row("t", open_row().data()); }},
      {"default row", 9, 1, [] { return TEV8R1_PF_set_dft_row("t", open_row().data()); }},
      {"move", 9, 2,
       [] {
         table().cur_col = nullptr;
         const TEVPF_STATUS status = TEV8R1_PF_move_row("t", 1, 7);
         table().cur_col = table().col_array + 1;
         return status;
       }},
      {"define", 9, 2, [&] { return TEV8R1_PF_def_column("t", plain); }},
      {"define indexed", 9, 2, [&] { return TEV8R1_PF_def_column("t", indexed); }},
      {"redefine", 9, 3, [&] { return TEV8R1_PF_modify_col_def("t", "d", changed); }},
      {"delete column", 9, 1, [] { return TEV8R1_PF_delete_col("t", "a"); }},
      {"move column", 9, 4, [] { return TEV8R1_PF_move_col("t", "d", "a"); }},
      {"copy", 9, 5, [] { return TEV8R1_PF_copy_table("t", "copy"); }},
      {"search", 9, 0, [] { return TEV8R1_PF_define_table_search("t", "a"); }},
      {"delete row", 9, 0, [] { return TEV8R1_PF_delete_row("t"); }},
  };
  for (const auto& operation : kOperations) {
    std::int64_t n = 0;
    for (;; ++n) {
      ASSERT_NO_FATAL_FAILURE(fill(operation.rows));
      const std::string before = snapshot();
      tevpf::heap_fail_at(n);
      const TEVPF_STATUS status = operation.run();
      const bool failed = tevpf::heap_fail_off();
      ASSERT_STREQ(broken_rule(table()), nullptr) << operation.name << ", allocation " << n;
      if (!failed) {
        EXPECT_EQ(status, PF_NORMAL) << operation.name;
        break;
      }
      ASSERT_EQ(status, PF_NOMEM) << operation.name << ", allocation " << n;
      EXPECT_EQ(error_texts(), kEmpty);
      ASSERT_EQ(snapshot(), before) << operation.name << ", allocation " << n;
    }
    EXPECT_GE(n, operation.least) << operation.name;
    RecordProperty(operation.name, static_cast<int>(n));
  }
}

}  // namespace
