// The sentences: one for every status, whatever the two texts hold, and right where texts are those of
// the failure.
#include <tevpf_message.h>

#include <cstdio>
#include <fstream>
#include <map>
#include <string>
#include <vector>

#include "support/error_texts.h"

namespace {

std::string message_of(TEVPF_STATUS status, const std::string& item, const std::string& value) {
  std::string text(tevpf_message_of(status, item.c_str(), value.c_str(), nullptr, 0), '\0');
  tevpf_message_of(status, item.c_str(), value.c_str(), text.data(), text.size() + 1);
  return text;
}

// The statuses that the header defines.
std::map<std::string, TEVPF_STATUS> defined_statuses() {
  std::map<std::string, TEVPF_STATUS> found;
  std::ifstream header(TEVPF_HEADER);
  char name[20];
  for (std::string line; std::getline(header, line);) {
    TEVPF_STATUS status = 0;
    const int read = std::sscanf(line.c_str(), "#define %19s ((TEVPF_STATUS)0x%x", name, &status);
    if (read == 2) found[name] = status;
  }
  return found;
}

TEST(MessageTest, EveryStatusHasANameAndASentenceWhateverTheTexts) {
  const std::map<std::string, TEVPF_STATUS> statuses = defined_statuses();
  ASSERT_EQ(statuses.size(), 33u);
  for (const auto& [name, status] : statuses) {
    EXPECT_EQ(tevpf_status_name(status), name);
    for (const std::string item : {"", "7", "list", "element", "{1}\x01\n", "column a"}) {
      for (const std::string value : {"", "0", "[2]", "double"}) {
        const std::string text = message_of(status, item, value);
        EXPECT_EQ(text.find("unknown"), std::string::npos) << text;
        EXPECT_EQ(text.find_first_of("\x01\n"), std::string::npos) << text;
        std::string buffer(text.size() + 8, '#');
        for (std::size_t size = 1; size < text.size() + 3; ++size) {
          buffer.assign(buffer.size(), '#');
          ASSERT_EQ(tevpf_message_of(status, item.c_str(), value.c_str(), buffer.data(), size),
                    text.size());
          ASSERT_EQ(std::string(buffer.c_str()), text.substr(0, size - 1));
          ASSERT_EQ(buffer.find_first_not_of('#', size), std::string::npos) << "beyond the buffer";
        }
      }
    }
  }
  for (const TEVPF_STATUS none : {0u, 1u, ~0u, 0x0960806Au, 0x09608008u, 0x09608122u}) {
    EXPECT_STREQ(tevpf_status_name(none), "unknown status");
  }
  EXPECT_EQ(message_of(~0u, "x", "y"), "unknown status 0xffffffff");
}

TEST(MessageTest, SentencesUseTheTextsOfTheirFailureOnly) {
  const struct {
    TEVPF_STATUS status;
    ErrorTexts texts;
    const char* sentence;
  } cases[] = {
      {PF_RANGE, {"900", ""}, "900 is out of range"},
      {PF_RANGE, {"900", "Thrust"}, "'Thrust': 900 is out of range"},
      {PF_BADARG, {"1\t2\x7F", "integer"}, "'1\\t2\\x7f' is not a number of type integer"},
      {PF_BADARG, {"\r", "short"}, "'\\r' is not a number of type short"},
      {PF_BADARG, {"x", "real"}, "'x' is not a number of type real"},
      {PF_BADARG, {"Thrust", ""}, "an argument is invalid"},
      {PF_BADPOS, {"-1", "3"}, "position -1 is out of range; the number of entries is 3"},
      {PF_BADPOS, {"Thrust", ""}, "the position is out of range"},
      {PF_DUPLICATE, {"column a b", "table t"}, "column 'a b' is already in table 't'"},
      {PF_DUPLICATE, {"list x", "the file"}, "list 'x' is already in the file"},
      {PF_BADTYPE, {"elementOdd", "7"}, "element 'Odd' is of kind 7, neither list nor table"},
      {PF_BADTYPE, {"function call ", "3"}, "there is no type 3"},
      {PF_BADTYPE, {"column", "16"}, "there is no column type 16"},
      {PF_BADTYPE, {"parameter n", "short"}, "parameter 'n' is of type short"},
      {PF_NOELEM, {"table", "x"}, "there is no table 'x'"},
      {PF_BADPREC, {"0", "r"}, "'r': precision 0 is below 1"},
      {PF_BADFORMAT,
       {"table data", ""},
       "the file ends inside the rows of a table, or is damaged there"},
      {PF_BADFORMAT,
       {"table data", "t"},
       "the file ends inside the rows of table 't', or is damaged there"},
      {PF_BADFORMAT,
       {"list index", "l"},
       "the file ends inside the name index of list 'l', or is damaged there"},
      {PF_OPENFAIL, {"a.pf", "old"}, "'a.pf' cannot be opened or written"},
      {PF_BADRANGE, {"900", ""}, "the maximum is below the minimum"},
  };
  for (const auto& [status, texts, sentence] : cases) {
    EXPECT_EQ(message_of(status, texts.item, texts.value), sentence);
    set_error_texts(texts);
    char buffer[300];
    EXPECT_EQ(tevpf_message(status, buffer, sizeof buffer), std::string(sentence).size());
    EXPECT_STREQ(buffer, sentence);
    EXPECT_EQ(tevpf_error_item(), texts.item);
    EXPECT_EQ(tevpf_error_value(), texts.value);
  }
  tevpf_clear_error();
  EXPECT_EQ(error_texts(), kEmpty);
}

}  // namespace
