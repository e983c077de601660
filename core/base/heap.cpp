// Allocation from the C runtime, and the exported helpers for raw memory.
#include "core/base/heap.h"

#include <cstdlib>
#include <cstring>

#ifdef __linux__
#include <sys/mman.h>
#include <unistd.h>
#endif

#include "core/base/status.h"

namespace tevpf {

namespace {

#ifdef TEVPF_TEST_HOOKS
constexpr std::int64_t kNever = -1;
std::int64_t requests_until_failure = kNever;
std::uint64_t largest_block = UINT64_MAX;
bool failure_reached = false;

bool must_fail(std::uint64_t bytes) noexcept {
  if (bytes > largest_block) return true;
  if (requests_until_failure < 0) return false;
  if (requests_until_failure-- > 0) return false;
  failure_reached = true;
  return true;
}
#else
constexpr bool must_fail(std::uint64_t) noexcept { return false; }
#endif

// Requests huge pages for a large block: fresh memory then takes one page fault per 2 MB instead of
// 512, and random row access rarely misses in the TLB. This is only a hint. It covers every page
// that the block touches, because a mapping that is only partly advised cannot grow without being
// copied.
void* in_large_pages(void* block, [[maybe_unused]] std::size_t bytes) noexcept {
#ifdef __linux__
  constexpr std::size_t kLarge = std::size_t{4} << 20;
  if (block == nullptr || bytes < kLarge) return block;
  const auto page = static_cast<std::uintptr_t>(sysconf(_SC_PAGESIZE));
  const std::uintptr_t first = reinterpret_cast<std::uintptr_t>(block) & ~(page - 1);
  const std::uintptr_t end =
      (reinterpret_cast<std::uintptr_t>(block) + bytes + page - 1) & ~(page - 1);
  (void)madvise(reinterpret_cast<void*>(first), end - first, MADV_HUGEPAGE);
#endif
  return block;
}

// The size in bytes of a block of count * size, at least 1; 0 if no block can be that large.
std::size_t block_bytes(std::uint64_t count, std::uint64_t size) noexcept {
  if (count == 0 || size == 0) return 1;
  if (count > static_cast<std::uint64_t>(PTRDIFF_MAX) / size) return 0;
  return static_cast<std::size_t>(count * size);
}

}  // namespace

void* heap_alloc(std::uint64_t count, std::uint64_t size) noexcept {
  const std::size_t bytes = block_bytes(count, size);
  return bytes == 0 || must_fail(bytes) ? nullptr : in_large_pages(std::malloc(bytes), bytes);
}

void* heap_zeroed(std::uint64_t count, std::uint64_t size) noexcept {
  const std::size_t bytes = block_bytes(count, size);
  return bytes == 0 || must_fail(bytes) ? nullptr : in_large_pages(std::calloc(bytes, 1), bytes);
}

void* heap_resize(void* block, std::uint64_t count, std::uint64_t size) noexcept {
  const std::size_t bytes = block_bytes(count, size);
  return bytes == 0 || must_fail(bytes) ? nullptr
                                        : in_large_pages(std::realloc(block, bytes), bytes);
}

char* heap_copy(const char* text) noexcept {
  return static_cast<char*>(heap_copy(text, std::strlen(text) + 1));
}

void* heap_copy(const void* bytes, std::uint64_t count) noexcept {
  void* copy = heap_alloc(count, 1);
  if (copy != nullptr && count != 0) std::memcpy(copy, bytes, static_cast<std::size_t>(count));
  return copy;
}

void heap_free(void* block) noexcept { std::free(block); }

#ifdef TEVPF_TEST_HOOKS
void heap_fail_at(std::int64_t n) noexcept {
  requests_until_failure = n;
  failure_reached = false;
}

bool heap_fail_off() noexcept {
  requests_until_failure = kNever;
  return failure_reached;
}

void heap_fail_above(std::uint64_t bytes) noexcept { largest_block = bytes; }
#endif

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_memcpy(std::int32_t count, const void* source, void* destination) noexcept {
  if (count > 0) std::memmove(destination, source, static_cast<std::size_t>(count));
  return PF_NORMAL;
}

char* TEV8R1_strdup(const char* text) noexcept { return heap_copy(text); }

TEVPF_STATUS TEV8R1_allocate_elem(std::int32_t count, std::int32_t increment, std::int32_t size,
                                  void** array, void** first_new_out) noexcept {
  // Negative numbers describe a block that cannot be allocated.
  if (count < 0 || increment < 0 || size < 0) return fail_empty(PF_NOMEM);
  const auto entries = static_cast<std::uint64_t>(std::int64_t{count} + increment);
  const auto bytes = static_cast<std::uint64_t>(size);
  void* block = count == 0 ? heap_zeroed(entries, bytes) : heap_resize(*array, entries, bytes);
  if (block == nullptr) return fail_empty(PF_NOMEM);
  *array = block;
  *first_new_out = static_cast<unsigned char*>(block) + std::int64_t{count} * size;
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_insert_index_value(std::int32_t* array, std::int32_t count,
                                       std::int32_t position, std::int32_t value) noexcept {
  if (position < 0 || position > count) return PF_NORMAL;  // out of range: nothing to insert
  const auto behind = static_cast<std::size_t>(count - position);
  std::memmove(array + position + 1, array + position, behind * sizeof *array);
  array[position] = value;
  return PF_NORMAL;
}
