// Whether an index that a file holds is one.
#pragma once

#include <cstdint>
#include <optional>

namespace tevpf {

// Whether `entries` holds each of 0 .. count - 1 once. O(count); nothing when there is no memory to
// tell.
[[nodiscard]] std::optional<bool> is_permutation(const std::int32_t* entries,
                                                 std::int32_t count) noexcept;

}  // namespace tevpf
