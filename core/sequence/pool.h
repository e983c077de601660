// A pool of equal pieces of memory, cut from larger heap blocks ("chunks"). Taking a reserved piece
// cannot fail; all pieces are released together.
#pragma once

#include <cstdint>

namespace tevpf {

// A zeroed Pool is empty; its owner sets piece_size, a multiple of 8, before anything else.
//
// Invariants: `spare` counts the pieces on the free list and those between `fresh` and `fresh_end`.
// A free piece begins with the address of the next one, a chunk with that of the previous chunk.
struct Pool {
  std::int32_t piece_size;
  std::int32_t chunk_pieces;  // the size of the last chunk
  std::int64_t spare;
  void* free;
  unsigned char* fresh;
  unsigned char* fresh_end;
  void* chunks;

  // Ensures that the next `pieces` calls of take succeed; false when memory runs out.
  [[nodiscard]] bool reserve(std::int64_t pieces) noexcept {
    return spare >= pieces || add_chunk(pieces - spare);
  }
  // An uninitialised piece; null when none is spare.
  [[nodiscard]] void* take() noexcept;
  void give_back(void* piece) noexcept;
  // Releases every piece, taken or spare.
  void release() noexcept;

 private:
  bool add_chunk(std::int64_t pieces) noexcept;
};

}  // namespace tevpf
