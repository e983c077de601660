// One block for all texts that a list receives at once, when it is opened or copied. A separate
// block for each text would take longer than everything else.
//
// A text in the block is overwritten if its replacement fits, and is never released alone; a
// replacement that does not fit gets its own block.
#pragma once

#include <cstdint>

#include "core/base/heap.h"
#include "core/base/short_copy.h"

namespace tevpf {

struct TextBlock {
  char* begin;  // null: no block
  char* end;

  bool holds(const char* text) const noexcept {
    const auto at = reinterpret_cast<std::uintptr_t>(text);
    return at >= reinterpret_cast<std::uintptr_t>(begin) &&
           at < reinterpret_cast<std::uintptr_t>(end);
  }
};

// Releases a text unless the block holds it; null is allowed.
inline void release_text(const TextBlock& block, char* text) noexcept {
  if (!block.holds(text)) heap_free(text);
}

// Copies texts into a new block, one after the other.
class TextPacker {
 public:
  // Allocates the block. False when out of memory.
  [[nodiscard]] bool reserve(std::int64_t bytes, TextBlock& block) noexcept {
    block = {};
    next_ = end_ = nullptr;
    if (bytes <= 0) return true;
    next_ = new_array<char>(static_cast<std::uint64_t>(bytes)).release();
    if (next_ == nullptr) return false;
    end_ = next_ + bytes;
    block = {next_, end_};
    return true;
  }

  // Copies a text of `size` bytes, terminator included; a text that does not fit gets its own
  // block. Null when out of memory.
  [[nodiscard]] char* pack(const char* text, std::int64_t size) noexcept {
    if (size > end_ - next_)
      return static_cast<char*>(heap_copy(text, static_cast<std::uint64_t>(size)));
    char* const copy = next_;
    copy_short(copy, text, size);
    next_ += size;
    return copy;
  }

  // Releases the block if it holds no text.
  void finish(TextBlock& block) const noexcept {
    if (next_ != block.begin) return;
    heap_free(block.begin);
    block = {};
  }

 private:
  char* next_ = nullptr;
  char* end_ = nullptr;
};

}  // namespace tevpf
