#include "text.h"

#include <algorithm>
#include <array>

namespace tool {
namespace {

bool is_continuation(char byte) { return (static_cast<unsigned char>(byte) & 0xC0) == 0x80; }

// Bytes of the UTF-8 sequence at the front of a text, 0 when there is none. Overlong forms and
// surrogates fail by their second byte.
std::size_t sequence(std::string_view text) {
  const auto lead = static_cast<unsigned char>(text[0]);
  const std::size_t size = lead < 0x80   ? 1
                           : lead < 0xC2 ? 0
                           : lead < 0xE0 ? 2
                           : lead < 0xF0 ? 3
                           : lead < 0xF5 ? 4
                                         : 0;
  if (size < 2) return size;
  if (text.size() < size) return 0;
  if (!std::all_of(text.begin() + 1, text.begin() + static_cast<std::ptrdiff_t>(size),
                   is_continuation)) {
    return 0;
  }
  const auto second = static_cast<unsigned char>(text[1]);
  const bool refused = (lead == 0xE0 && second < 0xA0) || (lead == 0xED && second >= 0xA0) ||
                       (lead == 0xF0 && second < 0x90) || (lead == 0xF4 && second >= 0x90);
  return refused ? 0 : size;
}

// The same without control characters: those of ASCII and U+0080 to U+009F.
std::size_t printable_sequence(std::string_view text) {
  const auto lead = static_cast<unsigned char>(text[0]);
  if (lead < 0x20 || lead == 0x7F) return 0;
  if (lead == 0xC2 && text.size() > 1 && static_cast<unsigned char>(text[1]) < 0xA0) return 0;
  return sequence(text);
}

std::string escape(char byte) {
  switch (byte) {
    case '\n':
      return "\\n";
    case '\r':
      return "\\r";
    case '\t':
      return "\\t";
    default:
      break;
  }
  static constexpr std::string_view kDigits = "0123456789abcdef";
  const auto value = static_cast<unsigned char>(byte);
  return {'\\', 'x', kDigits[value >> 4U], kDigits[value & 0xFU]};
}

// The bytes at the front of a text that lay out lines.
std::size_t layout_sequence(std::string_view text) {
  if (text[0] == '\n' || text[0] == '\t' || text[0] == '\f') return 1;
  return text.starts_with("\r\n") ? 2 : 0;
}

std::size_t nothing(std::string_view) { return 0; }

std::string escaped(std::string_view text, std::size_t (*kept)(std::string_view)) {
  std::string result;
  result.reserve(text.size());
  while (!text.empty()) {
    const std::size_t size = std::max(printable_sequence(text), kept(text));
    if (size > 0) {
      result += text.substr(0, size);
    } else {
      result += escape(text[0]);
    }
    text.remove_prefix(std::max<std::size_t>(size, 1));
  }
  return result;
}

}  // namespace

std::string visible(std::string_view text) { return escaped(text, nothing); }

std::string visible_lines(std::string_view text) { return escaped(text, layout_sequence); }

std::string in_quotes(std::string_view text) { return "'" + visible(text) + "'"; }

std::size_t display_width(std::string_view text) {
  return text.size() -
         static_cast<std::size_t>(std::count_if(text.begin(), text.end(), is_continuation));
}

bool is_utf8(std::string_view text) {
  while (!text.empty()) {
    const std::size_t size = sequence(text);
    if (size == 0) return false;
    text.remove_prefix(size);
  }
  return true;
}

std::string_view trimmed(std::string_view text) {
  const std::size_t first = text.find_first_not_of(" \t");
  if (first == std::string_view::npos) return {};
  return text.substr(first, text.find_last_not_of(" \t") - first + 1);
}

std::string_view cut(std::string_view text, std::size_t size) {
  constexpr std::size_t kLongestCharacter = 4;
  if (text.size() <= size) return text;
  std::size_t end = size;
  while (end > 0 && size - end < kLongestCharacter && is_continuation(text[end])) --end;
  // A text that is no UTF-8 is cut anywhere.
  return text.substr(0, is_continuation(text[end]) ? size : end);
}

std::string counted(std::uintmax_t count, std::string_view noun) {
  std::string result = std::to_string(count) + " ";
  result += noun;
  if (count != 1) result += 's';
  return result;
}

}  // namespace tool
