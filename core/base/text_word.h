// Texts processed eight bytes at a time; the first byte is the least significant.
#pragma once

#include <cstdint>
#include <cstring>

namespace tevpf {

inline std::uint64_t load_word(const void* bytes) noexcept {
  std::uint64_t word;
  std::memcpy(&word, bytes, sizeof word);
  return word;
}

// The lowest set bit of the result is the high bit of the first zero byte; 0 if no byte is zero.
constexpr std::uint64_t zero_bytes(std::uint64_t word) noexcept {
  return (word - 0x0101010101010101u) & ~word & 0x8080808080808080u;
}

}  // namespace tevpf
