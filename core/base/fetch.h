// Asking for memory before it is needed.
#pragma once

#include <cstddef>
#include <cstdint>

namespace tevpf {

// For walks that go up through memory and are at `place`: asks for what they will come to, both ends of
// so many bytes. The processor does so of itself, but not beyond a page. Behind the end of a block it
// does no harm. As a function of its own it would have no effect that the compiler knows of, and be
// left out.
[[gnu::always_inline]] inline void fetch_along(const void* place, std::size_t bytes = 1) noexcept {
  constexpr std::uintptr_t kAhead = 2048;
  const std::uintptr_t ahead = reinterpret_cast<std::uintptr_t>(place) + kAhead;
  __builtin_prefetch(reinterpret_cast<const void*>(ahead));
  if (bytes > 1) __builtin_prefetch(reinterpret_cast<const void*>(ahead + bytes - 1));
}

}  // namespace tevpf
