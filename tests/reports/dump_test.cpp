#include <functional>

#include "reports/list_dump.h"
#include "reports/row_text.h"
#include "reports/table_dump.h"
#include "tests/reports/report_fixture.h"

namespace tevpf {
namespace {

using Dump = ReportTest;

Def text(const char* name, const std::string& value, std::optional<std::string> description = {},
         const char* units = "") {
  return {PF_TYPE_STRING, name, units, description, 0, 0, 0, 0, value};
}

TEST_F(Dump, AFileWithAllKindsOfLists) {
  new_list("TEVPF_FILE_HEADER", "about the file",
           {text("Author", "100% engineered"),
            text("Notes", std::string(91, 'a')),
            {PF_TYPE_INT, "Revision", "", {}, 7, 9, 0},
            {PF_TYPE_REAL, "Scale", "", {}, 0.25, 1, 0, 1}});
  new_list("Empty", "nothing in it", {});
  new_list("Plain", "100%s",
           {{PF_TYPE_INT, "count", "pcs", {}, 42},
            {PF_TYPE_SHORT, "level", "", {}, -5, 32767, -32768},
            {PF_TYPE_REAL, "pi", "rad", {}, 3.14159, 10, 0, 3},
            {PF_TYPE_DOUBLE, "far", "", {}, 1e-7, 1e300, -1e300},
            text("tabbed", "a\tb\n"),
            text("blank", "ends "),
            text("empty", "")});
  new_list("Described", "",
           {text("eleven", "1234567890\t", "fits"),
            text("twelve", "123456789012", "moves"),
            text("silent", "x"),
            text("long", std::string(66, 'v'), std::string(60, 'd'), "m"),
            {PF_TYPE_INT, "n%d", "%s", "50% of\t%s", INT32_MIN, INT32_MAX, INT32_MIN},
            {PF_TYPE_DOUBLE, "half", "", {}, 0.5, 1, 0, 1200}});
  ASSERT_OK(TEV8R1_PF_create_elem("TEVPF_FILE_HEADER", "only a name", PF_ELEM_TABLE));
  ASSERT_OK(TEV8R1_PF_delete_table("t"));
  ASSERT_OK(TEV8R1_PF_dump_file("out.txt"));
  EXPECT_EQ(read_file("out.txt"), golden("file", path_));
}

TEST_F(Dump, WithoutAHeaderListTheBlockIsShortAndTheTextsStay) {
  ASSERT_OK(TEV8R1_PF_delete_table("t"));
  ASSERT_OK(TEV8R1_PF_dump_file("out.txt"));
  EXPECT_EQ(read_file("out.txt"), "\t\tFile name           : " + path_ +
                                      "\n\n.\t\tNumber of lists     : 0\n\n"
                                      ".\t\tNumber of tables    : 0\n\n\f\n");
  EXPECT_EQ(error_texts(), (ErrorTexts{"list", "TEVPF_FILE_HEADER"}));
}

// The file is opened for writing before anything is looked for; without a current file it is left alone.
TEST_F(Dump, RefusalsAndWhatTheyLeave) {
  const char names[1][TEVPF_NAME_SIZE] = {"x"};
  using Report = std::function<TEVPF_STATUS(const char*)>;
  const Report reports[] = {
      TEV8R1_PF_dump_file,
      [](const char* path) { return TEV8R1_PF_dump_list("No", path); },
      [](const char* path) { return TEV8R1_PF_dump_table("No", path); },
      [&](const char* path) { return TEV8R1_PF_print_table("No", path, 1, 1, names, 0, 1); },
  };
  for (const Report& report : reports) {
    set_error_texts();
    EXPECT_EQ(report("no/such/directory"), PF_OPENFAIL);
    EXPECT_EQ(error_texts(), (ErrorTexts{"no/such/directory", ""}));
    write_file("out.txt", "old");
    EXPECT_EQ(report("out.txt"), &report == reports ? PF_NORMAL : PF_NOELEM);
    EXPECT_EQ(read_file("out.txt").empty(), &report != reports);
  }
  ASSERT_OK(TEV8R1_PF_close(0));
  EXPECT_EQ(TEV8R1_PF_dump_file("none.txt"), PF_NOFILE);
  EXPECT_FALSE(std::filesystem::exists("none.txt"));
}

TEST_F(Dump, ATableOfMixedColumnsInStorageOrder) {
  mixed_table();
  ASSERT_OK(TEV8R1_PF_define_table_search("t", "id"));
  EXPECT_EQ(dump_table(), golden("table"));
  EXPECT_EQ(table().dsp_wid, 52);
  std::FILE* stream = std::fopen("own.txt", "w");
  std::fputs("mine\n", stream);
  EXPECT_EQ(TEV8R1_table_dump(&table(), stream), PF_NORMAL);
  std::fclose(stream);
  EXPECT_EQ(read_file("own.txt"), "mine\n" + golden("table"));
}

// A column defined after the formats were made has none: a dump makes all of them, and the width.
TEST_F(Dump, AColumnAddedBetweenDumpsIsFormatted) {
  define({col("a", kInt, 5)});
  add_rows({{"3"}});
  EXPECT_EQ(data_of(dump_table()), ".  a\n.-----\n\n     3\n");
  define({col("name", kText, 2)});
  EXPECT_EQ(data_of(dump_table()), ".  a    name\n.-----------\n\n     3  \\0  \n");
  // Outside interactive mode new widths and names leave the formats, and the width of rows, as they
  // were made.
  ASSERT_OK(redefine("a", col("a", kInt, 9)));
  ASSERT_OK(redefine("name", col("longest", kText, 2)));
  EXPECT_EQ(data_of(dump_table()), ".    a      longest\n.-----------\n\n     3  \\0  \n");
}

TEST_F(Dump, DebugOutputShowsInnerFields) {
  setenv("TEV8R1_debug", "", 1);
  EXPECT_EQ(TEV8R1_PF_init(), PF_INITDONE);
  new_list("Tiny", "three",
           {{PF_TYPE_INT, "c", "", "text", 5, 9, 1},
            {PF_TYPE_INT, "a", "", {}, 2, 9, 1},
            text("b", "v", "d")});
  define({col("a", kDouble, 5, {1, 9, 2}), indexed(described(col("b", kInt, 5, {1, 9}), "key"))});
  add_rows({{"2", "9"}, {"3", "4"}, {"4", "5"}});
  const auto address = [](const void* of) {
    return std::to_string(reinterpret_cast<std::uintptr_t>(of));
  };
  ASSERT_OK(TEV8R1_PF_dump_list("Tiny", "out.txt"));
  EXPECT_EQ(read_file("out.txt"), golden("debug_list", address(list("Tiny").index_ptr)));
  EXPECT_EQ(dump_table(), golden("debug_table", address(column(1).idx_ptr)));
  ASSERT_OK(TEV8R1_PF_define_table_search("t", "b"));
  EXPECT_NE(dump_table().find("\ncur_col = b\n\n\n."), std::string::npos);
}

// An operation of its own: any columns of a table, in a buffer that is exactly large enough.
TEST_F(Dump, HeadingsAndRowsOfSomeColumns) {
  mixed_table();
  dump_table();
  char heading[60];
  std::memset(heading, '#', sizeof heading);
  std::int32_t lead = -1;
  ASSERT_OK(TEV8R1_create_table_header("t", 2, 5, 1, 25, &lead, heading));
  EXPECT_EQ(lead, 3);
  EXPECT_STREQ(heading, "   x     y  s    t");
  EXPECT_EQ(std::string(heading + 19, 7), "      #");
  ASSERT_OK(TEV8R1_create_table_header("t", 1, 2, 3, 0, &lead, heading));
  EXPECT_EQ(lead, 0);
  EXPECT_STREQ(heading, "a_rather_long_name      x");

  std::string line(40, '#');
  std::int32_t length = -1;
  const unsigned char* const row = table().row_data;
  ASSERT_OK(TEV8R1_review_row(&column(1), &column(2), row, line.data(), &length));
  EXPECT_EQ(length, 28);
  EXPECT_STREQ(line.c_str(), "ab\\n                     1.5");
  TEVPF_COLUMN odd[2] = {column(4), column(4)};
  odd[1].def.type = 16;
  EXPECT_EQ(TEV8R1_review_row(odd, odd + 1, row, line.data(), &length), PF_BADTYPE);
  EXPECT_STREQ(line.c_str(), "  7  ");
  EXPECT_EQ(error_texts(), (ErrorTexts{"value", "16"}));
}

TEST_F(Dump, LinesBeyond31BitsAreRefused) {
  define({col("a", kInt, INT32_MAX), col("b", kInt, INT32_MAX)});
  EXPECT_EQ(TEV8R1_PF_dump_table("t", "out.txt"), PF_NORMAL);
  add_rows({{"1", "2"}});
  EXPECT_EQ(TEV8R1_PF_dump_table("t", "out.txt"), PF_NOMEM);
  EXPECT_TRUE(read_file("out.txt").ends_with("TABLE DATA\n\n"));
  listing({"a", "b"});
  EXPECT_EQ(status_, PF_NOMEM);
}

// Precisions that no definition operation would refuse, widths smaller than any number, and a text of
// which every character is doubled.
TEST_F(Dump, TheWidestValuesFitTheirLines) {
  define({col("a", kDouble, 1, {-1e308, 1e308, INT32_MAX}), col("b", kReal, 1, {-1e38, 1e38, 1100}),
          col("c", kText, 100)});
  const std::string tabs(100, '\t');
  std::string doubled, expected;
  for (int n = 0; n < 100; ++n) doubled += "\\t";
  add_rows({{"1e308", "1e38", tabs.c_str()},
            {"-1e308", "-1e38", tabs.c_str()},
            {"-2.2250738585072019e-308", "1e-5", tabs.c_str()}});
  for (std::int32_t n = 0; n < 3; ++n) {
    char text[2400];
    const unsigned char* const at = row_at(table(), n);
    std::snprintf(text, sizeof text, " %1.1100g  %1.1100g  ", load<double>(at),
                  static_cast<double>(load<float>(at + column(1).offset)));
    expected += text + doubled + '\n';
  }
  EXPECT_TRUE(dump_table().ends_with("\n\n" + expected));
  EXPECT_TRUE(listing({"c"}).ends_with("\n " + doubled + "\n"));
}

}  // namespace
}  // namespace tevpf
