#include "core/io/sink.h"

#include <algorithm>

namespace tevpf {

namespace {
#ifdef TEVPF_TEST_HOOKS
constexpr std::size_t kBuffer = 4096;  // even small files exceed it
#else
// One long write is faster than several short ones: ten thousand parameters fit in one. The unused
// part of the buffer costs nothing, because it is never touched.
constexpr std::size_t kBuffer = std::size_t{1024} * 1024;
#endif
constexpr std::uint64_t kMaxWrite = std::uint64_t{1} << 30;  // fits size_t everywhere
}  // namespace

// cppcheck-suppress uninitMemberVar; a buffer
Sink::Sink(std::FILE* stream) noexcept
    : stream_(stream),
      large_(new_array<unsigned char>(kBuffer)),
      buffer_(large_ ? large_.get() : small_),
      size_(large_ ? kBuffer : sizeof small_) {}

bool Sink::finish() noexcept {
  empty_buffer();
  return !failed_;
}

void Sink::empty_buffer() noexcept {
  write(buffer_, used_);
  used_ = 0;
}

void Sink::put_large(const void* bytes, std::uint64_t count) noexcept {
  empty_buffer();
  if (count > size_) return write(bytes, count);
  put(bytes, count);
}

void Sink::write(const void* bytes, std::uint64_t count) noexcept {
  const auto* from = static_cast<const unsigned char*>(bytes);
  while (count != 0 && !failed_) {
    const auto part = static_cast<std::size_t>(std::min(count, kMaxWrite));
    failed_ = std::fwrite(from, 1, part, stream_) != part;
    from += part;
    count -= part;
  }
}

}  // namespace tevpf
