#include "json.h"

#include <string_view>

namespace tool {

std::string json_text(const Json& json, int indent) {
  static constexpr std::string_view kDigits = "0123456789abcdef";
  const std::string text = json.dump(indent, ' ', false, Json::error_handler_t::replace);
  std::string result;
  result.reserve(text.size());
  for (std::size_t i = 0; i < text.size(); ++i) {
    // U+0080 to U+009F are C2 and their own number in UTF-8.
    const bool is_pair = text[i] == '\xC2' && text[i + 1] < '\xA0';
    if (is_pair) ++i;
    if (is_pair || text[i] == '\x7F') {
      const auto code = static_cast<unsigned char>(text[i]);
      result += "\\u00";
      result += kDigits[code >> 4U];
      result += kDigits[code & 0xFU];
    } else {
      result += text[i];
    }
  }
  return result;
}

}  // namespace tool
