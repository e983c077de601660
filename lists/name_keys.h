// Keys for searches in the name index: eight bytes of a name as a number. Names of a list often
// begin alike, so the bytes are taken from behind the beginning that all of them have in common.
// Names in one list with different keys are ordered by their keys.
#pragma once

#include <algorithm>
#include <bit>
#include <cstdint>
#include <cstring>

#include "core/base/text_word.h"
#include "lists/list.h"

namespace tevpf {

using NameKey = std::uint64_t;

// The key of a terminated name that begins with `skipped` bytes which are left out.
inline NameKey key_of_name(const NameField& name, std::int32_t skipped) noexcept {
  constexpr std::int32_t kLastWord = TEVPF_NAME_SIZE - std::int32_t{sizeof(NameKey)};
  const std::int32_t offset = std::min(skipped, kLastWord);
  NameKey word = load_word(name + offset) >> (8 * (skipped - offset));
  const std::uint64_t zeros = zero_bytes(word);  // nothing counts from the terminator on
  if (zeros != 0) word &= ((zeros & (0 - zeros)) >> 7) - 1;
  return __builtin_bswap64(word);
}

// The number of bytes that both names begin with.
inline std::int32_t common_length(const NameField& a, const NameField& b) noexcept {
  std::int32_t length = 0;
  while (a[length] != '\0' && a[length] == b[length]) ++length;
  return length;
}

}  // namespace tevpf
