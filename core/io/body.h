// The body of an element, taken off its front part by part.
#pragma once

#include <algorithm>
#include <bit>
#include <cstdint>
#include <cstring>

#include "core/base/text_word.h"
#include "core/io/input.h"

namespace tevpf {

// Bytes in memory: takes parts off their front and never goes beyond their end.
class ByteReader {
 public:
  ByteReader(const void* bytes, std::int64_t count) noexcept
      : next_(static_cast<const unsigned char*>(bytes)), end_(next_ + count) {}

  std::int64_t left() const noexcept { return end_ - next_; }

  // The next `count` bytes; null when there are not so many.
  [[nodiscard]] const unsigned char* take(std::int64_t count) noexcept {
    if (count < 0 || count > left()) return nullptr;
    const unsigned char* part = next_;
    next_ += count;
    return part;
  }

  // A text with its terminator; null when there is none before the end.
  [[nodiscard]] const char* take_text() noexcept {
    const unsigned char* const text = next_;
    const unsigned char* const behind = end_of_text();
    if (behind == nullptr) return nullptr;
    next_ = behind;
    return reinterpret_cast<const char*>(text);
  }

 private:
  // Behind the next terminator; null when there is none. Most texts are shorter than a call is long.
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

// What taking one stored parameter or column off a body came to.
enum class Parsed {
  kWhole,
  kCutOff,       // it goes on behind the bytes at hand
  kBroken,       // it contradicts itself, or the body ends inside it
  kUnknownType,  // so that nobody knows its size
  kNoMemory,
};

// A whole body: in memory, or still in the stream and at hand only as far as it is read ahead, so
// that a body of any length goes by without a block of its length, unless one text fills it.
class Body {
 public:
  Body(const void* bytes, std::int32_t count) noexcept
      : bytes_(static_cast<const unsigned char*>(bytes)), left_(count) {}
  Body(Input& input, std::int32_t count) noexcept : input_(&input), left_(count) {}

  // Bytes that are not taken yet, at hand or not.
  std::int64_t left() const noexcept { return left_; }

  // Those of them that are at hand, until more are fetched.
  ByteReader at_hand() const noexcept {
    if (input_ == nullptr) return {bytes_, left_};
    return {input_->unread(), std::min<std::int64_t>(left_, input_->buffered())};
  }

  // Takes the next `count` bytes, few enough for any buffer; they stay until the body is
  // touched again. Null when the body, or the stream, ends inside them.
  [[nodiscard]] const unsigned char* take_fields(std::int32_t count) noexcept;

  // Takes `count` of the bytes at hand.
  void take(std::int64_t count) noexcept {
    left_ -= count;
    if (input_ == nullptr) {
      bytes_ += count;
    } else {
      input_->skip(count);
    }
  }

  // Takes all that is left. False when the stream ends inside it.
  [[nodiscard]] bool take_rest() noexcept;

  // Gets more bytes to hand, which moves those that are. kPart: there are no more.
  [[nodiscard]] Input::Got fetch_more() noexcept;

 private:
  Input* input_ = nullptr;
  const unsigned char* bytes_ = nullptr;
  std::int64_t left_;
};

}  // namespace tevpf
