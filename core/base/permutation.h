// Validates an index that was read from a file.
#pragma once

#include <cstdint>
#include <optional>

namespace tevpf {

// Whether `entries` holds each of 0 .. count - 1 exactly once. O(count); std::nullopt when out of
// memory.
[[nodiscard]] std::optional<bool> is_permutation(const std::int32_t* entries,
                                                 std::int32_t count) noexcept;

}  // namespace tevpf
