// The output of reports: a large buffer in front of a C stream. Texts and numbers are formatted
// into it without printf. Write errors of the stream are not detected here.
#pragma once

#include <concepts>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <string_view>

#include "core/base/heap.h"
#include "core/base/number_text.h"

namespace tevpf {

// Numbers and texts in fields of at least `width` characters; a longer one widens its field.
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

// The text of a record's field, which has no terminator if the text fills the field.
template <std::size_t N>
std::string_view field_text(const char (&field)[N]) noexcept {
  return {field, strnlen(field, N)};
}

class TextOut {
 public:
  enum class Size { kLine, kReport };

  // A report gets a large buffer if memory allows, else the buffer in the object is used.
  explicit TextOut(std::FILE* stream, Size size = Size::kReport) noexcept;
  ~TextOut() { flush(); }
  TextOut(const TextOut&) = delete;
  TextOut& operator=(const TextOut&) = delete;

  // Writes its arguments one after another.
  template <class... Parts>
  void print(const Parts&... parts) noexcept {
    (add(parts), ...);
  }

  void write(const char* text, std::int64_t length) noexcept;
  void flush() noexcept;

  // The character that ends a continued line: a blank on standard output, else a backslash.
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

  // Makes room for `length` more characters, at most kLineBuffer.
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
