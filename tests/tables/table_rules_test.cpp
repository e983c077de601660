// Single rules of tables that random sequences do not reach: refused definitions, formats, tolerances
// and values that are no numbers, the probes of a search, stored patterns, and limits of counts.
#include <algorithm>
#include <limits>
#include <numeric>
#include <random>

#include "support/table_fixture.h"
#include "tables/columns.h"
#include "tables/cursor.h"
#include "tables/formats.h"
#include "tables/layout.h"
#include "tables/rows.h"

namespace tevpf {
namespace {

constexpr auto kLess = static_cast<TEVPF_STATUS>(-1);
constexpr TEVPF_STATUS kGreater = 1;
const double kNan = std::numeric_limits<double>::quiet_NaN();
const double kInfinity = std::numeric_limits<double>::infinity();

class TableRules : public TableTest {
 protected:
  // Number (indexed), name (described), real (indexed; the search column), three rows.
  static void fill() {
    define({indexed(col("n", kInt)), described(col("name", kText, 4), "a name"),
            indexed(col("r", kReal, 8, {-10, 10, 2}))});
    ASSERT_OK(add({"30", "c", "0.5"}));
    ASSERT_OK(add({"10", "a", "0.5004"}));
    ASSERT_OK(add({"20", "bb", "-1"}));
    ASSERT_OK(TEV8R1_PF_define_table_search("t", "r"));
  }
};

// ---- Columns -------------------------------------------------------------------------------------

TEST_F(TableRules, PlaceBehindARowThatIsPadded) {
  std::int16_t extra = 6, mod = 8;
  std::int32_t pad = 0;
  TEVPF_COLUMN column{};
  EXPECT_EQ(TEV8R1_adjust_col(16, kInt, 4, &extra, &mod, &column, &pad), PF_NORMAL);
  EXPECT_EQ(column.offset, 12);
  EXPECT_EQ(pad, -4);
  EXPECT_EQ(extra, 0);
}

TEST_F(TableRules, NothingOfAColumnThatIsDeletedStays) {
  define({col("a", kInt), col("b", kDouble), col("c", PF_TYPE_SHORT)});
  EXPECT_EQ(add({"1", "2", "3"}), PF_NORMAL);
  EXPECT_EQ(TEV8R1_PF_delete_col("t", "a"), PF_NORMAL);
  const TEVPF_TABLE& t = settled();
  ASSERT_EQ(t.row_wid, 16);
  EXPECT_EQ(std::string(t.row_data + 10, t.row_data + 16), std::string(6, '\0'));
}

TEST_F(TableRules, RefusedDefinitionsChangeNothing) {
  fill();
  define({col("same", kText, 3)});
  const struct {
    const char* changed;  // null: a new column
    TEVPF_COL_DEF def;
    TEVPF_STATUS status;
    ErrorTexts texts;
  } kRefusals[] = {
      {nullptr, col(" n", kInt, 0), PF_BADNAME, kEmpty},
      {nullptr, col("n", kInt, 0, {5, 4}), PF_DUPLICATE, {"column n", "table t"}},
      {nullptr, indexed(col("x", 99, 0), true), PF_BADUNIQUE, kEmpty},
      {nullptr, col("x", 16, 0), PF_BADTYPE, {"column", "16"}},
      {nullptr, col("x", PF_TYPE_SHORT, 0, {5, 4}), PF_BADRANGE, {"5", ""}},
      {nullptr, col("x", kReal, 0, {1.5, 1.25}), PF_BADRANGE, {"1.5", ""}},
      {nullptr, col("x", kReal, 5, {1, kNan}), PF_BADRANGE, {"1", ""}},
      {nullptr, col("x", kDouble, 5, {kNan, 1, 0}), PF_BADPREC, {"0", "x"}},
      {nullptr, col("x", kReal, 0, {1, 1, -2}), PF_BADPREC, {"-2", "x"}},
      {nullptr, col("x", kInt, 0), PF_BADWIDTH, {"0", "x"}},
      {nullptr, col("x", kText, INT32_MAX), PF_BADWIDTH, {"2147483647", "x"}},
      {nullptr, col("x", kText, INT32_MAX - 23), PF_BADWIDTH, {"2147483624", "x"}},  // by a byte
      {"x", col("n", kInt), PF_NOCOLUMN, {"x", ""}},
      {"n", col(" m", kText), PF_BADNAME, kEmpty},
      {"n", col("r", kText), PF_DUPLICATE, {"column r", "table t"}},
      {"n", col("n", 99), PF_TYPECHG, kUntouched},
      {"n", col("n", kInt, 6, {21, 20}), PF_BADRANGE, {"21", ""}},
      {"r", col("r", kReal, 6, {1, 2, 0}), PF_BADPREC, {"0", "r"}},
      {"n", col("n", kInt, 6, {0, 29}), PF_RANGE, {"30", ""}},
      {"r", col("r", kReal, 6, {0.6, 1, 2}), PF_RANGE, {"0.5", ""}},
      {"n", col("n", kInt, 0, {11, 20}), PF_BADWIDTH, {"30", ""}},  // as the value check left it
      {"n", col("n", kInt, 0), PF_BADWIDTH, kUntouched},
      {"name", col("name", kText, 5), PF_BADCOLCHG, kEmpty},
      {"name", col("name", kText, 0), PF_BADCOLCHG, kEmpty},
      {"r", indexed(col("r", kReal, 8, {-10, 10, 6}), true), PF_NOTUNIQUE, kEmpty},
      {"same", indexed(col("same", kText, 3), true), PF_NOTUNIQUE, kEmpty},
  };
  const std::string before = snapshot(true);
  for (const auto& [name, def, status, texts] : kRefusals) {
    SCOPED_TRACE(testing::Message() << (name ? name : "new") << " to " << def.name << status);
    expect_answer(name ? redefine(name, def) : TEV8R1_PF_def_column("t", def), status, texts);
    EXPECT_EQ(snapshot(true), before);
  }
  EXPECT_EQ(index_entries(column(3)), nullptr);
}

TEST_F(TableRules, SizesBeyond31BitsAreRefusedBeforeAnythingChanges) {
  define({col("n", kInt), col("name", kText, 4)});
  TEVPF_TABLE& record = table();
  const ErrorTexts width_and_name{"2147483647", "name"};
  record.header.btf = INT32_MAX - 5;
  const std::string before = snapshot(true);
  heap_fail_above(1 << 20);
  expect_answer(redefine("name", col("name", kText, INT32_MAX)), PF_BADWIDTH, width_and_name);
  expect_answer(TEV8R1_PF_def_column("t", col("another", kText)), PF_NOMEM, kEmpty);
  expect_answer(redefine("name", described(col("name", kText, 4), "about")), PF_NOMEM, kEmpty);
  EXPECT_TRUE(snapshot(true) == before);
  ASSERT_OK(redefine("name", described(col("name", kText, 4), "text")));
  EXPECT_EQ(record.header.btf, INT32_MAX);
  record.col_array[1].def.width = INT32_MAX;
  expect_answer(TEV8R1_PF_move_col("t", "name", "n"), PF_BADWIDTH, width_and_name);
  heap_fail_above(UINT64_MAX);
}

TEST_F(TableRules, FormatsAreRemadeWhereTheirWidthChangesInInteractiveMode) {
  fill();
  ASSERT_OK(TEV8R1_make_table_format(&table()));
  ASSERT_OK(TEV8R1_set_interactive_table("t"));
  ASSERT_OK(redefine("n", col("long number", kInt)));
  EXPECT_STREQ(column(0).format, "%6d");
  EXPECT_STREQ(column(1).format, "%-4s");
  ASSERT_OK(redefine("long number", col("long number", kInt, 8)));
  EXPECT_STREQ(column(0).format, "%11d");
  ASSERT_OK(redefine("r", col("r", kReal, INT32_MAX, {-10, 10, INT32_MAX})));
  EXPECT_STREQ(column(2).format, "%2147483647.2147483647g");
  EXPECT_EQ(table().dsp_wid, INT32_MAX);
  ASSERT_OK(TEV8R1_PF_delete_col("t", "r"));
  EXPECT_EQ(table().dsp_wid, 11 + 2 + 4 + 1);

  // Without rows a column may change its type, and its format has to be made anew.
  new_table();
  define({col("n", kInt)});
  ASSERT_OK(TEV8R1_make_table_format(&table()));
  ASSERT_OK(redefine("n", col("n", kText)));
  EXPECT_STREQ(column(0).format, "");
}

TEST_F(TableRules, MovesAreShownWhenDebugging) {
  fill();
  library.debug_value = "";
  testing::internal::CaptureStdout();
  EXPECT_EQ(TEV8R1_PF_move_col("t", "r", "n"), PF_NORMAL);
  EXPECT_EQ(TEV8R1_PF_move_col("t", "r", "x"), PF_NOCOLUMN);
  library.debug_value = nullptr;
  EXPECT_EQ(testing::internal::GetCapturedStdout(),
            "0. name = n type=11  size = 4  new_pos = 1\n"
            "1. name = name type=13  size = 5  new_pos = 2\n"
            "2. name = r type=12  size = 4  new_pos = 0\n");
}

TEST_F(TableRules, InquiriesHandOutCopies) {
  char(*names)[TEVPF_NAME_SIZE] = nullptr;
  std::int32_t *offsets = nullptr, count = -1;
  ASSERT_OK(TEV8R1_PF_inq_col_names("t", &count, &names));
  EXPECT_EQ(count, 0);
  EXPECT_EQ(names, nullptr);

  fill();
  ASSERT_OK(TEV8R1_PF_set_col_dft("t", described(col("x", kText, 40), "template")));
  ASSERT_OK(TEV8R1_PF_copy_table("t", "copy"));
  new_table();
  ASSERT_OK(TEV8R1_PF_inq_col_names("copy", &count, &names));
  ASSERT_OK(TEV8R1_PF_inq_col_offsets("copy", &count, &offsets));
  EXPECT_EQ(count, 3);
  EXPECT_STREQ(names[1], "name");
  EXPECT_EQ(offsets[2], 12);
  std::free(names);
  std::free(offsets);

  TEVPF_COL_DEF def{};
  ASSERT_OK(TEV8R1_PF_inq_col_def("copy", "name", &def));
  def.description[0] = 'A';
  EXPECT_STREQ(table("copy").col_array[1].def.description, "a name");
  std::free(def.description);
  expect_answer(TEV8R1_PF_inq_col_def_by_pos("copy", 3, &def), PF_BADPOS, {"3", "3"});
  expect_answer(TEV8R1_PF_inq_col_dft("copy", 16, &def), PF_BADTYPE, {"function call", "16"});
  const std::int32_t widths[] = {11, 13, 40, 23, 6};
  for (std::int32_t i = 0; i < 5; ++i) {
    ASSERT_OK(TEV8R1_PF_inq_col_dft("copy", kInt + i, &def));
    EXPECT_EQ(def.width, widths[i]);
    EXPECT_STREQ(def.description, i == 2 ? "template" : nullptr);
    std::free(def.description);
  }
  EXPECT_EQ(def.limits.i16.min, -32768);
  ASSERT_OK(TEV8R1_get_col_type("copy", "r", &count));
  EXPECT_EQ(count, kReal);
}

// ---- Values and searches --------------------------------------------------------------------------

TEST_F(TableRules, RealsWithinTheToleranceAreEqual) {
  const std::int32_t five = 5, seven = 7;
  const std::int16_t minus = -1, plus = 1;
  const float half = 0.5F, one = 1;
  EXPECT_EQ(TEV8R1_compare(kInt, &five, &seven, 100), kLess);
  EXPECT_EQ(TEV8R1_compare(PF_TYPE_SHORT, &plus, &minus, 100), kGreater);
  EXPECT_EQ(TEV8R1_compare(kReal, &half, &one, 0.5), PF_NORMAL);
  EXPECT_EQ(TEV8R1_compare(kReal, &one, &half, 0.5), PF_NORMAL);
  EXPECT_EQ(TEV8R1_compare(kReal, &half, &one, -5), kLess);
  EXPECT_EQ(TEV8R1_compare(kDouble, &kNan, &kInfinity, 0), PF_NORMAL);
  EXPECT_EQ(TEV8R1_compare(kDouble, &kInfinity, &kInfinity, 0.5), PF_NORMAL);
  expect_answer(TEV8R1_compare(16, &five, &seven, 0), PF_BADTYPE, {"value", "16"});
  expect_answer(TEV8R1_compare(10, &five, &seven, 0), PF_BADTYPE, {"value", "10"});

  // In every search too: with an index, without one, and through search keys.
  define({indexed(col("with", kDouble, 8, {0, 20, 1})), col("without", kDouble, 8, {0, 20, 1})});
  for (double n = 0; n < 13; ++n) {
    const double row[] = {n, n};
    ASSERT_OK(TEV8R1_PF_add_row("t", row));
  }
  for (const char* name : {"with", "without"}) {
    TEV8R1_PF_define_table_search("t", std::strcmp(name, "with") == 0 ? name : nullptr);
    for (int i = 0; i < 13 * 4; ++i) {
      const double steps[] = {1, -1, 1.1, -1.1}, key = i / 4 + steps[i % 4] * column(0).tolerance;
      double row[2] = {-1, -1};
      TEV8R1_PF_reset_table("t");
      TEV8R1_PF_get_row_by_value("t", 0, name, &key, row);
      EXPECT_EQ(row[0], i % 4 < 2 ? i / 4 : -1) << name << key;
    }
  }
}

// What is not a number equals everything: the first equal one is that of the run which the probes hit.
TEST_F(TableRules, ProbesOfWhatHasNoOrder) {
  const double numbers[] = {1, 2, kNan, kNan, 9}, five = 5;
  const char texts[][3] = {"9", "A", "A", "A", "A", "AA", "AB", "B"};
  const std::int32_t index[] = {0, 1, 2, 3, 4, 5, 6, 7};
  const struct {
    std::int32_t type, count, size;
    const void *rows, *key;
    TEVPF_STATUS status;
    std::int32_t pos;
  } kCases[] = {
      {kDouble, 5, 8, numbers, &five, PF_NORMAL, 2},
      {kDouble, 5, 8, numbers, &kNan, PF_NORMAL, 0},
      {kDouble, 0, 8, numbers, &five, PF_NOTFOUND, 0},
      {kText, 8, 3, texts, "A", PF_NORMAL, 1},
      {kText, 8, 3, texts, "A*", PF_NORMAL, 1},
      {kText, 8, 3, texts, "AA*", PF_NORMAL, 5},
      {16, 5, 8, numbers, &five, PF_CMPFAIL, -7},
  };
  for (const auto& [type, count, size, rows, key, status, expected] : kCases) {
    std::int32_t pos = -7;
    expect_answer(TEV8R1_binary_search(type, 0, count, size, index, rows, key, &pos), status,
                  kUntouched);
    EXPECT_EQ(pos, expected);
  }
}

// ---- Rows ----------------------------------------------------------------------------------------

TEST_F(TableRules, APatternIsADuplicateOfWhatItMatches) {
  define({indexed(col("name", kText, 300), true)});
  const std::string longest(300, 'x');
  EXPECT_EQ(add({"ABC"}), PF_NORMAL);
  expect_answer(add({"AB*"}), PF_DUPLICATE, {"value AB*", "column name"});
  expect_answer(TEV8R1_validate_row_value("t", "name", "A*"), PF_DUPLICATE,
                {"value A*", "column name"});
  EXPECT_EQ(add({"AB"}), PF_NORMAL);
  EXPECT_EQ(add({longest.c_str()}), PF_NORMAL);
  expect_answer(add({longest.c_str()}), PF_DUPLICATE,
                {("value " + longest).substr(0, 256), "column name"});
  EXPECT_EQ(library.dup_row, 2);
}

TEST_F(TableRules, AnIndexBuiltIsOrderedExactly) {
  define({col("d", kDouble, 8, {0, 10})});
  const auto add_number = [](double d) { return TEV8R1_PF_add_row("t", &d); };
  expect_answer(add_number(-kInfinity), PF_RANGE, {"-inf", ""});
  expect_answer(add_number(kNan), PF_NORMAL);
  TEV8R1_set_interactive_table("t");
  for (const double d : {3.0, 0.0, 1.00000004, -0.0, 1.0, kInfinity, -kInfinity, -kNan}) {
    add_number(d);
  }
  const TEVPF_COL_DEF everything = indexed(col("d", kDouble, 8, {-kInfinity, kInfinity}));
  ASSERT_OK(redefine("d", everything));
  EXPECT_EQ(order(0), (std::vector{7, 2, 4, 5, 3, 1, 6, 0, 8}));

  // The sort's comparison speaks of the column whose index was built last, within its tolerance.
  ASSERT_OK(TEV8R1_create_index(&table(), &column(0)));
  const std::int32_t low = 7, near = 3, one = 5, high = 1;
  EXPECT_LT(TEV8R1_sort_comp(&low, &high), 0);
  EXPECT_GT(TEV8R1_sort_comp(&high, &near), 0);
  EXPECT_EQ(TEV8R1_sort_comp(&near, &one), 0);

  new_table();  // texts alike in what is compared first, eight characters
  define({col("text", kText, 20)});
  for (const char* text :
       {"12345678c", "12345678", "12345678b", "12345678c", "1234567", "12345678a"})
    ASSERT_OK(add({text}));
  ASSERT_OK(redefine("text", indexed(col("text", kText, 20))));
  EXPECT_EQ(order(0), (std::vector{4, 1, 5, 2, 0, 3}));
}

TEST_F(TableRules, ARowLeavesAnIndexOfAnyLength) {
  std::mt19937 random(4);
  for (const std::int32_t count : {1, 2, 63, 64, 65, 129, 200}) {
    std::vector<std::int32_t> index(static_cast<std::size_t>(count));
    std::iota(index.begin(), index.end(), 0);
    std::shuffle(index.begin(), index.end(), random);
    for (std::int32_t row = 0; row <= count; ++row) {  // the last one is not in it
      SCOPED_TRACE(testing::Message() << row << " of " << count);
      std::vector<std::int32_t> some = index, expected;
      for (const std::int32_t entry : index)
        if (entry != row) expected.push_back(entry - (entry > row ? 1 : 0));
      EXPECT_EQ(TEV8R1_remove_index(some.data(), row, count), PF_NORMAL);
      some.resize(expected.size());
      ASSERT_EQ(some, expected);

      some.push_back(-1);
      expected.insert(expected.begin() + std::min(row, count - 1), row);
      EXPECT_EQ(TEV8R1_insert_index_value(some.data(), static_cast<std::int32_t>(some.size()) - 1,
                                          std::min(row, count - 1), row),
                PF_NORMAL);
      ASSERT_EQ(some, expected);
    }
  }
}

TEST_F(TableRules, WithoutRowsAndColumns) {
  char row[8];
  std::int32_t value = 7, number = 0;
  void* pointer = row;
  expect_answer(TEV8R1_PF_get_value("t", "x", &value, &value), PF_NORMAL);
  EXPECT_EQ(value, 7);
  expect_answer(TEV8R1_PF_get_row_by_value("t", 0, "x", &value, row), PF_NOTFOUND, kEmpty);
  expect_answer(TEV8R1_PF_get_col_values("t", "x", row), PF_NOMORE, kUntouched);
  EXPECT_EQ(TEV8R1_get_next_row_ptr(&table(), &pointer, &number), PF_NORMAL);
  EXPECT_EQ(pointer, nullptr);
  EXPECT_EQ(TEV8R1_convert_row("t", -5), -5);
  EXPECT_EQ(TEV8R1_convert_row("other", 3), -1);
  expect_answer(TEV8R1_get_cur_row_ptr(&table(), &pointer, &number), PF_NOCURROW, kEmpty);
  define({indexed(col("a", kInt))});
  expect_answer(TEV8R1_create_index(&table(), &column(0)), PF_NORMAL, kUntouched);
  EXPECT_EQ(table().row_wid, 4);
  expect_answer(TEV8R1_adjust_data(&table(), 4, 4, 0, &column(0).def), PF_NORMAL, kUntouched);
  EXPECT_EQ(table().row_wid, 4);
  expect_answer(TEV8R1_PF_get_value("t", "x", &value, &value), PF_NOTFOUND, kEmpty);
  EXPECT_EQ(add({"7"}), PF_NORMAL);
  expect_answer(TEV8R1_PF_get_value("t", "x", &value, &number), PF_NOCOLUMN, {"x", ""});
  expect_answer(TEV8R1_PF_move_row("t", 0, 0), PF_BADPOS, {"0", "1"});
}

// Equal values of a column that need not be unique are no fault until somebody asks.
TEST_F(TableRules, EqualValuesAreFoundInAnIndexOnly) {
  define({indexed(col("a", kInt)), col("b", kInt)});
  const auto ask = [&](int i) { return TEV8R1_check_unique_values(&table(), &column(i)); };
  ASSERT_OK(add({"7", "1"}));
  expect_answer(ask(0), PF_NORMAL, kUntouched);
  ASSERT_OK(add({"8", "1"}));
  expect_answer(ask(0), PF_NORMAL, kUntouched);
  ASSERT_OK(add({"7", "1"}));
  expect_answer(ask(0), PF_NOTUNIQUE, kEmpty);
  expect_answer(ask(1), PF_NORMAL, kUntouched);
}

TEST_F(TableRules, SearchKeysChangeNoAnswer) {
  define({indexed(col("a", kInt)), col("b", kInt)});
  for (const char* n : {"0", "1", "2", "3", "4", "5", "6", "7", "8"})
    EXPECT_EQ(add({n, n}), PF_NORMAL);
  // What is written through the pointer to a row is found, also when the column was searched before.
  std::int32_t row[2], number = 0, key = 99;
  void* pointer = nullptr;
  for (int i = 0; i < 3; ++i)
    EXPECT_EQ(TEV8R1_PF_get_row_by_value("t", 0, "b", &key, row), PF_NOTFOUND);
  EXPECT_NE(column(1).keys.values, nullptr);
  EXPECT_EQ(TEV8R1_get_next_row_ptr(&table(), &pointer, &number), PF_NORMAL);
  std::memcpy(static_cast<char*>(pointer) + column(1).offset, &key, sizeof key);
  EXPECT_EQ(TEV8R1_PF_get_row_by_value("t", 0, "b", &key, row), PF_NORMAL);
}

// A file's index is taken in any order, and stored texts may end in "*": searches then find one row or
// another, but they end, stay within the table and change nothing.
TEST_F(TableRules, SearchesOfAnIndexOutOfOrderEnd) {
  define({indexed(col("n", kInt)), indexed(col("text", kText, 2))});
  for (const char* n : {"0", "1", "2", "3", "4", "5", "6", "7", "8"})
    EXPECT_EQ(add({n, n[0] % 2 ? "A*" : "A"}), PF_NORMAL);
  std::swap(column(0).idx_ptr[1], column(0).idx_ptr[6]);
  const auto before = std::pair(order(0), order(1));
  char row[8];
  for (const char* name : {"n", "text"}) {
    TEV8R1_PF_define_table_search("t", name);
    for (int i = 0; i < 60; ++i) {
      const std::int32_t number = i % 10;
      const void* const key = *name == 'n' ? static_cast<const void*>(&number) : i % 2 ? "A" : "A*";
      TEV8R1_PF_reset_table("t");
      const TEVPF_STATUS status = TEV8R1_PF_get_row_by_value("t", i % 3 == 0, name, key, row);
      EXPECT_TRUE(status == PF_NORMAL || status == PF_NOTFOUND);
      EXPECT_LT(table().cur_row, 9);
    }
  }
  EXPECT_EQ(std::pair(order(0), order(1)), before);
}

// The width of a definition is not the business of this check: it judges values alone.
TEST_F(TableRules, ColumnValuesAreJudgedWhateverTheWidth) {
  define({col("n", kInt)});
  for (const char* n : {"5", "7"}) EXPECT_EQ(add({n}), PF_NORMAL);
  const TEVPF_COL_DEF narrow = col("n", kInt, 0, {0, 6});
  expect_answer(TEV8R1_check_column_values(&settled(), 0, narrow, 0), PF_RANGE, {"7", ""});
  expect_answer(redefine("n", narrow), PF_BADWIDTH, {"7", ""});
}

TEST_F(TableRules, SlotsAreCountedUpToTheLargestCount) {
  define({indexed(col("a", kInt))});
  for (const char* n : {"0", "1", "2"}) EXPECT_EQ(add({n}), PF_NORMAL);
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
}

}  // namespace
}  // namespace tevpf
