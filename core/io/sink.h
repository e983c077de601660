// The destination of stored bytes: a large buffer in front of a stream, so that many small records
// need few large writes. Remembers that a write failed.
#pragma once

#include <cstdint>
#include <cstdio>
#include <cstring>

#include "core/base/heap.h"
#include "core/base/short_copy.h"

namespace tevpf {

class Sink {
 public:
  explicit Sink(std::FILE* stream) noexcept;
  Sink(const Sink&) = delete;
  Sink& operator=(const Sink&) = delete;

  static constexpr std::size_t kMaxRecord = 512;  // the largest size that `record` accepts

  // How many bytes past a record its caller may write, so that parts of varying size can be copied
  // at their largest size.
  static constexpr std::size_t kSlack = 32;

  // Space for a record of `bytes` bytes, which the caller fills before the next call.
  [[nodiscard]] unsigned char* record(std::size_t bytes) noexcept {
    if (bytes + kSlack > room()) empty_buffer();
    unsigned char* place = buffer_ + used_;
    used_ += bytes;
    return place;
  }

  void put(const void* bytes, std::uint64_t count) noexcept {
    if (count > room()) return put_large(bytes, count);
    copy_short(buffer_ + used_, bytes, static_cast<std::int64_t>(count));
    used_ += static_cast<std::size_t>(count);
  }

  void put_text(const char* text) noexcept { put(text, std::strlen(text) + 1); }

  void put_numbers(const std::int32_t* numbers, std::int32_t count) noexcept {
    put(numbers, static_cast<std::uint64_t>(count) * sizeof *numbers);
  }

  // Writes the rest of the buffer to the stream; false if any write has failed.
  [[nodiscard]] bool finish() noexcept;

 private:
  std::size_t room() const noexcept { return size_ - used_; }
  void empty_buffer() noexcept;
  void put_large(const void* bytes, std::uint64_t count) noexcept;
  void write(const void* bytes, std::uint64_t count) noexcept;

  std::FILE* stream_;
  Owned<unsigned char> large_;
  unsigned char small_[kMaxRecord + kSlack];  // used when large_ cannot be allocated
  unsigned char* buffer_;
  std::size_t size_;
  std::size_t used_ = 0;
  bool failed_ = false;
};

}  // namespace tevpf
