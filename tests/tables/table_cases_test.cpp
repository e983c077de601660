// What random sequences do not reach: tolerances and patterns in tables of cases, the probes of a
// search, values that are no numbers, and limits of counts.
#include <cmath>
#include <limits>

#include "support/table_fixture.h"
#include "tables/cursor.h"
#include "tables/rows.h"

namespace tevpf {
namespace {

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
      EXPECT_EQ(search_index(table, column, 0, kCount, c.key, pos), expected) << c.key;
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

class Rows : public TableTest {
 protected:
  template <class T>
  static TEVPF_STATUS add(T value) {
    std::vector<unsigned char> row(std::size_t(table().row_wid));
    std::memcpy(row.data(), &value, sizeof value);
    return TEV8R1_PF_add_row("t", row.data());
  }
  static TEVPF_STATUS add_text(const std::string& text) {
    std::vector<char> row(std::size_t(table().row_wid));
    text.copy(row.data(), row.size() - 1);
    return TEV8R1_PF_add_row("t", row.data());
  }
};

using Order = std::vector<int>;

TEST_F(Rows, BoundsHoldGiveOrTakeTheTolerance) {
  define({col("d", kDouble, 8, {0, 10})});
  EXPECT_EQ(add(10.00000005), PF_NORMAL);
  EXPECT_EQ(add(-0.00000005), PF_NORMAL);
  EXPECT_EQ(add(kNan), PF_NORMAL);
  EXPECT_REFUSED(add(10.0000002), PF_RANGE, {"10", ""});
  EXPECT_REFUSED(add(-kInfinity), PF_RANGE, {"-inf", ""});
}

TEST_F(Rows, APatternIsADuplicateOfWhatItMatches) {
  define({indexed(col("name", kText, 300), true)});
  EXPECT_EQ(add_text("ABC"), PF_NORMAL);
  EXPECT_REFUSED(add_text("AB*"), PF_DUPLICATE, {"value AB*", "column name"});
  EXPECT_EQ(library.dup_row, 0);
  EXPECT_EQ(add_text("AB"), PF_NORMAL);
  const std::string longest(300, 'x');
  EXPECT_EQ(add_text(longest), PF_NORMAL);
  EXPECT_REFUSED(add_text(longest), PF_DUPLICATE,
                 {("value " + longest).substr(0, 256), "column name"});
  EXPECT_EQ(library.dup_row, 2);
  // The duplicate passes as a default row, but its context stays.
  std::vector<char> row(std::size_t(table().row_wid));
  std::strcpy(row.data(), "A*");
  EXPECT_REFUSED(TEV8R1_PF_set_dft_row("t", row.data()), PF_NORMAL, {"value A*", "column name"});
}

// Stored patterns stand in front of what they match and can part equal texts: the first equal one is
// that of the run which the probes hit.
TEST(SearchTest, AStoredPatternPartsEqualTexts) {
  const char rows[][3] = {"A", "A", "A*", "A", "A", "A", "A", "A"};
  const std::int32_t index[] = {0, 1, 2, 3, 4, 5, 6, 7};
  std::int32_t pos = -1;
  EXPECT_EQ(TEV8R1_binary_search(PF_TYPE_STRING, 0, 8, 3, index, rows, "A", &pos), PF_NORMAL);
  EXPECT_EQ(pos, 3);
  EXPECT_EQ(TEV8R1_binary_search(PF_TYPE_STRING, 0, 8, 3, index, rows, "A*", &pos), PF_NORMAL);
  EXPECT_EQ(pos, 0);
}

TEST_F(Rows, AnIndexBuiltIsOrderedExactly) {
  define({col("d", kDouble, 8, {0, 10})});
  TEV8R1_set_interactive_table("t");
  for (const double d : {3.0, -kNan, -0.0, 1.00000004, 0.0, 1.0, kInfinity, -kInfinity}) add(d);
  TEVPF_COL_DEF def = table().col_array[0].def;
  def.idx_flag = 1;
  def.limits.f64 = {kInfinity, -kInfinity, 6};
  ASSERT_EQ(TEV8R1_PF_modify_col_def("t", "d", def), PF_NORMAL);
  EXPECT_EQ(order(0), (Order{7, 2, 4, 5, 3, 0, 6, 1}));
  EXPECT_GE(table().col_array[0].index_room, table().num_rows + table().free_rows);

  // The sort's comparison speaks of the column whose index was built last, within its tolerance.
  TEVPF_COLUMN& column = table().col_array[0];
  ASSERT_EQ(TEV8R1_create_index(&table(), &column), PF_NORMAL);
  const std::int32_t low = 7, near = 3, one = 5, high = 0;
  EXPECT_LT(TEV8R1_sort_comp(&low, &high), 0);
  EXPECT_GT(TEV8R1_sort_comp(&high, &near), 0);
  EXPECT_EQ(TEV8R1_sort_comp(&near, &one), 0);
}

TEST_F(Rows, WithoutRowsAndColumns) {
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
  EXPECT_EQ(library.interactive, 0);
  define({indexed(col("a", kInt, 5, {0, 1e6}))});
  EXPECT_REFUSED(TEV8R1_PF_get_value("t", "x", &value, &value), PF_NOTFOUND, {});
  add(std::int32_t{4});
  value = 4;
  EXPECT_REFUSED(TEV8R1_PF_get_value("t", "x", &value, &number), PF_NOCOLUMN, {"x", ""});
}

TEST_F(Rows, SlotsAreCountedInTheSetIncrementsUpToTheLargestCount) {
  define({indexed(col("a", kInt, 5, {0, 1e6}))});
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
  EXPECT_EQ(TEV8R1_PF_move_row("t", 0, 3), PF_NORMAL);
  EXPECT_EQ(table().free_rows, 32767);
  TEV8R1_PF_set_memory_allocation(0, 0);
}

// A row that came in unchecked and cannot be inserted again stays where it was, entries included.
TEST_F(Rows, AMoveThatIsRefusedChangesNothing) {
  define({indexed(col("a", kInt, 5, {0, 1e6}), true)});
  for (const std::int32_t i : {5, 6, 7}) add(i);
  TEV8R1_set_interactive_table("t");
  for (const std::int32_t i : {6, -1}) add(i);
  TEV8R1_turn_off_interactive();
  const Order before = order(0);
  const std::int16_t free_rows = table().free_rows;
  EXPECT_REFUSED(TEV8R1_PF_move_row("t", 4, 0), PF_RANGE, {"-1", ""});
  EXPECT_REFUSED(TEV8R1_PF_move_row("t", 1, PF_END_POS), PF_DUPLICATE, {"value 6", "column a"});
  EXPECT_EQ(library.dup_row, 2);  // as the rows were without it
  EXPECT_EQ(order(0), before);
  EXPECT_EQ(table().free_rows, free_rows);
}

}  // namespace
}  // namespace tevpf
