#include "reports/display.h"

#include "tests/reports/report_fixture.h"

namespace tevpf {
namespace {

using Display = ReportTest;

TEST_F(Display, LinesBreakBehindWhiteSpaceOrWithinWords) {
  const struct {
    const char* label;
    std::int32_t first, width;
    const char *text, *shown;
    TEVPF_STATUS status;
  } cases[] = {
      {"exactly the width", 1, 10, "0123456789", "0123456789", PF_NORMAL},
      {"indented at once", 0, 10, "0123456789", ">>0123456789", PF_NORMAL},
      {"hard break", 1, 10, "0123456789a", "01234567\\\n>>89a", PF_NOMORE},
      {"blank at the last place", 1, 10, "0123456 89a", "0123456 \\\n>>89a", PF_NOMORE},
      {"blanks across the end", 1, 10, "01 4567   b", "01 \\\n>>4567   b", PF_NOMORE},
      {"blank one too late", 1, 10, "01234567 9a", "01234567\\\n>> 9a", PF_NOMORE},
      {"behind several blanks", 1, 10, "01   56789a", "01   \\\n>>56789a", PF_NOMORE},
      {"form feed, vertical tab", 1, 10, "01\v\f4567\xFF\xA0z", "01\v\f\\\n>>4567\xFF\xA0z",
       PF_NOMORE},
      {"blanks at the front only", 0, 10, "  23456789a", ">>  \\\n>>23456789a", PF_NOMORE},
      {"nothing but blanks", 1, 5, "      ", "   \\\n>>   ", PF_NOMORE},
      {"three lines", 1, 6, "%d %s %x", "%d \\\n>>%s %x", PF_NOMORE},
      {"width below 3", 1, -7, "abcd", "a\\\n>>bcd", PF_NOMORE},
      {"empty", 0, 3, "", ">>", PF_NORMAL},
  };
  for (const auto& c : cases) {
    std::FILE* stream = std::fopen("out.txt", "w");
    std::fputs("before|", stream);
    EXPECT_EQ(TEV8R1_display_string_value(c.first, c.width, c.text, stream, ">>"), c.status)
        << c.label;
    std::fputs("|after", stream);
    std::fclose(stream);
    EXPECT_EQ(read_file("out.txt"), "before|" + std::string(c.shown) + "|after") << c.label;
  }
}

TEST_F(Display, OnStandardOutputLinesGoOnWithABlank) {
  testing::internal::CaptureStdout();
  TEV8R1_display_string_value(1, 4, "abcdef", stdout, "> ");
  std::fflush(stdout);
  EXPECT_EQ(testing::internal::GetCapturedStdout(), "ab \n> cdef");
}

}  // namespace
}  // namespace tevpf
