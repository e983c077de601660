#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <random>
#include <string>

#include "include/tevpf.h"

namespace {

std::string read_back(const std::string& text) {
  std::string buffer = text;
  std::int32_t length = -1;
  EXPECT_EQ(TEV8R1_insert_escape_chars(buffer.data(), &length), PF_NORMAL);
  EXPECT_EQ(buffer.c_str()[length], '\0');
  return buffer.substr(0, static_cast<std::size_t>(length));
}

// What the block's size must be in the end, one expansion after the other.
std::int32_t expected_size(std::int32_t size, const std::string& text) {
  std::int32_t used = static_cast<std::int32_t>(text.size()) + 1;
  for (const char c : text) {
    if (std::strchr("\n\t\f\b\r\v\\", c) == nullptr) continue;
    if (size - 1 <= used) size += 10;
    ++used;
  }
  return size;
}

// Any bytes, special ones often, with any number of bytes to spare in the block.
TEST(Escape, RandomTextsComeBackAndBlocksGrowByTens) {
  std::mt19937 random(20240611);
  for (int round = 0; round < 20000; ++round) {
    std::string text(random() % 60, '\0');
    for (char& c : text) {
      c = random() % 2 == 0 ? "\n\t\f\b\r\v\\8n0"[random() % 10]
                            : static_cast<char>(1 + random() % 255);
    }
    std::int32_t size = static_cast<std::int32_t>(text.size() + 1 + random() % 15);
    const std::int32_t grown = expected_size(size, text);
    char* block = static_cast<char*>(std::malloc(static_cast<std::size_t>(size)));
    std::memcpy(block, text.c_str(), text.size() + 1);
    ASSERT_EQ(TEV8R1_remove_escape_chars(&size, &block), PF_NORMAL);
    const std::string escaped = block;
    std::free(block);
    ASSERT_EQ(size, grown) << "round " << round;
    ASSERT_EQ(escaped.find_first_of("\n\t\f\b\r\v"), std::string::npos);
    ASSERT_EQ(read_back(escaped), text) << "round " << round;
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
