#include "core/io/input.h"

#include <algorithm>
#include <cstring>

#include "core/io/stream_size.h"

namespace tevpf {

namespace {
#ifdef TEVPF_TEST_HOOKS
constexpr std::size_t kReadAhead = 256;  // even small files exceed it
#else
constexpr std::size_t kReadAhead = std::size_t{64} * 1024;
#endif
constexpr std::uint64_t kSmallClaim = std::uint64_t{64} * 1024;  // not worth checking
constexpr std::uint64_t kMaxRead = std::uint64_t{1} << 30;       // fits size_t everywhere
}  // namespace

bool Input::read_ahead() noexcept {
  buffer_ = new_array<unsigned char>(kReadAhead);
  room_ = kReadAhead;
  next_ = end_ = buffer_.get();
  return buffer_ != nullptr;
}

std::uint64_t Input::read_stream(unsigned char* to, std::uint64_t count) noexcept {
  std::uint64_t done = 0;
  while (done != count) {
    const auto part = static_cast<std::size_t>(std::min(count - done, kMaxRead));
    const std::size_t got = std::fread(to + done, 1, part, stream_);
    done += got;
    if (got != part) break;
  }
  return done;
}

std::uint64_t Input::read(void* to, std::uint64_t count) noexcept {
  auto* place = static_cast<unsigned char*>(to);
  std::uint64_t done = 0;
  for (;;) {
    const auto part =
        static_cast<std::size_t>(std::min(static_cast<std::uint64_t>(buffered()), count - done));
    if (part != 0) std::memcpy(place + done, next_, part);
    next_ += part;
    done += part;
    if (done == count) return done;
    if (!buffer_ || count - done >= kReadAhead) {
      return done + read_stream(place + done, count - done);
    }
    next_ = buffer_.get();
    end_ = next_ + read_stream(buffer_.get(), kReadAhead);
    if (next_ == end_) return done;
  }
}

Input::Claim Input::weigh(std::uint64_t bytes) const noexcept {
  if (bytes <= kSmallClaim) return Claim::kFits;
  const std::int64_t left = stream_bytes_left(stream_);
  if (left < 0) return Claim::kUnknown;
  return bytes <= static_cast<std::uint64_t>(left + buffered()) ? Claim::kFits : Claim::kTooLarge;
}

Input::Got Input::fetch_more(std::int64_t most) noexcept {
  const auto kept = static_cast<std::size_t>(buffered());
  if (kept != 0) std::memmove(buffer_.get(), next_, kept);
  next_ = buffer_.get();
  end_ = next_ + kept;
  if (kept == room_) {
    const std::uint64_t room = std::min(room_ * 2, static_cast<std::uint64_t>(most));
    void* const larger = heap_resize(buffer_.get(), room, 1);
    if (larger == nullptr) return Got::kNoMemory;
    (void)buffer_.release();
    buffer_.reset(static_cast<unsigned char*>(larger));
    room_ = room;
    next_ = buffer_.get();
  }
  const std::uint64_t got = read_stream(buffer_.get() + kept, room_ - kept);
  end_ = next_ + kept + got;
  return got != 0 ? Got::kAll : Got::kPart;
}

Input::Got Input::read_block(std::uint64_t bytes, Owned<unsigned char>& out) noexcept {
  const Claim claim = weigh(bytes);
  if (claim == Claim::kTooLarge) return Got::kPart;
  std::uint64_t room = claim == Claim::kFits ? bytes : kSmallClaim;
  Owned<unsigned char> block = new_array<unsigned char>(room);
  if (!block) return Got::kNoMemory;
  for (std::uint64_t done = 0;;) {
    const std::uint64_t part = std::min(room, bytes) - done;
    if (read(block.get() + done, part) != part) return Got::kPart;
    done += part;
    if (done == bytes) break;
    room *= 2;
    void* larger = heap_resize(block.get(), std::min(room, bytes), 1);
    if (larger == nullptr) return Got::kNoMemory;
    (void)block.release();
    block.reset(static_cast<unsigned char*>(larger));
  }
  out = std::move(block);
  return Got::kAll;
}

}  // namespace tevpf
