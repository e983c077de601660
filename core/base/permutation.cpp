#include "core/base/permutation.h"

#include <cstring>

#include "core/base/heap.h"

namespace tevpf {

namespace {

constexpr std::uint32_t kBits = 64;

// n entries below n that cover every number form a permutation. For small n: one bit per number.
bool few_reach_all(const std::int32_t* entries, std::uint32_t count) noexcept {
  std::uint64_t reached = 0;
  for (std::uint32_t i = 0; i < count; ++i) {
    const auto entry = static_cast<std::uint32_t>(entries[i]);  // a negative one is too large
    if (entry >= count) return false;
    reached |= std::uint64_t{1} << entry;
  }
  return reached == ~std::uint64_t{0} >> (kBits - count);
}

// One byte per number: each entry is a plain store that does not depend on the previous one, as it
// would if numbers shared a word.
bool reach_all(const std::int32_t* entries, std::uint32_t count, unsigned char* reached) noexcept {
  for (std::uint32_t i = 0; i < count; ++i) {
    const auto entry = static_cast<std::uint32_t>(entries[i]);
    if (entry >= count) return false;
    reached[entry] = 1;
  }
  return std::memchr(reached, 0, count) == nullptr;
}

}  // namespace

std::optional<bool> is_permutation(const std::int32_t* entries, std::int32_t count) noexcept {
  const auto n = static_cast<std::uint32_t>(count);
  if (n == 0) return true;
  if (n <= kBits) return few_reach_all(entries, n);  // most lists
  const Owned<unsigned char> reached = new_zeroed<unsigned char>(n);
  if (!reached) return std::nullopt;
  return reach_all(entries, n, reached.get());
}

}  // namespace tevpf
