#include "core/sequence/pool.h"

#include <algorithm>
#include <cstring>

#include "core/base/heap.h"

namespace tevpf {
namespace {

// Chunks double up to this size, which bounds what stays unused.
constexpr std::int32_t kMostPieces = 64;
constexpr std::int64_t kChunkHead = 16;  // keeps the pieces aligned

void* next_of(const void* piece) noexcept {
  void* next;
  std::memcpy(&next, piece, sizeof next);
  return next;
}

void link(void* piece, void* next) noexcept { std::memcpy(piece, &next, sizeof next); }

}  // namespace

void* Pool::take() noexcept {
  if (spare == 0) return nullptr;
  --spare;
  if (free != nullptr) {
    void* const piece = free;
    free = next_of(piece);
    return piece;
  }
  unsigned char* const piece = fresh;
  fresh += piece_size;
  return piece;
}

void Pool::give_back(void* piece) noexcept {
  link(piece, free);
  free = piece;
  ++spare;
}

bool Pool::add_chunk(std::int64_t pieces) noexcept {
  const std::int32_t grown = std::clamp(2 * chunk_pieces, 2, kMostPieces);
  const std::int64_t wanted = std::max<std::int64_t>(pieces, grown);
  const std::int64_t bytes = wanted * piece_size;
  auto* const chunk =
      static_cast<unsigned char*>(heap_alloc(static_cast<std::uint64_t>(kChunkHead + bytes), 1));
  if (chunk == nullptr) return false;
  for (; fresh != fresh_end; fresh += piece_size) {
    link(fresh, free);
    free = fresh;
  }
  link(chunk, chunks);
  chunks = chunk;
  fresh = chunk + kChunkHead;
  fresh_end = fresh + bytes;
  spare += wanted;
  chunk_pieces = grown;
  return true;
}

void Pool::release() noexcept {
  while (chunks != nullptr) {
    void* const chunk = chunks;
    chunks = next_of(chunk);
    heap_free(chunk);
  }
  const std::int32_t size = piece_size;
  *this = {};
  piece_size = size;
}

}  // namespace tevpf
