#include "tests/reports/report_fixture.h"

namespace tevpf {
namespace {

using Segments = ReportTest;

// Text columns a, b, c ... of some widths, and the rows' blocks of reports of them; golden/segments
// holds them one after the other. A listing of no columns means a dump.
TEST_F(Segments, BreakAsTheirLimitsSay) {
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

}  // namespace
}  // namespace tevpf
