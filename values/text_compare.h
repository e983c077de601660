// The order of names and strings, and patterns that match whatever starts with them.
#pragma once

#include <cstddef>
#include <cstring>

namespace tevpf {

// What texts are compared with. Examined once, used for a whole search; it points to the text it
// was made from.
struct TextPattern {
  const char* text;
  std::size_t length;  // of the text; of a prefix: without the "*"
  bool prefix;         // equals every text that starts with it
};

// A text whose first "*" is its last character is a prefix; every other "*" is a character.
inline TextPattern make_pattern(const char* text) noexcept {
  const char* const star = std::strchr(text, '*');
  if (star != nullptr && star[1] == '\0') {
    return {text, static_cast<std::size_t>(star - text), true};
  }
  return {text, std::strlen(text), false};
}

// Below 0, 0 or above 0 for a text before, equal to or after the pattern. Bytes are unsigned; a
// text stands before its extensions.
inline int compare_text(const char* text, const TextPattern& pattern) noexcept {
  return pattern.prefix ? std::strncmp(text, pattern.text, pattern.length)
                        : std::strcmp(text, pattern.text);
}

}  // namespace tevpf
