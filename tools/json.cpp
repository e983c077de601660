#include "json.h"

#include <cmath>

#include "sql/from_chars.h"
#include "sql/utf8.h"
#include "text.h"

namespace tool {
namespace {

constexpr std::string_view kDigits = "0123456789abcdef";

void append_hex(std::string& result, char byte) {
  result += kDigits[static_cast<unsigned char>(byte) >> 4U];
  result += kDigits[static_cast<unsigned char>(byte) & 0xFU];
}

std::string bytes_json(std::string_view text) {
  std::string result = "{\"bytes\": \"";
  for (const char byte : text) append_hex(result, byte);
  return result += "\"}";
}

void append_escape(std::string& result, char byte) {
  switch (byte) {
    case '"':
    case '\\':
      result += '\\';
      result += byte;
      break;
    case '\n':
      result += "\\n";
      break;
    case '\r':
      result += "\\r";
      break;
    case '\t':
      result += "\\t";
      break;
    default:
      result += "\\u00";
      append_hex(result, byte);
  }
}

template <class T>
std::string number_json(T number) {
  if (number != number) return "null";
  if (std::isinf(number)) return number < 0 ? "\"-inf\"" : "\"inf\"";
  if (number == 0 && std::signbit(number)) return "-0.0";  // "-0" reads as an integer
  std::string text = exact_text(number);
  if constexpr (std::is_same_v<T, float>) {
    // Readers take numbers as doubles first: rounding twice must not lead elsewhere.
    double wide = 0;
    sql::from_chars(text.data(), text.data() + text.size(), wide);
    if (static_cast<float>(wide) != number) text = exact_text(static_cast<double>(number));
  }
  return text;
}

}  // namespace

std::string text_json(std::string_view text) {
  std::string result = "\"";
  for (std::string_view rest = text; !rest.empty();) {
    const std::size_t size = sql::character_size(rest);
    if (size == 0) return bytes_json(text);
    const char first = rest[0];
    const bool is_control = static_cast<unsigned char>(first) < 0x20 || first == '\x7F';
    // U+0080 to U+009F are C2 and their own number.
    const bool is_late_control = first == '\xC2' && rest[1] < '\xA0';
    if (is_control || is_late_control || first == '"' || first == '\\') {
      append_escape(result, is_late_control ? rest[1] : first);
    } else {
      result += rest.substr(0, size);
    }
    rest.remove_prefix(size);
  }
  return result += '"';
}

std::string value_json(const Value& value) {
  return std::visit(
      [](const auto& v) -> std::string {
        using T = std::decay_t<decltype(v)>;
        if constexpr (std::is_same_v<T, std::string>) {
          return text_json(v);
        } else if constexpr (std::is_floating_point_v<T>) {
          return number_json(v);
        } else {
          return std::to_string(v);
        }
      },
      value);
}

void JsonObject::add(std::string_view key, std::string_view json) {
  if (!members_.empty()) members_ += ", ";
  members_ += text_json(key);
  members_ += ": ";
  members_ += json;
}

}  // namespace tool
