// How much of a stream is still to come.
#pragma once

#include <cstdint>
#include <cstdio>

namespace tevpf {

// Bytes between the place where the stream stands and the end of its file; -1 when it is not a
// regular file and may go on for ever.
[[nodiscard]] std::int64_t stream_bytes_left(std::FILE* stream) noexcept;

}  // namespace tevpf
