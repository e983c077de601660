#include "csv_writer.h"

#include <algorithm>
#include <type_traits>
#include <utility>
#include <variant>

#include "text.h"

namespace tool {

CsvWriter::CsvWriter(Output& output, CsvStyle style)
    : output_(output),
      style_(std::move(style)),
      size_(std::size_t{1} << 16U),
      buffer_(new char[size_]),
      next_(buffer_.get()),
      end_(next_ + size_) {
  for (const char byte : {style_.delimiter, '"', '\n', '\r'}) {
    is_special_[static_cast<unsigned char>(byte)] = true;
  }
}

void CsvWriter::flush() {
  output_.write({buffer_.get(), static_cast<std::size_t>(next_ - buffer_.get())});
  next_ = buffer_.get();
}

void CsvWriter::finish() { flush(); }

// Blanks at the ends are kept by quotes, too: some readers take them away.
bool CsvWriter::needs_quotes(std::string_view field) const {
  if (field.empty()) return false;
  const auto is_blank = [](char c) { return c == ' ' || c == '\t'; };
  return is_blank(field.front()) || is_blank(field.back()) ||
         std::any_of(field.begin(), field.end(),
                     [&](char c) { return is_special_[static_cast<unsigned char>(c)]; });
}

void CsvWriter::text(std::string_view field) {
  is_empty_record_ = fields_ == 0 && field.empty();
  if (needs_quotes(field)) return quoted(field);
  char* const place = room_for(field.size() + 1);
  next_ = std::copy(field.begin(), field.end(), place);
}

void CsvWriter::quoted(std::string_view field) {
  char* place = room_for(2 * field.size() + 3);
  *place++ = '"';
  for (const char byte : field) {
    if (byte == '"') *place++ = '"';
    *place++ = byte;
  }
  *place++ = '"';
  next_ = place;
}

void CsvWriter::value(const Value& value) {
  std::visit(
      [this](const auto& v) {
        if constexpr (std::is_same_v<std::decay_t<decltype(v)>, std::string>) {
          text(v);
        } else {
          number(v);
        }
      },
      value);
}

void CsvWriter::end_record() {
  if (fields_ == 1 && is_empty_record_) {
    fields_ = 0;
    quoted({});
  }
  fields_ = 0;
  char* const place = room_for(style_.line_end.size());
  next_ = std::copy(style_.line_end.begin(), style_.line_end.end(), place);
  fields_ = 0;
  is_empty_record_ = false;
}

}  // namespace tool
