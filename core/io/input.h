// The source of stored bytes: a stream, read once from front to back. Sizes that a file states are
// claims; Input checks whether the rest of the stream can hold them before anything is allocated.
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

  // Allocates a buffer, so that many small records need few large reads. The stream is then read
  // further than requested. False when out of memory.
  [[nodiscard]] bool read_ahead() noexcept;

  // Reads up to `count` bytes and returns how many were read: fewer only at the end of the stream.
  [[nodiscard]] std::uint64_t read(void* to, std::uint64_t count) noexcept;

  // The bytes that are buffered and not yet consumed.
  const unsigned char* unread() const noexcept { return next_; }
  std::int64_t buffered() const noexcept { return end_ - next_; }
  void skip(std::int64_t count) noexcept { next_ += count; }

  // True when the stream ended with an error.
  [[nodiscard]] bool has_failed() const noexcept { return std::ferror(stream_) != 0; }

  enum class Claim {
    kFits,      // that many bytes are left, or the claim is small
    kTooLarge,  // fewer are left
    kUnknown,   // the size of the stream is unknown; allocate step by step
  };
  [[nodiscard]] Claim weigh(std::uint64_t bytes) const noexcept;

  enum class Got { kAll, kPart, kNoMemory };

  // Reads further ahead, into a larger buffer if this one is full. The buffer never exceeds `most`
  // bytes, which must be more than are buffered now. kPart: the stream has ended.
  [[nodiscard]] Got fetch_more(std::int64_t most) noexcept;

  // Reads a block of `bytes` bytes. Allocates no more than the stream can hold; if its size is
  // unknown, the block grows as data arrives.
  [[nodiscard]] Got read_block(std::uint64_t bytes, Owned<unsigned char>& out) noexcept;

 private:
  std::uint64_t read_stream(unsigned char* to, std::uint64_t count) noexcept;

  std::FILE* stream_;
  Owned<unsigned char> buffer_;
  std::uint64_t room_ = 0;
  const unsigned char* next_ = nullptr;  // the buffered bytes: next_ .. end_
  const unsigned char* end_ = nullptr;
};

}  // namespace tevpf
