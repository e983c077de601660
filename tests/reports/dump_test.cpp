#include <functional>

#include "reports/list_dump.h"
#include "reports/row_text.h"
#include "reports/table_dump.h"
#include "tests/reports/report_fixture.h"

namespace tevpf {
namespace {

using Dump = ReportTest;

TEST_F(Dump, AFileWithAllKindsOfLists) {
  fill_lists();
  table("TEVPF_FILE_HEADER", "only a name");
  ASSERT_EQ(TEV8R1_PF_dump_file("out.txt"), PF_NORMAL);
  EXPECT_EQ(read_file("out.txt"), golden("file"));
}

TEST_F(Dump, WithoutAHeaderListTheBlockIsShortAndTheTextsStay) {
  ASSERT_EQ(TEV8R1_PF_dump_file("out.txt"), PF_NORMAL);
  EXPECT_EQ(read_file("out.txt"),
            "\t\tFile name           : report.pf\n\n.\t\tNumber of lists     : 0\n\n"
            ".\t\tNumber of tables    : 0\n\n\f\n");
  EXPECT_STREQ(err_item, "list");
  EXPECT_STREQ(err_value, "TEVPF_FILE_HEADER");
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
  ASSERT_EQ(TEV8R1_PF_close(0), PF_NORMAL);
  EXPECT_EQ(TEV8R1_PF_dump_file("none.txt"), PF_NOFILE);
  EXPECT_FALSE(std::filesystem::exists("none.txt"));
}

TEST_F(Dump, ATableOfMixedColumnsInStorageOrder) {
  fill_mixed_table();
  ASSERT_EQ(TEV8R1_PF_define_table_search("Mixed", "id"), PF_NORMAL);
  EXPECT_EQ(dump_table(), golden("table"));
  EXPECT_EQ(table_->dsp_wid, 52);
  std::FILE* stream = std::fopen("own.txt", "w");
  std::fputs("mine\n", stream);
  EXPECT_EQ(TEV8R1_table_dump(table_, stream), PF_NORMAL);
  std::fclose(stream);
  EXPECT_EQ(read_file("own.txt"), "mine\n" + golden("table"));
}

// A column defined after the formats were made has none: a dump makes all of them, and the width.
TEST_F(Dump, AColumnAddedBetweenDumpsIsFormatted) {
  table("T", "");
  number_column("a", PF_TYPE_INT, 5, 9, 1);
  row({3.0});
  EXPECT_EQ(data_of(dump_table()), ".  a\n.-----\n\n     3\n");
  text_column("name", 2);
  EXPECT_EQ(data_of(dump_table()), ".  a    name\n.-----------\n\n     3  \\0  \n");
  // Outside interactive mode new widths and names leave the formats, and the width of rows, as they
  // were made.
  TEVPF_COL_DEF wider = table_->col_array[0].def;
  wider.width = 9;
  ASSERT_EQ(TEV8R1_PF_modify_col_def("T", "a", wider), PF_NORMAL);
  TEVPF_COL_DEF longer = table_->col_array[1].def;
  std::strcpy(longer.name, "longest");
  ASSERT_EQ(TEV8R1_PF_modify_col_def("T", "name", longer), PF_NORMAL);
  EXPECT_EQ(data_of(dump_table()), ".    a      longest\n.-----------\n\n     3  \\0  \n");
}

TEST_F(Dump, DebugOutputShowsInnerFields) {
  setenv("TEV8R1_debug", "", 1);
  EXPECT_EQ(TEV8R1_PF_init(), PF_INITDONE);
  list("Tiny", "three");
  number("c", "", PF_TYPE_INT, 9, 1, 5, "text");
  number("a", "", PF_TYPE_INT, 9, 1, 2);
  text("b", "v", "d");
  table("Pair", "two");
  number_column("a", PF_TYPE_DOUBLE, 5, 9, 1, kNone, nullptr, 2);
  number_column("b", PF_TYPE_INT, 5, 9, 1, kIndexed, "key");
  row({2.0, 9.0});
  row({3.0, 4.0});
  row({4.0, 5.0});

  TEVPF_LIST* tiny = nullptr;
  ASSERT_EQ(TEV8R1_get_list_ptr("Tiny", &tiny), PF_NORMAL);
  ASSERT_EQ(TEV8R1_PF_dump_list("Tiny", "out.txt"), PF_NORMAL);
  const auto with_address = [](const char* name, const void* address) {
    std::string text = golden(name);
    const std::string mark = "ADDRESS";
    text.replace(text.find(mark), mark.size(),
                 std::to_string(reinterpret_cast<std::uintptr_t>(address)));
    return text;
  };
  EXPECT_EQ(read_file("out.txt"), with_address("debug_list", tiny->index_ptr));
  EXPECT_EQ(dump_table(), with_address("debug_table", table_->col_array[1].idx_ptr));
  ASSERT_EQ(TEV8R1_PF_define_table_search("Pair", "b"), PF_NORMAL);
  EXPECT_NE(dump_table().find("\ncur_col = b\n\n\n."), std::string::npos);
}

// An operation of its own: any columns of a table, in a buffer that is exactly large enough.
TEST_F(Dump, HeadingsAndRowsOfSomeColumns) {
  fill_mixed_table();
  dump_table();
  char heading[60];
  std::memset(heading, '#', sizeof heading);
  std::int32_t lead = -1;
  ASSERT_EQ(TEV8R1_create_table_header("Mixed", 2, 5, 1, 25, &lead, heading), PF_NORMAL);
  EXPECT_EQ(lead, 3);
  EXPECT_STREQ(heading, "   x     y  s    t");
  EXPECT_EQ(std::string(heading + 19, 7), "      #");
  ASSERT_EQ(TEV8R1_create_table_header("Mixed", 1, 2, 3, 0, &lead, heading), PF_NORMAL);
  EXPECT_EQ(lead, 0);
  EXPECT_STREQ(heading, "a_rather_long_name      x");
  EXPECT_EQ(TEV8R1_create_table_header("No", 0, 1, 3, 0, &lead, heading), PF_NOELEM);

  std::string line(40, '#');
  std::int32_t length = -1;
  TEVPF_COLUMN* const columns = table_->col_array;
  EXPECT_EQ(TEV8R1_review_row(columns + 1, columns + 2, table_->row_data, line.data(), &length),
            PF_NORMAL);
  EXPECT_EQ(length, 28);
  EXPECT_STREQ(line.c_str(), "ab\\n                     1.5");
  TEVPF_COLUMN odd[2] = {columns[4], columns[4]};
  odd[1].def.type = 16;
  EXPECT_EQ(TEV8R1_review_row(odd, odd + 1, table_->row_data, line.data(), &length), PF_BADTYPE);
  EXPECT_STREQ(line.c_str(), "  7  ");
  EXPECT_STREQ(err_item, "value");
  EXPECT_STREQ(err_value, "16");
}

TEST_F(Dump, LinesBeyond31BitsAreRefused) {
  table("T", "");
  number_column("a", PF_TYPE_INT, INT32_MAX, 9, 1);
  number_column("b", PF_TYPE_INT, INT32_MAX, 9, 1);
  EXPECT_EQ(TEV8R1_PF_dump_table("T", "out.txt"), PF_NORMAL);
  row({1.0, 2.0});
  EXPECT_EQ(TEV8R1_PF_dump_table("T", "out.txt"), PF_NOMEM);
  const std::string text = read_file("out.txt");
  EXPECT_EQ(text.substr(text.size() - 12), "TABLE DATA\n\n");
  listing({"a", "b"});
  EXPECT_EQ(status_, PF_NOMEM);
}

// Precisions that no definition operation would refuse, and widths smaller than any number.
TEST_F(Dump, NumbersOfAnyPrecisionFitTheirLines) {
  table("T", "");
  number_column("a", PF_TYPE_DOUBLE, 1, 1e308, -1e308, kNone, nullptr, INT32_MAX);
  number_column("b", PF_TYPE_REAL, 1, 1e38, -1e38, kNone, nullptr, 1100);
  for (const double value : {1e308, -1e308, 4.9406564584124654e-324, 1e-5}) {
    row({value, value > 1e38 ? 1e38 : value < -1e38 ? -1e38 : value});
  }
  char text[2400];
  std::string expected;
  for (std::int32_t n = 0; n < table_->num_rows; ++n) {
    const unsigned char* const at = table_->row_data + n * table_->row_wid;
    std::snprintf(text, sizeof text, " %1.1100g  %1.1100g\n", load<double>(at),
                  static_cast<double>(load<float>(at + table_->col_array[1].offset)));
    expected += text;
  }
  EXPECT_EQ(data_of(dump_table()), ".a  b\n.----\n\n" + expected);
}

// Every character doubled, in the widest text that its column takes.
TEST_F(Dump, EscapedTextsFitTheirLines) {
  table("T", "");
  text_column("a", 100);
  row({std::string(100, '\t')});
  std::string doubled;
  for (int n = 0; n < 100; ++n) doubled += "\\t";
  EXPECT_TRUE(dump_table().ends_with("\n\n " + doubled + "\n"));
  EXPECT_TRUE(listing({"a"}).ends_with("\n\n " + doubled + "\n"));
}

}  // namespace
}  // namespace tevpf
