// Values and texts as JSON that reads back as the same bytes. Numbers are written in the fewest
// digits; what is not a number is null, the infinities are "inf" and "-inf", and a text that is not
// UTF-8 is {"bytes": "..."} with its bytes in hexadecimal.
#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "values.h"

namespace tool {

// Control characters are escapes, also those from DEL on.
std::string text_json(std::string_view text);

std::string value_json(const Value& value);

// {"name": "x", ...}, on one line. Members are in the order in which they are added.
class JsonObject {
 public:
  void add(std::string_view key, std::string_view json);
  void add_text(std::string_view key, std::string_view text) { add(key, text_json(text)); }
  std::string text() const { return "{" + members_ + "}"; }

 private:
  std::string members_;
};

// A member whose value is an array with one line for each item.
class JsonLines {
 public:
  explicit JsonLines(std::string& text) : text_(text) { text_ += "["; }
  void add(std::string_view item) {
    text_ += is_first_ ? "\n" : ",\n";
    text_ += item;
    is_first_ = false;
  }
  void finish() { text_ += is_first_ ? "]" : "\n]"; }

 private:
  std::string& text_;
  bool is_first_ = true;
};

}  // namespace tool
