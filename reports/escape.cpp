#include "reports/escape.h"

#include <algorithm>
#include <cstring>

#include "core/base/heap.h"
#include "core/base/status.h"

using namespace tevpf;

namespace {

constexpr std::int64_t kGrowth = 10;  // bytes per growth step; visible in the caller's size

// The character that an escape letter stands for; an unknown letter stands for itself.
char unescape_letter(char letter) noexcept {
  const std::size_t place = kEscapeLetters.find(letter);
  return place == std::string_view::npos ? letter : kEscaped[place];
}

bool is_octal(char digit) noexcept { return digit >= '0' && digit <= '7'; }

// Reads one to three octal digits and keeps the low 8 bits of the number.
char read_octal(const char*& from) noexcept {
  unsigned number = 0;
  for (int digits = 0; digits < 3 && is_octal(*from); ++digits) {
    number = number * 8 + static_cast<unsigned>(*from++ - '0');
  }
  return static_cast<char>(static_cast<unsigned char>(number));
}

// The size that a block grows to: one step before each expansion that finds fewer than two spare
// bytes.
std::int64_t grown_size(std::int64_t size, std::int64_t used, std::int64_t expansions) noexcept {
  for (; expansions > 0; --expansions, ++used) {
    if (size - 1 <= used) size += kGrowth;
  }
  return size;
}

}  // namespace

TEVPF_STATUS TEV8R1_remove_escape_chars(std::int32_t* size, char** buffer) noexcept {
  const std::int64_t length = static_cast<std::int64_t>(std::strlen(*buffer));
  const std::int64_t expansions =
      std::count_if(*buffer, *buffer + length, [](char c) { return escape_letter(c) != 0; });
  if (expansions == 0) return PF_NORMAL;

  const std::int64_t grown = grown_size(*size, length + 1, expansions);
  if (grown > INT32_MAX || grown < length + expansions + 1) return fail_empty(PF_NOMEM);
  if (grown != *size) {
    void* block = heap_resize(*buffer, static_cast<std::uint64_t>(grown), 1);
    if (block == nullptr) return fail_empty(PF_NOMEM);
    *buffer = static_cast<char*>(block);
    *size = static_cast<std::int32_t>(grown);
  }

  // Work backwards, so that each character moves only once.
  char* to = *buffer + length + expansions;
  for (const char* from = *buffer + length; to != from; --from, --to) {
    const char letter = escape_letter(*from);
    *to = letter == 0 ? *from : letter;
    if (letter != 0) *--to = '\\';
  }
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_insert_escape_chars(char* text, std::int32_t* length_out) noexcept {
  const char* const end = text + std::strlen(text);
  const char* from = text;
  char* to = text;
  while (from != end) {
    if (*from != '\\' || from + 1 == end) {
      *to++ = *from++;
      continue;
    }
    ++from;
    *to++ = is_octal(*from) ? read_octal(from) : unescape_letter(*from++);
  }
  *to = '\0';
  *length_out = static_cast<std::int32_t>(to - text);
  return PF_NORMAL;
}
