// All allocation goes through this file: blocks from the C runtime, with overflow checks on their
// sizes, that callers can release with free. Test builds can make the n-th request fail.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <type_traits>

#include "include/tevpf.h"

namespace tevpf {

// Allocate a block of count * size bytes (a request for 0 bytes returns a block too). Null when out
// of memory.
[[nodiscard]] void* heap_alloc(std::uint64_t count, std::uint64_t size) noexcept;
[[nodiscard]] void* heap_zeroed(std::uint64_t count, std::uint64_t size) noexcept;

// Resizes a block and keeps its contents; a null block is allocated. Returns null on failure and
// leaves the block unchanged.
[[nodiscard]] void* heap_resize(void* block, std::uint64_t count, std::uint64_t size) noexcept;

// A new copy of a text or of `count` bytes; null when out of memory.
[[nodiscard]] char* heap_copy(const char* text) noexcept;
[[nodiscard]] void* heap_copy(const void* bytes, std::uint64_t count) noexcept;

void heap_free(void* block) noexcept;  // null is allowed

struct FreeBlock {
  void operator()(void* block) const noexcept { heap_free(block); }
};

// Owns a block from its allocation until a record takes ownership.
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

// The capacity to allocate when a block with capacity `room` must hold `needed` entries: at least
// one and a half times the old one, so that adding n entries one by one copies O(n) of them.
constexpr std::int64_t grown_room(std::int64_t room, std::int64_t needed) noexcept {
  const std::int64_t generous = room + room / 2;
  return needed > generous ? needed : generous;
}

#ifdef TEVPF_TEST_HOOKS
// Makes the n-th request from now fail (0: the next one). Later requests succeed again.
void heap_fail_at(std::int64_t n) noexcept;
// Ends the injection; true when the failing request was reached.
bool heap_fail_off() noexcept;
// Makes every request for more than `bytes` bytes fail; UINT64_MAX ends this.
void heap_fail_above(std::uint64_t bytes) noexcept;
#endif

}  // namespace tevpf
