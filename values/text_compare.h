// The order of names and strings, and patterns that match whatever starts with them.
#pragma once

#include <cstddef>
#include <cstring>

namespace tevpf {

// The right operand of text comparisons. Built once for a whole search; it points to the text it
// was made from and does not own it.
struct TextPattern {
  const char* text;
  std::size_t length;  // of the text; for a prefix, without the "*"
  bool prefix;         // equals every text that starts with it
};

// A text whose first "*" is its last character is a prefix pattern; any other "*" is an ordinary
// character.
inline TextPattern make_pattern(const char* text) noexcept {
  const char* const star = std::strchr(text, '*');
  if (star != nullptr && star[1] == '\0') {
    return {text, static_cast<std::size_t>(star - text), true};
  }
  return {text, std::strlen(text), false};
}

// Negative, 0 or positive if the text sorts before, equal to or after the pattern. Bytes compare as
// unsigned; a text sorts before its extensions.
inline int compare_text(const char* text, const TextPattern& pattern) noexcept {
  return pattern.prefix ? std::strncmp(text, pattern.text, pattern.length)
                        : std::strcmp(text, pattern.text);
}

}  // namespace tevpf
