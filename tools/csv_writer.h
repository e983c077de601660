// Writes records as CSV, through a buffer, to the output of a command.
#pragma once

#include <array>
#include <charconv>
#include <cstddef>
#include <memory>
#include <string>
#include <string_view>

#include "output.h"
#include "values.h"

namespace tool {

struct CsvStyle {
  char delimiter = ',';
  std::string_view line_end = "\n";
  std::string missing = "nan";  // what stands for a number that is none
};

class CsvWriter {
 public:
  CsvWriter(Output& output, CsvStyle style);

  // The fields of a record, one after the other, then its end. A text is in quotes where it needs
  // them; one that is empty and alone does, because an empty line would be no record.
  void text(std::string_view field);
  void value(const Value& value);
  template <class T>
  void number(T value);
  void end_record();

  void finish();  // all records are written

 private:
  static constexpr std::size_t kLongestNumber = 32;

  char* room_for(std::size_t bytes);  // behind a delimiter, where the field is not the first one
  void flush();
  bool needs_quotes(std::string_view field) const;
  void quoted(std::string_view field);

  Output& output_;
  CsvStyle style_;
  std::array<bool, 256> is_special_{};
  std::size_t size_;
  std::unique_ptr<char[]> buffer_;
  char *next_, *end_;
  std::size_t fields_ = 0;        // of the record, so far
  bool is_empty_record_ = false;  // of one empty field
};

// ---- Implementation ---------------------------------------------------------------------------

inline char* CsvWriter::room_for(std::size_t bytes) {
  if (static_cast<std::size_t>(end_ - next_) <= bytes) {
    flush();
    if (size_ <= bytes) {
      size_ = 2 * bytes;
      buffer_.reset(new char[size_]);
      next_ = buffer_.get();
      end_ = next_ + size_;
    }
  }
  if (fields_++ > 0) *next_++ = style_.delimiter;
  return next_;
}

template <class T>
void CsvWriter::number(T value) {
  if (value != value) return text(style_.missing);
  char* const place = room_for(kLongestNumber);
  next_ = std::to_chars(place, place + kLongestNumber, value).ptr;
}

}  // namespace tool
