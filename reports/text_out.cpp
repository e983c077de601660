#include "reports/text_out.h"

#include <algorithm>

namespace tevpf {

// cppcheck-suppress uninitMemberVar; a buffer
TextOut::TextOut(std::FILE* stream, Size size) noexcept
    : stream_(stream), buffer_(line_), room_(kLineBuffer) {
  if (size != Size::kReport) return;
  block_ = new_array<char>(kReportBuffer);
  if (!block_) return;
  buffer_ = block_.get();
  room_ = kReportBuffer;
}

void TextOut::flush() noexcept {
  if (used_ > 0) std::fwrite(buffer_, 1, static_cast<std::size_t>(used_), stream_);
  used_ = 0;
}

void TextOut::write(const char* text, std::int64_t length) noexcept {
  while (length > 0) {
    if (used_ == room_) flush();
    const std::int64_t part = std::min(length, room_ - used_);
    std::memcpy(buffer_ + used_, text, static_cast<std::size_t>(part));
    used_ += part;
    text += part;
    length -= part;
  }
}

void TextOut::add(const Right& field) noexcept {
  char digits[24];
  const char* end = write_decimal(digits, field.number);
  add(RightText{{digits, static_cast<std::size_t>(end - digits)}, field.width});
}

void TextOut::add(const General& field) noexcept {
  char digits[kMaxNumberText];
  const char* end = write_general(digits, field.number, field.precision);
  add(RightText{{digits, static_cast<std::size_t>(end - digits)}, field.width});
}

void TextOut::add(const RightText& field) noexcept {
  add(Repeat{' ', field.width - static_cast<std::int64_t>(field.text.size())});
  add(field.text);
}

void TextOut::add(const LeftText& field) noexcept {
  add(field.text);
  add(Repeat{' ', field.width - static_cast<std::int64_t>(field.text.size())});
}

void TextOut::add(const Repeat& run) noexcept {
  for (std::int64_t left = run.count; left > 0;) {
    if (used_ == room_) flush();
    const std::int64_t part = std::min(left, room_ - used_);
    std::memset(buffer_ + used_, run.character, static_cast<std::size_t>(part));
    used_ += part;
    left -= part;
  }
}

}  // namespace tevpf
