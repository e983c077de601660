// Columns that come, change, move and go while the table holds rows.
#include <cmath>
#include <functional>

#include "reports/formats.h"
#include "support/table_fixture.h"
#include "tables/layout.h"

namespace tevpf {
namespace {

class Columns : public TableTest {
 protected:
  // Number (indexed), name (described), real (indexed; the search column), three rows.
  static void fill() {
    define({indexed(col("n", kInt)), described(col("name", kText, 4), "a name"),
            indexed(col("r", kReal, 8, {-10, 10, 2}))});
    add_rows({{"30", "c", "0.5"}, {"10", "a", "0.5004"}, {"20", "bb", "-1"}});
    ASSERT_OK(TEV8R1_PF_define_table_search("t", "r"));
  }
};

TEST_F(Columns, LieBehindEachOtherWhateverTheDetour) {
  const struct {
    std::vector<std::int32_t> types;  // below 10: a string of that width
    std::vector<std::int32_t> offsets;
    std::int32_t row_wid, mod, extra_bytes;
  } cases[] = {
      {{5, kInt}, {0, 8}, 12, 4, 0},
      {{kShort, 2, kDouble}, {0, 2, 8}, 16, 8, 0},
      {{kDouble, kShort, kInt}, {0, 8, 12}, 16, 8, 0},
      {{kDouble, 1, 1, kShort, kShort}, {0, 8, 10, 12, 14}, 16, 8, 0},
      {{kInt, 1, 2}, {0, 4, 6}, 12, 4, 3},
      {{2, kShort, 1, kReal, 9}, {0, 4, 6, 8, 12}, 24, 4, 2},
      {{1, 1, 1}, {0, 2, 4}, 6, 0, 0},
  };
  for (const auto& [types, offsets, row_wid, mod, extra_bytes] : cases) {
    new_table();
    for (std::size_t i = 0; i < types.size(); ++i) {
      const std::string name = "c" + std::to_string(i);
      const bool is_text = types[i] < 10;
      define({col(name.c_str(), is_text ? kText : types[i], is_text ? types[i] : 6, {0, 1})});
      if (i == 0) add_rows({{"1"}, {"0"}});
    }
    const std::string rows = rows_text();
    define({col("detour", kDouble)});
    ASSERT_OK(TEV8R1_PF_move_col("t", "detour", "c0"));
    ASSERT_OK(TEV8R1_PF_move_col("t", "c0", nullptr));
    ASSERT_OK(TEV8R1_PF_delete_col("t", "detour"));
    ASSERT_OK(TEV8R1_PF_move_col("t", "c0", "c1"));
    EXPECT_EQ(rows_text(), rows);
    for (std::size_t i = 0; i < types.size(); ++i) {
      EXPECT_EQ(column(static_cast<int>(i)).offset, offsets[i]);
    }
    EXPECT_EQ(table().row_wid, row_wid);
    EXPECT_EQ(table().mod, mod);
    EXPECT_EQ(table().extra_bytes, extra_bytes);
  }

  std::int16_t extra = 6, mod = 8;
  std::int32_t pad = 0;
  TEVPF_COLUMN column{};
  EXPECT_EQ(TEV8R1_adjust_col(16, kInt, 4, &extra, &mod, &column, &pad), PF_NORMAL);
  EXPECT_EQ(column.offset, 12);
  EXPECT_EQ(pad, -4);
  EXPECT_EQ(extra, 0);
}

TEST_F(Columns, DefiningGivesEveryRowTheMinimum) {
  TEVPF_COL_DEF def = described(col("n", kInt, 6, {3, 9}), "");
  def.unq_flag = def.desc_byte = def.spare_byte = 5;
  def.spare = 77;
  define({def});
  EXPECT_EQ(table().free_cols, 2);
  EXPECT_EQ(column(0).desc_flag, 15);
  EXPECT_EQ(column(0).def.unq_flag, 0);
  EXPECT_EQ(column(0).def.spare_byte, 0);
  EXPECT_EQ(column(0).def.spare, 77u);
  add_rows({{"4"}, {"5"}, {"4"}});
  EXPECT_EQ(table().free_rows, 22);

  define({indexed(col("s", kShort, 6, {-7, 9})), col("text", kText, 4),
          indexed(col("d", kDouble, 6, {0.25, 9}))});
  EXPECT_EQ(table().free_cols, 2);
  EXPECT_EQ(table().free_rows, 0);
  EXPECT_EQ(rows_text(), "4 -7  0.25/5 -7  0.25/4 -7  0.25");
  EXPECT_EQ(default_text(), "3 -7  0.25");
  EXPECT_EQ(table().header.btf, 24 + 57 + 52 + 48 + 68);
  EXPECT_EQ(table().dsp_wid, 0);
  EXPECT_EQ(order(1), (std::vector<int>{0, 1, 2}));
  EXPECT_EQ(order(3), (std::vector<int>{0, 1, 2}));

  // A redefinition takes the flags as they come; set without an index, unq_flag is never judged.
  def.description = nullptr;
  ASSERT_OK(redefine("n", def));
  EXPECT_EQ(column(0).desc_flag, 0);
  ASSERT_OK(redefine("n", indexed(def, true)));
  EXPECT_EQ(order(0), (std::vector<int>{0, 2, 1}));
}

struct Refusal {
  const char* column;
  TEVPF_COL_DEF def;
  TEVPF_STATUS status;
  ErrorTexts texts;
};

const double kNan = std::nan("");

TEST_F(Columns, RefusedDefinitionsChangeNothing) {
  fill();
  const Refusal define_refusals[] = {
      {"blank first", col(" n", kInt, 0), PF_BADNAME, kEmpty},
      {"duplicate before range", col("n", kInt, 0, {5, 4}), PF_DUPLICATE, {"column n", "table t"}},
      {"unique with rows", indexed(col("x", 99, 0), true), PF_BADUNIQUE, kEmpty},
      {"type", col("x", 16, 0), PF_BADTYPE, {"column", "16"}},
      {"range", col("x", kShort, 0, {5, 4}), PF_BADRANGE, {"5", ""}},
      {"real range", col("x", kReal, 0, {1.5, 1.25}), PF_BADRANGE, {"1.5", ""}},
      {"real bound no number", col("x", kReal, 5, {1, kNan}), PF_BADRANGE, {"1", ""}},
      {"double bound no number", col("x", kDouble, 5, {kNan, 1, 0}), PF_BADPREC, {"0", "x"}},
      {"precision before width", col("x", kReal, 0, {1, 1, -2}), PF_BADPREC, {"-2", "x"}},
      {"width", col("x", kInt, 0), PF_BADWIDTH, {"0", "x"}},
      {"too wide", col("x", kText, INT32_MAX), PF_BADWIDTH, {"2147483647", "x"}},
      {"too wide with others", col("x", kText, INT32_MAX - 8), PF_BADWIDTH, {"2147483639", "x"}},
  };
  std::string before = snapshot();
  for (const auto& [label, def, status, texts] : define_refusals) {
    SCOPED_TRACE(label);
    EXPECT_EQ(TEV8R1_PF_def_column("t", def), status);
    EXPECT_EQ(error_texts(), texts);
    EXPECT_EQ(snapshot(), before);
  }

  define({col("same", kText, 3)});
  const Refusal redefine_refusals[] = {
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
  before = snapshot();
  for (const auto& [name, def, status, texts] : redefine_refusals) {
    SCOPED_TRACE(testing::Message() << name << " to " << def.name << ", " << status);
    set_error_texts();
    EXPECT_EQ(redefine(name, def), status);
    EXPECT_EQ(error_texts(), texts);
    EXPECT_EQ(snapshot(), before);
  }
  EXPECT_EQ(index_entries(column(3)), nullptr);
}

TEST_F(Columns, RedefiningKeepsRowsAndRebuildsTheDefaultRow) {
  fill();
  const std::string zeros(static_cast<std::size_t>(table().row_wid), '\0');
  ASSERT_OK(TEV8R1_PF_set_dft_row("t", zeros.data()));
  const std::string rows = rows_text();

  // 0.5004 stood in front of 0.5 as its equal; a finer tolerance tells them apart.
  EXPECT_EQ(order(2), (std::vector<int>{2, 1, 0}));
  TEVPF_COL_DEF real = indexed(col("ratio", kReal, 9, {-1, 10, 4}));
  real.description = const_cast<char*>("longer than before");
  ASSERT_OK(redefine("r", real));
  EXPECT_EQ(order(2), (std::vector<int>{2, 0, 1}));
  EXPECT_EQ(column(2).tolerance, 1e-5);
  EXPECT_STREQ(column(2).def.description, real.description);
  EXPECT_EQ(table().cur_col, &column(2));
  EXPECT_EQ(rows_text(), rows);
  EXPECT_EQ(default_text(), "-1000  -1");

  real.unq_flag = 1;
  ASSERT_OK(redefine("ratio", real));
  real.idx_flag = 0;
  ASSERT_OK(redefine("ratio", real));
  EXPECT_EQ(table().cur_col, nullptr);
  EXPECT_EQ(index_entries(column(2)), nullptr);
}

TEST_F(Columns, FormatsAreRemadeWhereTheirWidthChangesInInteractiveMode) {
  fill();
  ASSERT_OK(TEV8R1_make_table_format(&table()));
  EXPECT_STREQ(column(0).format, "%6d");
  EXPECT_STREQ(column(1).format, "%-4s");
  EXPECT_STREQ(column(2).format, "%8.2g");
  EXPECT_EQ(table().dsp_wid, 6 + 2 + 4 + 2 + 8 + 1);
  ASSERT_OK(redefine("n", col("n", kInt, 7)));
  ASSERT_OK(TEV8R1_set_interactive_table("t"));
  ASSERT_OK(redefine("n", col("long number", kInt, 7)));
  EXPECT_STREQ(column(0).format, "%6d");
  ASSERT_OK(redefine("long number", col("long number", kInt, 8)));
  EXPECT_STREQ(column(0).format, "%11d");
  EXPECT_EQ(table().dsp_wid, 11 + 2 + 4 + 2 + 8 + 1);
  ASSERT_OK(redefine("r", col("r", kReal, INT32_MAX, {-10, 10, INT32_MAX})));
  EXPECT_STREQ(column(2).format, "%2147483647.2147483647g");
  EXPECT_EQ(table().dsp_wid, INT32_MAX);

  // Without rows a column may change its type, and its format has to be made anew.
  new_table();
  define({col("n", kInt), col("s", kShort)});
  ASSERT_OK(TEV8R1_make_table_format(&table()));
  ASSERT_OK(redefine("n", col("n", kText)));
  EXPECT_STREQ(column(0).format, "");
  EXPECT_EQ(column(1).offset, 8);
}

TEST_F(Columns, RowsIndexesAndSearchFollowTheirColumns) {
  fill();
  ASSERT_OK(TEV8R1_PF_move_col("t", "r", "n"));
  EXPECT_EQ(rows_text(), "0.5 30 c/0.5004 10 a/-1 20 bb");
  EXPECT_EQ(table().cur_col, &column(0));
  EXPECT_EQ(table().free_cols, 0);
  EXPECT_EQ(table().free_rows, 0);
  define({col("d", kDouble, 6, {7, 7}), col("s", kShort, 6, {1, 2})});
  ASSERT_OK(TEV8R1_PF_move_col("t", "n", "s"));
  ASSERT_OK(TEV8R1_PF_move_col("t", "r", nullptr));
  EXPECT_EQ(rows_text(), "c 7 30 1 0.5/a 7 10 1 0.5004/bb 7 20 1 -1");
  EXPECT_EQ(default_text(), " 7 -1000 1 -10");

  ASSERT_OK(TEV8R1_PF_delete_col("t", "d"));
  EXPECT_EQ(rows_text(), "c 30 1 0.5/a 10 1 0.5004/bb 20 1 -1");
  EXPECT_EQ(default_text(), " -1000 1 -10");
  EXPECT_EQ(table().cur_col, &column(3));
  EXPECT_EQ(table().dsp_wid, 4 + 2 + 6 + 2 + 6 + 2 + 8 + 1);
  EXPECT_EQ(order(1), (std::vector<int>{1, 2, 0}));
  add_rows({{"dd", "15", "2", "0"}});
  char row[64];
  ASSERT_OK(TEV8R1_PF_get_next_row("t", row));
  EXPECT_EQ(text_of(table(), row), "bb 20 1 -1");

  for (const char* name : {"r", "n", "s", "name"}) {
    ASSERT_OK(TEV8R1_PF_delete_col("t", name));
    EXPECT_EQ(table().cur_col, nullptr);
  }
  EXPECT_EQ(table().num_rows, 0);
  EXPECT_EQ(table().dsp_wid, 0);
  EXPECT_EQ(TEV8R1_PF_get_next_row("t", row), PF_NOMORE);
  EXPECT_EQ(TEV8R1_PF_delete_row("t"), PF_NOCURROW);
  define({indexed(col("n", kInt), true)});
  add_rows({{"2"}, {"1"}});
  EXPECT_EQ(rows_text(), "2/1");
}

TEST_F(Columns, SpareRowSlotsGoWhenTheLayoutChanges) {
  const std::function<TEVPF_STATUS()> changes[] = {
      [] { return TEV8R1_PF_def_column("t", indexed(col("new", kDouble))); },
      [] { return redefine("n", indexed(col("n", kDouble))); },
      [] { return TEV8R1_PF_delete_col("t", "name"); },
      [] { return TEV8R1_PF_move_col("t", "n", nullptr); },
  };
  for (const auto& change : changes) {
    new_table();
    define({indexed(col("n", kInt)), col("name", kText, 3), col("s", kShort)});
    const std::string bad(static_cast<std::size_t>(table().row_wid), '\x7f');
    EXPECT_EQ(TEV8R1_PF_add_row("t", bad.data()), PF_RANGE);
    ASSERT_OK(redefine("n", indexed(col("n", kInt, 9))));
    EXPECT_EQ(table().free_rows, 25);  // a redefinition that changes no place keeps them
    ASSERT_OK(change());
    EXPECT_EQ(table().free_rows, 0);
    const std::string row(static_cast<std::size_t>(table().row_wid), '\0');
    for (int i = 0; i < 40; ++i) ASSERT_OK(TEV8R1_PF_add_row("t", row.data()));
    EXPECT_EQ(table().num_rows, 40);
  }
}

TEST_F(Columns, MovesAreShownWhenDebugging) {
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

TEST_F(Columns, CopiesAndInquiriesShareNothing) {
  char(*names)[TEVPF_NAME_SIZE] = nullptr;
  std::int32_t* offsets = nullptr;
  std::int32_t count = -1, type = 0;
  ASSERT_OK(TEV8R1_PF_inq_col_names("t", &count, &names));
  EXPECT_EQ(count, 0);
  EXPECT_EQ(names, nullptr);

  fill();
  ASSERT_OK(TEV8R1_PF_set_col_dft("t", described(col("x", kText, 40), "template")));
  ASSERT_OK(TEV8R1_PF_copy_table("t", "copy"));
  new_table();
  const TEVPF_TABLE& copy = table("copy");
  EXPECT_EQ(rows_text("copy"), "30 c 0.5/10 a 0.5004/20 bb -1");
  EXPECT_EQ(copy.cur_col, &copy.col_array[2]);
  EXPECT_EQ(copy.free_rows + copy.free_cols, 0);

  ASSERT_OK(TEV8R1_PF_inq_col_names("copy", &count, &names));
  ASSERT_OK(TEV8R1_PF_inq_col_offsets("copy", &count, &offsets));
  ASSERT_OK(TEV8R1_get_col_type("copy", "r", &type));
  EXPECT_EQ(count, 3);
  EXPECT_STREQ(names[1], "name");
  EXPECT_EQ(offsets[2], 12);
  EXPECT_EQ(type, kReal);
  std::free(names);
  std::free(offsets);

  TEVPF_COL_DEF def{};
  ASSERT_OK(TEV8R1_PF_inq_col_def("copy", "name", &def));
  def.description[0] = 'A';
  EXPECT_STREQ(copy.col_array[1].def.description, "a name");
  std::free(def.description);
  EXPECT_EQ(TEV8R1_PF_inq_col_def_by_pos("copy", 3, &def), PF_BADPOS);
  EXPECT_EQ(error_texts(), (ErrorTexts{"3", "3"}));
  EXPECT_EQ(TEV8R1_PF_inq_col_dft("copy", 16, &def), PF_BADTYPE);
  EXPECT_EQ(error_texts(), (ErrorTexts{"function call", "16"}));
  const std::int32_t widths[] = {11, 13, 40, 23, 6};
  for (std::int32_t i = 0; i < 5; ++i) {
    ASSERT_OK(TEV8R1_PF_inq_col_dft("copy", kInt + i, &def));
    EXPECT_EQ(def.width, widths[i]);
    EXPECT_STREQ(def.description, i == 2 ? "template" : nullptr);
    std::free(def.description);
  }
  EXPECT_EQ(def.limits.i16.min, -32768);
}

}  // namespace
}  // namespace tevpf
