// Pieces of memory of one size, cut from larger heap blocks: taking one makes no call to the
// allocator, and all of them are released together.
#pragma once

#include <cstdint>

namespace tevpf {

// A zeroed Pool whose piece_size is set (a multiple of 8, at least a pointer) is an empty one.
//
// Invariants: `spare` counts the pieces that can be taken, which are those on the free list and
// those between `fresh` and `fresh_end`. A piece on the free list begins with the address of the
// next one, a chunk with the address of the chunk that was allocated before it.
struct Pool {
  std::int32_t piece_size;
  std::int32_t chunk_pieces;  // of the last chunk; later ones are larger, up to a limit
  std::int64_t spare;
  void* free;
  unsigned char* fresh;
  unsigned char* fresh_end;
  void* chunks;

  // Lets the next `pieces` calls of take succeed; false when memory runs out.
  [[nodiscard]] bool reserve(std::int64_t pieces) noexcept {
    return spare >= pieces || add_chunk(pieces - spare);
  }
  // A piece with undefined contents; null when none is spare.
  [[nodiscard]] void* take() noexcept;
  void give_back(void* piece) noexcept;
  // Releases every piece, taken or spare.
  void release() noexcept;

 private:
  bool add_chunk(std::int64_t pieces) noexcept;
};

}  // namespace tevpf
