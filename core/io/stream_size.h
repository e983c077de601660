// The number of bytes left in a stream.
#pragma once

#include <cstdint>
#include <cstdio>

namespace tevpf {

// Bytes from the stream's position to the end of its file; -1 if it is not a regular file, which
// may have no end.
[[nodiscard]] std::int64_t stream_bytes_left(std::FILE* stream) noexcept;

}  // namespace tevpf
