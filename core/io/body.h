// The body of an element, consumed part by part from its front.
#pragma once

#include <algorithm>
#include <bit>
#include <cstdint>
#include <cstring>

#include "core/base/text_word.h"
#include "core/io/input.h"

namespace tevpf {

// Consumes bytes in memory from the front and never reads past their end.
class ByteReader {
 public:
  ByteReader(const void* bytes, std::int64_t count) noexcept
      : next_(static_cast<const unsigned char*>(bytes)), end_(next_ + count) {}

  std::int64_t left() const noexcept { return end_ - next_; }

  // The next `count` bytes; null if fewer are left.
  [[nodiscard]] const unsigned char* take(std::int64_t count) noexcept {
    if (count < 0 || count > left()) return nullptr;
    const unsigned char* part = next_;
    next_ += count;
    return part;
  }

  // The next text with its terminator; null if no terminator is left.
  [[nodiscard]] const char* take_text() noexcept {
    const unsigned char* const text = next_;
    const unsigned char* const behind = end_of_text();
    if (behind == nullptr) return nullptr;
    next_ = behind;
    return reinterpret_cast<const char*>(text);
  }

 private:
  // The byte after the next terminator; null if no terminator is left. Most texts are so short that
  // a call would cost more than the scan.
  const unsigned char* end_of_text() const noexcept {
    constexpr std::int64_t kWord = 8, kFew = 64;
    const unsigned char* at = next_;
    for (; at - next_ < kFew && end_ - at >= kWord; at += kWord) {
      const std::uint64_t zeros = zero_bytes(load_word(at));
      if (zeros != 0) return at + std::countr_zero(zeros) / 8 + 1;
    }
    const void* const found = std::memchr(at, '\0', static_cast<std::size_t>(end_ - at));
    return found == nullptr ? nullptr : static_cast<const unsigned char*>(found) + 1;
  }

  const unsigned char* next_;
  const unsigned char* end_;
};

// The result of parsing one stored parameter or column.
enum class Parsed {
  kWhole,
  kCutOff,       // it continues past the buffered bytes
  kBroken,       // it is inconsistent, or the body ends inside it
  kUnknownType,  // its size cannot be determined
  kNoMemory,
};

// A whole body, either in memory or in the stream and buffered only as far as it has been read
// ahead. A streamed body of any length is processed without a block of its length, unless a single
// text fills it.
class Body {
 public:
  Body(const void* bytes, std::int32_t count) noexcept
      : bytes_(static_cast<const unsigned char*>(bytes)), left_(count) {}
  Body(Input& input, std::int32_t count) noexcept : input_(&input), left_(count) {}

  // Bytes that are not consumed yet, buffered or not.
  std::int64_t left() const noexcept { return left_; }

  // The unconsumed bytes that are buffered; valid until more are fetched.
  ByteReader at_hand() const noexcept {
    if (input_ == nullptr) return {bytes_, left_};
    return {input_->unread(), std::min<std::int64_t>(left_, input_->buffered())};
  }

  // Consumes the next `count` bytes, few enough for any buffer; they stay valid until the body is
  // used again. Null when the body, or the stream, ends inside them.
  [[nodiscard]] const unsigned char* take_fields(std::int32_t count) noexcept;

  // Consumes `count` of the buffered bytes.
  void take(std::int64_t count) noexcept {
    left_ -= count;
    if (input_ == nullptr) {
      bytes_ += count;
    } else {
      input_->skip(count);
    }
  }

  // Consumes the rest of the body. False when the stream ends inside it.
  [[nodiscard]] bool take_rest() noexcept;

  // Buffers more bytes, which moves those already buffered. kPart: there are no more.
  [[nodiscard]] Input::Got fetch_more() noexcept;

 private:
  Input* input_ = nullptr;
  const unsigned char* bytes_ = nullptr;
  std::int64_t left_;
};

}  // namespace tevpf
