// Where stored bytes come from: a stream, read once from front to back. What a file says about
// itself is a claim; Input tells whether the rest of the stream can hold it, before anything is
// allocated.
#pragma once

#include <cstdint>
#include <cstdio>

#include "core/base/heap.h"

namespace tevpf {

class Input {
 public:
  explicit Input(std::FILE* stream) noexcept : stream_(stream) {}
  Input(const Input&) = delete;
  Input& operator=(const Input&) = delete;

  // Gets a buffer, so that many small records arrive in few large reads: the stream is then read
  // further than it is asked for. False when memory runs out.
  [[nodiscard]] bool read_ahead() noexcept;

  // Reads up to `count` bytes and gives their number: fewer only at the end of the stream.
  [[nodiscard]] std::uint64_t read(void* to, std::uint64_t count) noexcept;

  // What is read ahead and not yet read.
  const unsigned char* unread() const noexcept { return next_; }
  std::int64_t buffered() const noexcept { return end_ - next_; }
  void skip(std::int64_t count) noexcept { next_ += count; }

  // True when the stream ended by an error.
  [[nodiscard]] bool has_failed() const noexcept { return std::ferror(stream_) != 0; }

  enum class Claim {
    kFits,      // so many bytes are left, or they are few
    kTooLarge,  // fewer are left
    kUnknown,   // the stream does not say; allocate step by step
  };
  [[nodiscard]] Claim weigh(std::uint64_t bytes) const noexcept;

  enum class Got { kAll, kPart, kNoMemory };

  // Reads further ahead, into a larger buffer when this one is full, but of no more than `most` bytes,
  // which are more than are read ahead. kPart: the stream has ended.
  [[nodiscard]] Got fetch_more(std::int64_t most) noexcept;

  // Reads a block of so many bytes, allocated as far as the stream holds them.
  [[nodiscard]] Got read_block(std::uint64_t bytes, Owned<unsigned char>& out) noexcept;

 private:
  std::uint64_t read_stream(unsigned char* to, std::uint64_t count) noexcept;

  std::FILE* stream_;
  Owned<unsigned char> buffer_;
  std::uint64_t room_ = 0;
  const unsigned char* next_ = nullptr;  // what is read ahead
  const unsigned char* end_ = nullptr;
};

}  // namespace tevpf
