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

TEST_F(Columns, PlaceBehindARowThatIsPadded) {
  std::int16_t extra = 6, mod = 8;
  std::int32_t pad = 0;
  TEVPF_COLUMN column{};
  EXPECT_EQ(TEV8R1_adjust_col(16, kInt, 4, &extra, &mod, &column, &pad), PF_NORMAL);
  EXPECT_EQ(column.offset, 12);
  EXPECT_EQ(pad, -4);
  EXPECT_EQ(extra, 0);
}

// What a caller leaves in the bytes of a definition that are not his.
TEST_F(Columns, SpareFieldsOfDefinitions) {
  TEVPF_COL_DEF def = described(col("n", kInt, 6, {3, 9}), "");
  def.unq_flag = def.desc_byte = def.spare_byte = 5;
  def.spare = 77;
  define({def});
  EXPECT_EQ(column(0).desc_flag, 15);
  EXPECT_EQ(column(0).def.unq_flag, 0);
  EXPECT_EQ(column(0).def.spare_byte, 0);
  EXPECT_EQ(column(0).def.spare, 77u);
  EXPECT_EQ(table().header.btf, 24 + 57);
  EXPECT_EQ(table().dsp_wid, 0);
  def.description = nullptr;
  ASSERT_OK(redefine("n", def));
  EXPECT_EQ(column(0).desc_flag, 0);
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
  std::string before = snapshot(true);
  for (const auto& [label, def, status, texts] : define_refusals) {
    SCOPED_TRACE(label);
    EXPECT_EQ(TEV8R1_PF_def_column("t", def), status);
    EXPECT_EQ(error_texts(), texts);
    EXPECT_EQ(snapshot(true), before);
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
  before = snapshot(true);
  for (const auto& [name, def, status, texts] : redefine_refusals) {
    SCOPED_TRACE(testing::Message() << name << " to " << def.name << ", " << status);
    set_error_texts();
    EXPECT_EQ(redefine(name, def), status);
    EXPECT_EQ(error_texts(), texts);
    EXPECT_EQ(snapshot(true), before);
  }
  EXPECT_EQ(index_entries(column(3)), nullptr);
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
