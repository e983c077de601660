#include "text.h"

#include <algorithm>
#include <array>
#include <numeric>
#include <utility>

#include "sql/utf8.h"

namespace tool {
namespace {

using sql::character_size;
using sql::is_continuation;

char lower(char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c; }

// How many letters must be changed, added, left out or swapped with the next one to make one name of
// the other; capitals do not count.
std::size_t distance(std::string_view a, std::string_view b) {
  std::vector<std::size_t> before(b.size() + 1), last(b.size() + 1), now(b.size() + 1);
  std::iota(last.begin(), last.end(), std::size_t{0});
  for (std::size_t i = 1; i <= a.size(); ++i) {
    now[0] = i;
    for (std::size_t j = 1; j <= b.size(); ++j) {
      const auto same = [&](std::size_t x, std::size_t y) { return lower(a[x]) == lower(b[y]); };
      now[j] = std::min({last[j] + 1, now[j - 1] + 1, last[j - 1] + (same(i - 1, j - 1) ? 0 : 1)});
      if (i > 1 && j > 1 && same(i - 1, j - 2) && same(i - 2, j - 1)) {
        now[j] = std::min(now[j], before[j - 2] + 1);
      }
    }
    std::swap(before, last);
    std::swap(last, now);
  }
  return last[b.size()];
}

// Bytes of the UTF-8 character at the front of a text, 0 when there is none that may be shown: control
// characters are those of ASCII and U+0080 to U+009F.
std::size_t printable_sequence(std::string_view text) {
  const auto lead = static_cast<unsigned char>(text[0]);
  if (lead < 0x20 || lead == 0x7F) return 0;
  if (lead == 0xC2 && text.size() > 1 && static_cast<unsigned char>(text[1]) < 0xA0) return 0;
  return character_size(text);
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

std::string_view first_characters(std::string_view text, std::size_t count) {
  std::size_t end = 0;
  while (end < text.size() && (count > 0 || is_continuation(text[end]))) {
    if (!is_continuation(text[end])) --count;
    ++end;
  }
  return text.substr(0, end);
}

std::string did_you_mean(std::string_view name, const std::vector<std::string>& names) {
  // A third of a short name is another name.
  std::size_t least = std::clamp<std::size_t>(name.size() / 3, 1, 3) + 1;
  const std::string* nearest = nullptr;
  for (const std::string& candidate : names) {
    const std::size_t far = distance(name, candidate);
    if (far < std::min(least, std::max<std::size_t>(candidate.size(), 1))) {
      least = far;
      nearest = &candidate;
    }
  }
  return nearest == nullptr ? "" : "; did you mean " + in_quotes(*nearest) + "?";
}

bool is_utf8(std::string_view text) {
  while (!text.empty()) {
    const std::size_t size = character_size(text);
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
