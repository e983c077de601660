// UTF-8, the encoding of SQLite's texts and of the tool's.
#pragma once

#include <cstddef>
#include <string_view>

namespace sql {

constexpr bool is_continuation(char byte) {
  return (static_cast<unsigned char>(byte) & 0xC0U) == 0x80;
}

// Bytes of the character at the front of a text that is not empty; 0 when there is none. Overlong
// forms, surrogates and what lies beyond U+10FFFF fail by their second byte.
constexpr std::size_t character_size(std::string_view text) {
  const auto byte = [&](std::size_t i) { return static_cast<unsigned char>(text[i]); };
  const unsigned lead = byte(0);
  if (lead < 0x80) return 1;
  const std::size_t size = lead < 0xC2   ? 0
                           : lead < 0xE0 ? 2
                           : lead < 0xF0 ? 3
                           : lead < 0xF5 ? 4
                                         : 0;
  if (size == 0 || text.size() < size) return 0;
  for (std::size_t i = 1; i < size; ++i) {
    if (!is_continuation(text[i])) return 0;
  }
  const unsigned second = byte(1);
  const bool is_refused = (lead == 0xE0 && second < 0xA0) || (lead == 0xED && second >= 0xA0) ||
                          (lead == 0xF0 && second < 0x90) || (lead == 0xF4 && second >= 0x90);
  return is_refused ? 0 : size;
}

}  // namespace sql
