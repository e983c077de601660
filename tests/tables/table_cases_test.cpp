// What random sequences do not reach: tolerances in tables of cases, the probes of a search, stored
// patterns, values that are no numbers, and limits of counts.
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

TEST_F(Rows, SlotsAreCountedUpToTheLargestCount) {
  define({indexed(col("a", kInt, 5, {0, 1e6}))});
  for (std::int32_t i = 0; i < 3; ++i) EXPECT_EQ(add(i), PF_NORMAL);
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

}  // namespace
}  // namespace tevpf
