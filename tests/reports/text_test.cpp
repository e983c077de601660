// Texts in reports: long ones over several lines, control characters as backslash sequences and back.
#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <string>

#include "reports/display.h"
#include "support/memory_stream.h"

namespace {

TEST(Display, LinesBreakBehindWhiteSpaceOrWithinWords) {
  const struct {
    const char* label;
    std::int32_t first, width;
    const char *text, *shown;
  } cases[] = {
      {"exactly the width", 1, 10, "0123456789", "0123456789"},
      {"indented at once", 0, 10, "0123456789", ">>0123456789"},
      {"hard break", 1, 10, "0123456789a", "01234567\\\n>>89a"},
      {"blank at the last place", 1, 10, "0123456 89a", "0123456 \\\n>>89a"},
      {"blanks across the end", 1, 10, "01 4567   b", "01 \\\n>>4567   b"},
      {"blank one too late", 1, 10, "01234567 9a", "01234567\\\n>> 9a"},
      {"behind several blanks", 1, 10, "01   56789a", "01   \\\n>>56789a"},
      {"form feed, vertical tab", 1, 10, "01\v\f4567\xFF\xA0z", "01\v\f\\\n>>4567\xFF\xA0z"},
      {"blanks at the front only", 0, 10, "  23456789a", ">>  \\\n>>23456789a"},
      {"one blank at the front", 1, 10, " 123456789a", " \\\n>>123456789a"},
      {"nothing but blanks", 1, 5, "      ", "   \\\n>>   "},
      {"three lines", 1, 6, "%d %s %x", "%d \\\n>>%s %x"},
      {"width below 3", 1, -7, "abcd", "a\\\n>>bcd"},
      {"empty", 0, 3, "", ">>"},
  };
  for (const auto& c : cases) {
    MemoryStream shown;
    std::fputs("before|", shown.get());
    EXPECT_EQ(TEV8R1_display_string_value(c.first, c.width, c.text, shown.get(), ">>"),
              std::strchr(c.shown, '\n') != nullptr ? PF_NOMORE : PF_NORMAL)
        << c.label;
    std::fputs("|after", shown.get());
    EXPECT_EQ(shown.bytes(), "before|" + std::string(c.shown) + "|after") << c.label;
  }
}

TEST(Display, OnStandardOutputLinesGoOnWithABlank) {
  testing::internal::CaptureStdout();
  TEV8R1_display_string_value(1, 4, "abcdef", stdout, "> ");
  std::fflush(stdout);
  EXPECT_EQ(testing::internal::GetCapturedStdout(), "ab \n> cdef");
}

std::string read_back(std::string text) {
  std::int32_t length = -1;
  EXPECT_EQ(TEV8R1_insert_escape_chars(text.data(), &length), PF_NORMAL);
  EXPECT_EQ(text.c_str()[length], '\0');
  return text.substr(0, static_cast<std::size_t>(length));
}

TEST(Escape, BlocksGrowByTens) {
  const std::string text = "a\n\t\f\b\r\v\\\xFF";
  for (const auto& [room, grown] : {std::pair{10, 20}, {17, 27}, {18, 18}}) {
    std::int32_t size = room;
    char* block = std::strcpy(static_cast<char*>(std::malloc(std::size_t(room))), text.c_str());
    EXPECT_EQ(TEV8R1_remove_escape_chars(&size, &block), PF_NORMAL);
    EXPECT_EQ(size, grown);
    EXPECT_STREQ(block, "a\\n\\t\\f\\b\\r\\v\\\\\xFF");
    EXPECT_EQ(read_back(block), text);
    std::free(block);
  }
}

TEST(Escape, SequencesStandForCharacters) {
  using namespace std::string_literals;
  const struct {
    std::string written, meant;
  } cases[] = {{"", ""},
               {R"(a\tb\bc\fd\ve\r\n)", "a\tb\bc\fd\ve\r\n"},
               {R"(\\n)", R"(\n)"},
               {R"(\101\60)", "A0"},
               {R"(\0123)", "\n3"},
               {R"(\777\18)", "\377\0018"},
               {R"(\q\8\9\")", "q89\""},
               {R"(end\)", R"(end\)"},
               {R"(\\\)", R"(\\)"},
               {R"(a\0b\nc)", "a\0b\nc"s},
               {"\\\377x", "\377x"}};
  for (const auto& c : cases) EXPECT_EQ(read_back(c.written), c.meant) << c.written;
}

}  // namespace
