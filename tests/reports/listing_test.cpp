#include "tests/reports/report_fixture.h"

namespace tevpf {
namespace {

class Listing : public ReportTest {
 protected:
  Listing() {
    mixed_table();
    EXPECT_EQ(TEV8R1_PF_define_table_search("t", "id"), PF_NORMAL);
  }
};

TEST_F(Listing, ColumnsOfChoiceInSearchOrder) {
  EXPECT_EQ(listing({"t", "id", "a_rather_long_name"}, -5, PF_END_POS, 1),
            golden("listing_chosen"));
  EXPECT_EQ(status_, PF_NORMAL);
  EXPECT_EQ(table().cur_row, -1);
  ASSERT_OK(TEV8R1_PF_print_table("t", "out.txt", 0, INT32_MAX, nullptr, 1, 3));
  EXPECT_EQ(read_file("out.txt"), golden("listing_all")) << "more columns than there are mean all";
  ASSERT_OK(TEV8R1_PF_define_table_search("t", nullptr));
  EXPECT_EQ(data_of(listing({"s", "s"}, 0, 1)),
            ". s    s\n.---------\n\n   7    7\n -32768  -32768\n");
}

TEST_F(Listing, RangesWithoutRowsEndBehindTheHeading) {
  const struct {
    std::int32_t first, last;
    const char* rows;
  } cases[] = {{2, 1, "0"},
               {2, 0, "-1"},
               {3, PF_END_POS, "0"},
               {INT32_MAX, INT32_MIN, "-4294967294"},
               {0, -1, "0"}};
  for (const auto& c : cases) {
    EXPECT_EQ(listing({"s"}, c.first, c.last),
              " Table name:  t\n Description:  stored 30, 10, 20\n.Number of columns:  1\n"
              ".Number of rows:  " +
                  std::string(c.rows) + "\n\n!\n\n.    \t\t\t\tTABLE DATA\n\n");
    EXPECT_EQ(status_, PF_NORMAL);
  }
}

TEST_F(Listing, RefusalsWriteNothing) {
  EXPECT_EQ(listing({"id", "nowhere", "nobody"}), "");
  EXPECT_EQ(status_, PF_NOCOLUMN);
  EXPECT_EQ(error_texts(), (ErrorTexts{"nowhere", ""}));
  for (const std::int32_t count : {0, -3}) {
    set_error_texts();
    EXPECT_EQ(TEV8R1_PF_print_table("t", "out.txt", 0, count, nullptr, 0, 1), PF_BADARG);
    EXPECT_EQ(read_file("out.txt"), "");
    EXPECT_EQ(error_texts(), (ErrorTexts{std::to_string(count), ""}));
  }
}

}  // namespace
}  // namespace tevpf
