// The only file that allocates: blocks of the C runtime, sized with overflow checks, that callers
// can release with free. Test builds can make the n-th request fail.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <type_traits>

#include "include/tevpf.h"

namespace tevpf {

// New blocks of count * size bytes (a request of 0 bytes gets a block too); null when there is
// none.
[[nodiscard]] void* heap_alloc(std::uint64_t count, std::uint64_t size) noexcept;
[[nodiscard]] void* heap_zeroed(std::uint64_t count, std::uint64_t size) noexcept;

// Resizes a block, keeping its contents (null makes a new one); on failure null, the block stays.
[[nodiscard]] void* heap_resize(void* block, std::uint64_t count, std::uint64_t size) noexcept;

// A new copy of a text or of some bytes; null when there is no memory.
[[nodiscard]] char* heap_copy(const char* text) noexcept;
[[nodiscard]] void* heap_copy(const void* bytes, std::uint64_t count) noexcept;

void heap_free(void* block) noexcept;  // null is fine

struct FreeBlock {
  void operator()(void* block) const noexcept { heap_free(block); }
};

// Owns a block for the time between getting it and handing it to a record.
template <class T>
using Owned = std::unique_ptr<T[], FreeBlock>;

template <class T>
[[nodiscard]] Owned<T> new_array(std::uint64_t count) noexcept {
  static_assert(std::is_trivially_copyable_v<T> && std::is_trivially_destructible_v<T>);
  return Owned<T>(static_cast<T*>(heap_alloc(count, sizeof(T))));
}

template <class T>
[[nodiscard]] Owned<T> new_zeroed(std::uint64_t count) noexcept {
  static_assert(std::is_trivially_copyable_v<T> && std::is_trivially_destructible_v<T>);
  return Owned<T>(static_cast<T*>(heap_zeroed(count, sizeof(T))));
}

// The room to ask for when a block that holds `room` entries must hold `needed`: half as much
// again, so that adding n entries one by one copies O(n) of them.
constexpr std::int64_t grown_room(std::int64_t room, std::int64_t needed) noexcept {
  const std::int64_t generous = room + room / 2;
  return needed > generous ? needed : generous;
}

#ifdef TEVPF_TEST_HOOKS
// Lets the n-th request from now on fail (0: the next one), and every later one succeed again.
void heap_fail_at(std::int64_t n) noexcept;
// Ends that; true when the request was reached.
bool heap_fail_off() noexcept;
// Lets every request for more than that many bytes fail; UINT64_MAX ends it.
void heap_fail_above(std::uint64_t bytes) noexcept;
#endif

}  // namespace tevpf
