// Reports of whole files, lists and tables; larger ones are held against files of golden/.
#include <filesystem>
#include <functional>

#include "reports/list_dump.h"
#include "reports/row_text.h"
#include "reports/table_dump.h"
#include "support/param_def.h"
#include "support/table_fixture.h"

namespace tevpf {
namespace {

// A report as it is stored; what differs from run to run stands in it as a mark.
inline std::string golden(const std::string& name, const std::string& for_mark = "") {
  std::string text = read_text(std::string(TEVPF_GOLDEN_DIR) + name + ".golden");
  const std::string mark = "<MARK>";
  if (const auto at = text.find(mark); at != text.npos) text.replace(at, mark.size(), for_mark);
  return text;
}

// An empty value removes the variable.
void set_variable(const char* name, const std::string& value) {
#ifdef _WIN32
  _putenv_s(name, value.c_str());
#else
  value.empty() ? unsetenv(name) : setenv(name, value.c_str(), 1);
#endif
}

class Reports : public TableTest {
 protected:
  Reports() { std::filesystem::current_path(dir_.path()); }
  ~Reports() override {
    set_variable("TEV8R1_debug", "");
    TEV8R1_PF_init();
    std::filesystem::current_path(std::filesystem::temp_directory_path());
  }

  static void add_rows(const std::vector<std::vector<const char*>>& rows) {
    for (const auto& values : rows) ASSERT_OK(add(values));
  }

  static void mixed_table() {
    new_table();
    ASSERT_OK(TEV8R1_modify_elem_desc(PF_ELEM_TABLE, "t", "stored 30, 10, 20"));
    TEVPF_COL_DEF text = col("a_rather_long_name", kText, 4);
    TEVPF_COL_DEF y = col("y", kDouble, 1, {-1e300, 1e300, 50});
    std::strcpy(text.units, "m/s");
    std::strcpy(y.units, "%");
    const std::string wide(55, 'a');
    const TEVPF_COL_DEF x = described(col("x", kReal, 8, {-1e6, 1e6, 3}), wide.c_str());
    define({indexed(described(col("id", kInt, 5, {-9999, 9999}), "identifier"), true), text,
            indexed(x), y, col("s", PF_TYPE_SHORT, 3, {-32768, 32767}), col("t", kText, 6)});
    add_rows({{"30", "ab\n", "1.5", "0.25", "7", "end "},
              {"10", "", "-0.0001", "0.1", "-32768", ""},
              {"20", "x\\y", "123456", "2.0", "5", "%d"}});
    ASSERT_OK(TEV8R1_PF_define_table_search("t", "id"));
  }

  static std::string dump_table() {
    EXPECT_EQ(TEV8R1_PF_dump_table("t", "out.txt"), PF_NORMAL);
    return read_text("out.txt");
  }
  static std::string listing(const std::vector<std::string>& names, std::int32_t first = 0,
                             std::int32_t last = PF_END_POS, std::int32_t definitions = 0) {
    char fields[16][TEVPF_NAME_SIZE] = {};
    for (std::size_t n = 0; n < names.size(); ++n) names[n].copy(fields[n], 19);
    EXPECT_EQ(TEV8R1_PF_print_table("t", "out.txt", definitions,
                                    static_cast<std::int32_t>(names.size()), fields, first, last),
              PF_NORMAL);
    return read_text("out.txt");
  }
  // What stands behind the heading of the rows' block.
  static std::string data_of(const std::string& report) {
    const std::string heading = "TABLE DATA\n\n";
    return report.substr(report.find(heading) + heading.size());
  }
};

Def text(const char* name, const std::string& value, std::optional<std::string> description = {},
         const char* units = "") {
  return {PF_TYPE_STRING, name, units, description, 0, 0, 0, 0, value};
}

TEST_F(Reports, AFileWithAllKindsOfLists) {
  make_list("TEVPF_FILE_HEADER", "about the file",
            {text("Author", "100% engineered"),
             text("Notes", std::string(91, 'a')),
             {PF_TYPE_INT, "Revision", "", {}, 7, 9, 0},
             {PF_TYPE_REAL, "Scale", "", {}, 0.25, 1, 0, 1}});
  make_list("Empty", "nothing in it", {});
  make_list("Plain", "100%s",
            {{PF_TYPE_INT, "count", "pcs", {}, 42},
             {PF_TYPE_SHORT, "level", "", {}, -5, 32767, -32768},
             {PF_TYPE_REAL, "pi", "rad", {}, 3.14159, 12345.6, 0, 3},
             {PF_TYPE_DOUBLE, "far", "", {}, 1e-7, 1e300, -1e300},
             text("tabbed", "a\tb\n"),
             text("blank", "ends "),
             text("empty", "")});
  make_list("Described", "",
            {text("eleven", "1234567890\t", "fits"),
             text("twelve", "123456789012", "moves"),
             text("silent", "x"),
             text("long", std::string(66, 'v'), std::string(60, 'd'), "m"),
             {PF_TYPE_INT, "n%d", "%s", "50% of\t%s", INT32_MIN, INT32_MAX, INT32_MIN},
             {PF_TYPE_DOUBLE, "half", "", {}, 0.5, 1, 0, 1200}});
  ASSERT_OK(TEV8R1_PF_create_elem("TEVPF_FILE_HEADER", "only a name", PF_ELEM_TABLE));
  ASSERT_OK(TEV8R1_PF_delete_table("t"));
  ASSERT_OK(TEV8R1_PF_dump_file("out.txt"));
  EXPECT_EQ(read_text("out.txt"), golden("file", path_));
}

TEST_F(Reports, AFileWithoutAHeaderListHasAShortBlock) {
  ASSERT_OK(TEV8R1_PF_delete_table("t"));
  expect_answer(TEV8R1_PF_dump_file("out.txt"), PF_NORMAL, {"list", "TEVPF_FILE_HEADER"});
  EXPECT_EQ(read_text("out.txt"), "\t\tFile name           : " + path_ +
                                      "\n\n.\t\tNumber of lists     : 0\n\n"
                                      ".\t\tNumber of tables    : 0\n\n\f\n");
  expect_answer(TEV8R1_PF_dump_file("no/folder"), PF_OPENFAIL, {"no/folder", ""});
  ASSERT_OK(TEV8R1_PF_close(0));
  expect_answer(TEV8R1_PF_dump_file("none.txt"), PF_NOFILE);
  EXPECT_FALSE(std::filesystem::exists("none.txt"));
}

// The file is opened for writing before anything is looked for.
TEST_F(Reports, RefusalsAndWhatTheyLeave) {
  mixed_table();
  const char names[2][TEVPF_NAME_SIZE] = {"id", "nowhere"};
  const auto listing_of = [&](const char* table, std::int32_t count) {
    return [=, &names](const char* path) {
      return TEV8R1_PF_print_table(table, path, 1, count, names, 0, 1);
    };
  };
  const struct {
    std::function<TEVPF_STATUS(const char*)> report;
    TEVPF_STATUS status;
    ErrorTexts texts;
  } cases[] = {
      {[](auto* path) { return TEV8R1_PF_dump_list("No", path); }, PF_NOELEM, {"list", "No"}},
      {[](auto* path) { return TEV8R1_PF_dump_table("No", path); }, PF_NOELEM, {"table", "No"}},
      {listing_of("No", 2), PF_NOELEM, {"table", "No"}},
      {listing_of("t", 2), PF_NOCOLUMN, {"nowhere", ""}},
      {listing_of("t", 0), PF_BADARG, {"0", ""}},
      {listing_of("t", -3), PF_BADARG, {"-3", ""}}};
  set_error_texts();
  for (const auto& [report, status, texts] : cases) {
    expect_answer(report("no/folder"), PF_OPENFAIL, {"no/folder", ""});
    write_file("out.txt", "old");
    expect_answer(report("out.txt"), status, texts);
    EXPECT_EQ(read_text("out.txt"), "");
  }
}

TEST_F(Reports, ATableOfMixedColumnsInStorageOrder) {
  mixed_table();
  EXPECT_EQ(dump_table(), golden("table"));
  EXPECT_EQ(table().dsp_wid, 52);
  std::FILE* const own = std::fopen("out.txt", "a");
  EXPECT_EQ(TEV8R1_table_dump(&table(), own), PF_NORMAL);
  std::fclose(own);
  EXPECT_EQ(read_text("out.txt"), golden("table") + golden("table"));
}

// A column defined after the formats were made has none: a dump makes all of them, and the width.
TEST_F(Reports, AColumnAddedBetweenDumpsIsFormatted) {
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

TEST_F(Reports, DebugOutputShowsInnerFields) {
  set_variable("TEV8R1_debug", "1");
  EXPECT_EQ(TEV8R1_PF_init(), PF_INITDONE);
  make_list("Tiny", "three",
            {{PF_TYPE_INT, "c", "", "text", 5, 9, 1},
             {PF_TYPE_INT, "a", "", {}, 2, 9, 1},
             text("b", "v", "d")});
  define({col("a", kDouble, 5, {1, 9, 2}), indexed(described(col("b", kInt, 5, {1, 9}), "key"))});
  add_rows({{"2", "9"}, {"3", "4"}, {"4", "5"}});
  const auto address = [](const void* of) {
    return std::to_string(reinterpret_cast<std::uintptr_t>(of));
  };
  ASSERT_OK(TEV8R1_PF_dump_list("Tiny", "out.txt"));
  EXPECT_EQ(read_text("out.txt"), golden("debug_list", address(list("Tiny").index_ptr)));
  EXPECT_EQ(dump_table(), golden("debug_table", address(column(1).idx_ptr)));
  ASSERT_OK(TEV8R1_PF_define_table_search("t", "b"));
  EXPECT_NE(dump_table().find("\ncur_col = b\n\n\n."), std::string::npos);
}

// An operation of its own: any columns of a table, in a buffer that is exactly large enough.
TEST_F(Reports, HeadingsAndRowsOfSomeColumns) {
  mixed_table();
  dump_table();
  char heading[60];
  std::memset(heading, '#', sizeof heading);
  std::int32_t lead = -1;
  ASSERT_OK(TEV8R1_create_table_header("t", 2, INT32_MAX, 1, 25, &lead, heading));
  EXPECT_EQ(lead, 3);
  EXPECT_STREQ(heading, "   x     y  s    t");
  EXPECT_EQ(std::string(heading + 19, 7), "      #");
  ASSERT_OK(TEV8R1_create_table_header("t", 1, 2, 3, 0, &lead, heading));
  EXPECT_EQ(lead, 0);
  EXPECT_STREQ(heading, "a_rather_long_name      x");

  char line[40];
  std::int32_t length = -1;
  const unsigned char* const row = table().row_data;
  ASSERT_OK(TEV8R1_review_row(&column(1), &column(2), row, line, &length));
  EXPECT_EQ(length, 28);
  EXPECT_STREQ(line, "ab\\n                     1.5");
  TEVPF_COLUMN odd[2] = {column(4), column(4)};
  odd[1].def.type = 16;
  EXPECT_EQ(TEV8R1_review_row(odd, odd + 1, row, line, &length), PF_BADTYPE);
  EXPECT_STREQ(line, "  7  ");
  EXPECT_EQ(error_texts(), (ErrorTexts{"value", "16"}));
}

TEST_F(Reports, LinesBeyond31BitsAreRefused) {
  define({col("a", kInt, INT32_MAX), col("b", kInt, INT32_MAX)});
  EXPECT_EQ(TEV8R1_PF_dump_table("t", "out.txt"), PF_NORMAL);
  add_rows({{"1", "2"}});
  EXPECT_EQ(TEV8R1_PF_dump_table("t", "out.txt"), PF_NOMEM);
  EXPECT_TRUE(read_text("out.txt").ends_with("TABLE DATA\n\n"));
  EXPECT_EQ(TEV8R1_PF_print_table("t", "out.txt", 0, 9, nullptr, 0, 9), PF_NOMEM);
}

// Precisions that no definition operation would refuse, widths smaller than any number, and a text of
// which every character is doubled.
TEST_F(Reports, TheWidestValuesFitTheirLines) {
  define({col("a", kDouble, 1, {-1e308, 1e308, INT32_MAX}), col("b", kReal, 1, {-1e38, 1e38, 1100}),
          col("c", kText, 100)});
  const std::string tabs(100, '\t');
  add_rows({{"1e308", "1e38", tabs.c_str()},
            {"-1e308", "-1e38", tabs.c_str()},
            {"-2.2250738585072019e-308", "1e-5", tabs.c_str()}});
  EXPECT_EQ(dump_table() + listing({"c"}), golden("widest"));
}

// Text columns a, b, c ... of some widths, and the rows' blocks of reports of them; golden/segments
// holds them one after the other. A listing of no columns means a dump.
TEST_F(Reports, SegmentsBreakAsTheirLimitsSay) {
  const std::string late_yy = std::string(66, ' ') + "yy", late_y = std::string(67, ' ') + "y";
  const std::string escaped = std::string(57, 'x') + "\n\n\n";
  const struct {
    const char* label;
    std::vector<std::int32_t> widths;
    std::vector<std::vector<const char*>> rows;
    std::vector<std::vector<std::string>> listings;
  } cases[] = {
      {"a dump is one line up to 130 characters", {60, 67}, {{"x", "y"}}, {{}}},
      {"pieces, shorter than 129, end neither in front of white space nor with a backslash",
       {60, 68},
       {{"x", "y"},
        {"x", "  y"},
        {"x", late_yy.c_str()},
        {"x", late_y.c_str()},
        {escaped.c_str(), "y"}},
       {{}}},
      {"limits fall by 8 to 113; wide columns stand alone, with 129 dashes; tabs stop at two",
       {127, 126, 140, 110, 111, 3},
       {{"1", "2", "3", "4", "5", ""}},
       {{}}},
      {"columns share segments below 129, 121, 113 in dumps, below 131, 123, 115 in listings",
       {60, 64, 60, 57, 51, 60, 48, 60, 49, 2, 66, 59, 50},
       {std::vector<const char*>(13, "x")},
       {{}, {"a", "k", "a", "l", "e", "a", "m", "a", "e", "j"}}},
      {"a listing is one line up to 132 characters; its pieces are cut exactly",
       {60, 68, 69},
       {{"x", "  y", "z"}},
       {{"a", "b"}, {"a", "c"}, {"a", "b", "b"}}},
      {"by name 133 wide; more columns than there are count one less",
       {60, 69},
       {{"x", "y"}},
       {{"a", "b"}, {"a", "b", "c"}}},
      {"rules of a listing have no bound", {200}, {{"x"}}, {{"a"}}},
  };
  std::string all;
  for (const auto& c : cases) {
    new_table();
    char name[] = "a";
    for (const std::int32_t width : c.widths) {
      define({col(name, kText, width)});
      ++name[0];
    }
    for (const auto& row : c.rows) add_rows({row});
    for (const auto& names : c.listings) {
      all += std::string(c.label) + '\n' + data_of(names.empty() ? dump_table() : listing(names));
    }
  }
  EXPECT_EQ(all, golden("segments"));
}

TEST_F(Reports, ListingsOfColumnsOfChoiceInSearchOrder) {
  mixed_table();
  EXPECT_EQ(listing({"t", "id", "a_rather_long_name"}, -5, PF_END_POS, 1),
            golden("listing_chosen"));
  EXPECT_EQ(table().cur_row, -1);
  ASSERT_OK(TEV8R1_PF_print_table("t", "out.txt", 0, INT32_MAX, nullptr, 1, 3));
  EXPECT_EQ(read_text("out.txt"), golden("listing_all")) << "more columns than there are mean all";
  ASSERT_OK(TEV8R1_PF_define_table_search("t", nullptr));
  EXPECT_EQ(data_of(listing({"s", "s"}, 0, 1)),
            ". s    s\n.---------\n\n   7    7\n -32768  -32768\n");
}

TEST_F(Reports, RangesWithoutRowsEndBehindTheHeading) {
  mixed_table();
  const std::int64_t cases[][3] = {
      {2, 1, 0}, {2, 0, -1}, {3, PF_END_POS, 0}, {INT32_MAX, INT32_MIN, -4294967294}, {0, -1, 0}};
  for (const auto& [first, last, rows] : cases) {
    EXPECT_EQ(listing({"s"}, static_cast<std::int32_t>(first), static_cast<std::int32_t>(last)),
              " Table name:  t\n Description:  stored 30, 10, 20\n.Number of columns:  1\n"
              ".Number of rows:  " +
                  std::to_string(rows) + "\n\n!\n\n.    \t\t\t\tTABLE DATA\n\n");
  }
}

}  // namespace
}  // namespace tevpf
