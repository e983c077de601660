// One block for the texts that a list gets all at once, when it is opened or copied: a block for each
// of them would take longer than all the rest.
//
// A text in the block is overwritten while its successor fits, and never released alone; one that
// does not fit becomes a block of its own.
#pragma once

#include <cstdint>

#include "core/base/heap.h"
#include "core/base/short_copy.h"

namespace tevpf {

struct TextBlock {
  char* begin;  // null: there is none
  char* end;

  bool holds(const char* text) const noexcept {
    const auto at = reinterpret_cast<std::uintptr_t>(text);
    return at >= reinterpret_cast<std::uintptr_t>(begin) &&
           at < reinterpret_cast<std::uintptr_t>(end);
  }
};

// Releases a text that the block does not hold; null is fine.
inline void release_text(const TextBlock& block, char* text) noexcept {
  if (!block.holds(text)) heap_free(text);
}

// Copies texts into a new block, one behind the other.
class TextPacker {
 public:
  // Makes the block. False when memory runs out.
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

  // The copy of a text, which takes `size` bytes with its terminator; one that does not fit gets a
  // block of its own. Null when memory runs out.
  [[nodiscard]] char* pack(const char* text, std::int64_t size) noexcept {
    if (size > end_ - next_)
      return static_cast<char*>(heap_copy(text, static_cast<std::uint64_t>(size)));
    char* const copy = next_;
    copy_short(copy, text, size);
    next_ += size;
    return copy;
  }

  // Gives the block back when it holds no text.
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
