// Reports when memory is short, and with numbers that would need more of it than there is.
#include <functional>

#include "core/heap.h"
#include "tests/reports/report_fixture.h"

namespace tevpf {
namespace {

using Memory = ReportTest;

// Every request of every report fails once: either the report is whole all the same, or it says
// PF_NOMEM and is the beginning of the whole one.
TEST_F(Memory, ReportsStopCleanlyWhenItRunsOut) {
  fill_lists();
  text("huge", std::string(5000, '\t').c_str());
  fill_mixed_table();
  text_column("wide", 200);
  const char names[2][TEVPF_NAME_SIZE] = {"t", "wide"};
  const std::function<TEVPF_STATUS()> reports[] = {
      [] { return TEV8R1_PF_dump_file("out.txt"); },
      [] { return TEV8R1_PF_dump_list("Described", "out.txt"); },
      [] { return TEV8R1_PF_dump_table("Mixed", "out.txt"); },
      [&] { return TEV8R1_PF_print_table("Mixed", "out.txt", 1, 2, names, 0, PF_END_POS); },
  };
  for (const auto& report : reports) {
    ASSERT_EQ(report(), PF_NORMAL);
    const std::string whole = slurp("out.txt");
    int refused = 0;
    for (int n = 0;; ++n) {
      ASSERT_LT(n, 100);
      std::strcpy(err_item, "old");
      heap_fail_at(n);
      const TEVPF_STATUS status = report();
      const bool reached = heap_fail_off();
      std::string text = slurp("out.txt");
      if (status == PF_NORMAL) {
        EXPECT_EQ(text, whole);
      } else {
        ++refused;
        EXPECT_EQ(status, PF_NOMEM);
        EXPECT_STREQ(err_item, "");
        // A file's dump ends the element that failed before it stops.
        const std::string end = "!\n\f\n";
        if (text.ends_with(end)) text.resize(text.size() - end.size());
        EXPECT_LT(text.size(), whole.size());
        EXPECT_EQ(text, whole.substr(0, text.size()));
      }
      if (!reached) break;
    }
    EXPECT_GT(refused, 0);
  }
}

TEST_F(Memory, LinesBeyond31BitsAreRefused) {
  table("T", "");
  number_column("a", PF_TYPE_INT, INT32_MAX, 9, 1);
  number_column("b", PF_TYPE_INT, INT32_MAX, 9, 1);
  EXPECT_EQ(TEV8R1_PF_dump_table("T", "out.txt"), PF_NORMAL);
  row({1.0, 2.0});
  EXPECT_EQ(TEV8R1_PF_dump_table("T", "out.txt"), PF_NOMEM);
  const std::string text = slurp("out.txt");
  EXPECT_EQ(text.substr(text.size() - 12), "TABLE DATA\n\n");
  listing({"a", "b"});
  EXPECT_EQ(status_, PF_NOMEM);
}

// Precisions that no definition operation would refuse, and widths smaller than any number.
TEST_F(Memory, NumbersOfAnyPrecisionFitTheirLines) {
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
TEST_F(Memory, EscapedTextsFitTheirLines) {
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
