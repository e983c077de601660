#include "tests/reports/report_fixture.h"

namespace tevpf {
namespace {

class Listing : public ReportTest {
 protected:
  void SetUp() override {
    ReportTest::SetUp();
    fill_mixed_table();
    ASSERT_EQ(TEV8R1_PF_define_table_search("Mixed", "id"), PF_NORMAL);
  }
};

TEST_F(Listing, ChosenColumnsInSearchOrder) {
  EXPECT_EQ(listing({"t", "id", "a_rather_long_name"}, -5, PF_END_POS, 1),
            golden("listing_chosen"));
  EXPECT_EQ(status_, PF_NORMAL);
  EXPECT_EQ(table_->cur_row, -1);
}

TEST_F(Listing, MoreColumnsThanThereAreMeansAll) {
  ASSERT_EQ(TEV8R1_PF_print_table("Mixed", "out.txt", 0, INT32_MAX, nullptr, 1, 3), PF_NORMAL);
  EXPECT_EQ(read_file("out.txt"), golden("listing_all"));
}

TEST_F(Listing, ColumnsMayRepeatAndStorageOrderHoldsWithoutASearchColumn) {
  ASSERT_EQ(TEV8R1_PF_define_table_search("Mixed", nullptr), PF_NORMAL);
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
              " Table name:  Mixed\n Description:  stored 30, 10, 20\n.Number of columns:  1\n"
              ".Number of rows:  " +
                  std::string(c.rows) + "\n\n!\n\n.    \t\t\t\tTABLE DATA\n\n");
    EXPECT_EQ(status_, PF_NORMAL);
  }
}

TEST_F(Listing, RefusalsWriteNothing) {
  EXPECT_EQ(listing({"id", "nowhere", "nobody"}), "");
  EXPECT_EQ(status_, PF_NOCOLUMN);
  EXPECT_STREQ(err_item, "nowhere");
  EXPECT_STREQ(err_value, "");
  for (const std::int32_t count : {0, -3}) {
    std::strcpy(err_value, "old");
    EXPECT_EQ(TEV8R1_PF_print_table("Mixed", "out.txt", 0, count, nullptr, 0, 1), PF_BADARG);
    EXPECT_EQ(read_file("out.txt"), "");
    EXPECT_EQ(err_item, std::to_string(count));
    EXPECT_STREQ(err_value, "");
  }
}

}  // namespace
}  // namespace tevpf
