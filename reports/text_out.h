// Where reports write: a large buffer in front of a C stream, into which texts and numbers are
// formatted without printf. Write errors of the stream are not noticed here.
#pragma once

#include <concepts>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <string_view>

#include "core/base/heap.h"
#include "core/base/number_text.h"

namespace tevpf {

// Numbers and texts in fields of at least `width` characters; longer ones widen their field.
struct Right {
  std::int64_t number;
  std::int32_t width;
};
struct RightText {
  std::string_view text;
  std::int32_t width;
};
struct LeftText {
  std::string_view text;
  std::int32_t width;
};
struct General {  // "%*.*g"
  double number;
  std::int32_t width;
  std::int32_t precision;
};
struct Repeat {  // a count of 0 or less writes nothing
  char character;
  std::int64_t count;
};

// The text of a record's field, which may fill the field without a terminator.
template <std::size_t N>
std::string_view field_text(const char (&field)[N]) noexcept {
  return {field, strnlen(field, N)};
}

class TextOut {
 public:
  enum class Size { kLine, kReport };

  // A report gets a large buffer if there is memory for it; else the one in the object serves.
  explicit TextOut(std::FILE* stream, Size size = Size::kReport) noexcept;
  ~TextOut() { flush(); }
  TextOut(const TextOut&) = delete;
  TextOut& operator=(const TextOut&) = delete;

  // Writes its arguments one behind the other.
  template <class... Parts>
  void print(const Parts&... parts) noexcept {
    (add(parts), ...);
  }

  void write(const char* text, std::int64_t length) noexcept;
  void flush() noexcept;

  // Ends a line that goes on in the next one: a blank where people read along, else a backslash.
  char continuation() const noexcept { return stream_ == stdout ? ' ' : '\\'; }

 private:
  static constexpr std::int64_t kReportBuffer = 1 << 17;
  static constexpr std::int64_t kLineBuffer = 2048;
  static_assert(kLineBuffer >= kMaxNumberText);

  void add(std::string_view text) noexcept {
    write(text.data(), static_cast<std::int64_t>(text.size()));
  }
  template <std::size_t N>
  void add(const char (&text)[N]) noexcept {
    add(field_text(text));
  }
  template <std::integral T>
  void add(const T& value) noexcept {
    if constexpr (std::same_as<T, char>) {
      *room_for(1) = value;
      ++used_;
    } else {
      add(Right{static_cast<std::int64_t>(value), 0});
    }
  }
  void add(const Right& field) noexcept;
  void add(const RightText& field) noexcept;
  void add(const LeftText& field) noexcept;
  void add(const General& field) noexcept;
  void add(const Repeat& run) noexcept;

  // Room for `length` more characters, at most kLineBuffer.
  char* room_for(std::int64_t length) noexcept {
    if (room_ - used_ < length) flush();
    return buffer_ + used_;
  }

  std::FILE* stream_;
  Owned<char> block_;
  char* buffer_;
  std::int64_t room_;
  std::int64_t used_ = 0;
  char line_[kLineBuffer];
};

}  // namespace tevpf
