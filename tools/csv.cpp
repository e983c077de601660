#include "csv.h"

#include <algorithm>

#include "failure.h"
#include "text.h"

namespace tool {

CsvReader::CsvReader(std::string_view text, std::string_view name) : text_(text), name_(name) {
  static constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";
  if (text_.starts_with(kByteOrderMark)) pos_ = kByteOrderMark.size();
}

void CsvReader::fail(std::size_t line, const std::string& what) const {
  throw Failure(kRefused, visible(name_) + ", line " + std::to_string(line) + ": " + what);
}

bool CsvReader::at_line_end() const {
  return pos_ == text_.size() || text_[pos_] == '\n' || text_[pos_] == '\r';
}

void CsvReader::skip_line_end() {
  if (pos_ == text_.size()) return;
  if (text_[pos_] == '\r' && pos_ + 1 < text_.size() && text_[pos_ + 1] == '\n') ++pos_;
  ++pos_;
  ++line_;
}

bool CsvReader::next(CsvRecord& record) {
  while (pos_ < text_.size() && at_line_end()) skip_line_end();
  if (pos_ == text_.size()) return false;
  record.line = line_;
  std::size_t count = 0;
  for (bool more = true; more; ++count) {
    if (count == record.fields.size()) record.fields.emplace_back();
    read_field(record.fields[count]);
    more = pos_ < text_.size() && text_[pos_] == ',';
    if (more) ++pos_;
  }
  record.fields.resize(count);
  skip_line_end();
  return true;
}

void CsvReader::read_field(std::string& field) {
  field.clear();
  if (pos_ < text_.size() && text_[pos_] == '"') {
    read_quoted(field);
  } else {
    const std::size_t end = std::min(text_.find_first_of(",\r\n\"", pos_), text_.size());
    field = text_.substr(pos_, end - pos_);
    pos_ = end;
    if (end < text_.size() && text_[end] == '"') {
      fail(line_,
           "a quote stands inside a field without quotes; put the field in quotes and "
           "double the quote");
    }
  }
  if (field.find('\0') != std::string::npos) {
    fail(line_, "there is a zero byte, so this is no CSV text");
  }
}

void CsvReader::read_quoted(std::string& field) {
  const std::size_t first_line = line_;
  ++pos_;
  for (;; ++pos_) {
    if (pos_ == text_.size()) fail(first_line, "the quote that opens a field is never closed");
    const char byte = text_[pos_];
    if (byte == '"') {
      if (pos_ + 1 == text_.size() || text_[pos_ + 1] != '"') break;
      ++pos_;
    }
    // A line ends at its LF, or at a CR that has none behind it.
    if (byte == '\n' || (byte == '\r' && text_.substr(pos_ + 1, 1) != "\n")) ++line_;
    field += byte;
  }
  ++pos_;
  if (!at_line_end() && text_[pos_] != ',') {
    fail(line_, "there is something between a closing quote and the comma behind it");
  }
}

void append_csv(std::string& row, std::string_view field, bool alone) {
  const bool has_blank_end = trimmed(field).size() != field.size();
  if (!(alone && field.empty()) && !has_blank_end &&
      field.find_first_of("\",\r\n") == std::string_view::npos) {
    row += field;
    return;
  }
  row += '"';
  for (const char byte : field) {
    if (byte == '"') row += '"';
    row += byte;
  }
  row += '"';
}

}  // namespace tool
