#include "core/permutation.h"

#include "core/heap.h"

namespace tevpf {

namespace {

constexpr std::uint32_t kBits = 64;

// One bit for each entry that was met.
bool meets_each_once(const std::int32_t* entries, std::uint32_t count,
                     std::uint64_t* met) noexcept {
  for (std::uint32_t i = 0; i < count; ++i) {
    const auto entry = static_cast<std::uint32_t>(entries[i]);  // a negative one is too large
    if (entry >= count) return false;
    std::uint64_t& word = met[entry / kBits];
    const std::uint64_t bit = std::uint64_t{1} << (entry % kBits);
    if ((word & bit) != 0) return false;
    word |= bit;
  }
  return true;
}

}  // namespace

std::optional<bool> is_permutation(const std::int32_t* entries, std::int32_t count) noexcept {
  const auto n = static_cast<std::uint32_t>(count);
  if (n <= kBits) {  // most lists
    std::uint64_t met = 0;
    return meets_each_once(entries, n, &met);
  }
  Owned<std::uint64_t> met = new_zeroed<std::uint64_t>((std::uint64_t{n} + kBits - 1) / kBits);
  if (!met) return std::nullopt;
  return meets_each_once(entries, n, met.get());
}

}  // namespace tevpf
