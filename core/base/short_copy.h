// Copies a few bytes inline, where a call would cost more than the copy.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>

namespace tevpf {

// memcpy. From 16 to 128 bytes, copies 16 at a time; the last 16 may overlap those before.
inline void copy_short(void* to, const void* from, std::int64_t count) noexcept {
  constexpr std::int64_t kStep = 16, kMost = 128;
  auto* const out = static_cast<unsigned char*>(to);
  const auto* const in = static_cast<const unsigned char*>(from);
  if (count < kStep || count > kMost) {
    if (count > 0) std::memcpy(out, in, static_cast<std::size_t>(count));
    return;
  }
  for (std::int64_t at = 0; at < count - kStep; at += kStep) std::memcpy(out + at, in + at, kStep);
  std::memcpy(out + count - kStep, in + count - kStep, kStep);
}

}  // namespace tevpf
