// Escapes and conversions over arbitrary texts: what is escaped reads back, what converts prints and
// converts again to the same value, and a prefix pattern matches what it was cut from.
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>
#include <vector>

#include "include/tevpf.h"
#include "support/drive.h"

namespace {

void escape_and_back(const std::string& text) {
  std::int32_t size = static_cast<std::int32_t>(text.size()) + 1, length = 0;
  char* block = TEV8R1_strdup(text.c_str());
  require(TEV8R1_remove_escape_chars(&size, &block) == PF_NORMAL, "escaping");
  require(std::strpbrk(block, "\n\t\f\b\r\v") == nullptr, "control characters are gone");
  require(size > static_cast<std::int32_t>(std::strlen(block)), "the block holds its text");
  TEV8R1_insert_escape_chars(block, &length);
  require(std::string(block, length) == text, "reading back gives the text");
  std::free(block);
}

void read_any_escapes(const std::string& text) {
  std::vector<char> exact(text.c_str(), text.c_str() + text.size() + 1);
  std::int32_t length = -1;
  TEV8R1_insert_escape_chars(exact.data(), &length);
  require(length >= 0 && static_cast<std::size_t>(length) <= text.size(), "escapes only shrink");
}

template <class T>
void convert_and_back(std::int32_t type, const std::string& text, const char* format) {
  T value{}, again{};
  if (TEV8R1_from_char(type, text.c_str(), &value) != PF_NORMAL || text.empty()) return;
  char printed[64];
  std::int32_t length = 0;
  require(TEV8R1_to_char(type, format, &value, printed, &length) == PF_NORMAL, "printing a value");
  require(std::strlen(printed) == static_cast<std::size_t>(length), "printed length");
  const TEVPF_STATUS status = TEV8R1_from_char(type, printed, &again);
  if (status == PF_RANGE) return;  // leading zeros go by length, subnormals are out of range
  require(status == PF_NORMAL && std::memcmp(&value, &again, sizeof value) == 0, "converting back");
}

void compare_and_match(const std::string& text) {
  const std::string prefix = text.substr(0, text.size() / 2), pattern = prefix + "*";
  const bool matches = TEV8R1_string_compare(text.c_str(), pattern.c_str()) == PF_NORMAL;
  require(matches || prefix.find('*') != std::string::npos, "a prefix matches");
  if (text.find('*') != std::string::npos) return;
  const std::string other(text.rbegin(), text.rend());
  const auto there = static_cast<std::int32_t>(TEV8R1_string_compare(text.c_str(), other.c_str()));
  const auto back = static_cast<std::int32_t>(TEV8R1_string_compare(other.c_str(), text.c_str()));
  require(there == -back || (text == other && there == back), "an order");
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string text = std::string(data, data + size).c_str();  // up to its first zero
  escape_and_back(text);
  read_any_escapes(text);
  convert_and_back<std::int32_t>(PF_TYPE_INT, text, nullptr);
  convert_and_back<std::int16_t>(PF_TYPE_SHORT, text, nullptr);
  convert_and_back<float>(PF_TYPE_REAL, text, "%.9g");
  convert_and_back<double>(PF_TYPE_DOUBLE, text, "%.17g");
  compare_and_match(text);
  return 0;
}
