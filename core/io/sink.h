// Where stored bytes go: a large buffer in front of a stream, so that many small records leave in
// few large writes. Remembers that a write failed.
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

  static constexpr std::size_t kMaxRecord = 512;  // what `record` can give room for

  // How far behind a record its caller may write, so that what varies in size is copied as if it
  // were of the largest size.
  static constexpr std::size_t kSlack = 32;

  // Room for a record of so many bytes, which the caller fills at once.
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

  // Passes on what is left to the stream; false when any write has failed.
  [[nodiscard]] bool finish() noexcept;

 private:
  std::size_t room() const noexcept { return size_ - used_; }
  void empty_buffer() noexcept;
  void put_large(const void* bytes, std::uint64_t count) noexcept;
  void write(const void* bytes, std::uint64_t count) noexcept;

  std::FILE* stream_;
  Owned<unsigned char> large_;
  unsigned char small_[kMaxRecord + kSlack];  // instead, when memory is short
  unsigned char* buffer_;
  std::size_t size_;
  std::size_t used_ = 0;
  bool failed_ = false;
};

}  // namespace tevpf
