// Prefetches memory.
#pragma once

#include <cstddef>
#include <cstdint>

namespace tevpf {

// Prefetches for a walk towards higher addresses that has reached `place`: the first and the last
// of `bytes` bytes, a fixed distance ahead. The hardware prefetcher stops at page boundaries.
// Prefetching past the end of a block is harmless. The function must be inlined: the compiler sees
// no effect in a separate call and may remove it.
[[gnu::always_inline]] inline void fetch_along(const void* place, std::size_t bytes = 1) noexcept {
  constexpr std::uintptr_t kAhead = 2048;
  const std::uintptr_t ahead = reinterpret_cast<std::uintptr_t>(place) + kAhead;
  __builtin_prefetch(reinterpret_cast<const void*>(ahead));
  if (bytes > 1) __builtin_prefetch(reinterpret_cast<const void*>(ahead + bytes - 1));
}

}  // namespace tevpf
