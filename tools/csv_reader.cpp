#include "csv_reader.h"

#include <algorithm>
#include <cstring>

#include "failure.h"
#include "text.h"

namespace tool {
namespace {

constexpr std::size_t kFirstRoom = std::size_t{1} << 18U;

// A line ends at its LF, or at a CR that has none behind it. *end may be read.
std::size_t line_ends(const char* p, const char* end) {
  std::size_t count = 0;
  for (; p < end; ++p) count += *p == '\n' || (*p == '\r' && p[1] != '\n') ? 1 : 0;
  return count;
}

bool contains(std::string_view text, char byte) {
  return std::memchr(text.data(), byte, text.size()) != nullptr;
}

// Takes each pair of quotes for one, in place; gives what is left of the size.
std::size_t halve_quotes(char* text, std::size_t size) {
  std::size_t kept = 0;
  for (std::size_t i = 0; i < size; ++i) {
    text[kept++] = text[i];
    if (text[i] == '"') ++i;
  }
  return kept;
}

}  // namespace

CsvReader::CsvReader(CsvSource& source, const CsvDialect& dialect)
    : source_(source),
      comment_(dialect.comment),
      buffer_(new char[kFirstRoom + 1]),
      room_(kFirstRoom),
      pos_(buffer_.get()),
      end_(buffer_.get()) {
  *end_ = '\0';
  set_delimiter(dialect.delimiter);
  skip_start();
  for (std::size_t i = 0; i < dialect.skip && skip_line(); ++i) continue;
}

void CsvReader::set_delimiter(char delimiter) {
  delimiter_ = delimiter;
  ends_field_.fill(false);
  for (const char byte : {delimiter, '\n', '\r', '"', '\0'}) {
    ends_field_[static_cast<unsigned char>(byte)] = true;
  }
}

void CsvReader::fail(std::size_t line, const std::string& what) const {
  throw Failure(kRefused, source_.name() + ", line " + std::to_string(line) + ": " + what);
}

// ---- The buffer ---------------------------------------------------------------------------------

// Moves what is not read yet to the front, and reads behind it.
void CsvReader::read_more() {
  const auto kept = static_cast<std::size_t>(end_ - pos_);
  if (kept == room_) {
    std::unique_ptr<char[]> larger(new char[2 * room_ + 1]);
    std::memcpy(larger.get(), pos_, kept);
    buffer_ = std::move(larger);
    room_ *= 2;
  } else {
    std::memmove(buffer_.get(), pos_, kept);
  }
  pos_ = buffer_.get();
  const std::size_t count = source_.read(pos_ + kept, room_ - kept);
  at_eof_ = count == 0;
  end_ = pos_ + kept + count;
  *end_ = '\0';
}

// Whether so many bytes are left; they are in the buffer then.
bool CsvReader::has(std::size_t bytes) {
  while (static_cast<std::size_t>(end_ - pos_) < bytes && !at_eof_) read_more();
  return static_cast<std::size_t>(end_ - pos_) >= bytes;
}

void CsvReader::skip_start() {
  static constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";
  if (has(2) && (std::memcmp(pos_, "\xFF\xFE", 2) == 0 || std::memcmp(pos_, "\xFE\xFF", 2) == 0)) {
    fail(1, "the text is UTF-16; convert it, for example with 'iconv -f UTF-16 -t UTF-8'");
  }
  if (has(kByteOrderMark.size()) &&
      std::memcmp(pos_, kByteOrderMark.data(), kByteOrderMark.size()) == 0) {
    pos_ += kByteOrderMark.size();
  }
}

std::string_view CsvReader::peek_line() {
  if (!find_record()) return {};
  for (;;) {
    const char* const end = std::find_if(pos_, end_, [](char c) { return c == '\n' || c == '\r'; });
    if (end != end_ || at_eof_) return {pos_, static_cast<std::size_t>(end - pos_)};
    read_more();
  }
}

// Goes behind the end of the line.
bool CsvReader::skip_line() {
  for (;;) {
    pos_ = std::find_if(pos_, end_, [](char c) { return c == '\n' || c == '\r'; });
    if (pos_ < end_) break;
    if (at_eof_) return false;
    read_more();
  }
  const bool is_pair = *pos_ == '\r' && has(2) && pos_[1] == '\n';
  pos_ += is_pair ? 2 : 1;
  ++line_;
  return true;
}

bool CsvReader::at_comment() {
  return !comment_.empty() && has(comment_.size()) &&
         std::memcmp(pos_, comment_.data(), comment_.size()) == 0;
}

// ---- Records ------------------------------------------------------------------------------------

// Goes to where a record starts; false at the end.
bool CsvReader::find_record() {
  while (has(1)) {
    const bool is_empty_line = *pos_ == '\n' || *pos_ == '\r';
    if (!at_comment() && (!is_empty_line || reads_empty_lines_)) return true;
    if (!skip_line()) return false;
  }
  return false;
}

bool CsvReader::next(CsvRecord& record) {
  if (!find_record()) return false;
  while (!parse(record)) read_more();
  record.line = line_;
  finish(record);
  return true;
}

std::size_t CsvReader::count_fields() {
  if (!find_record()) return 0;
  CsvRecord record;
  while (!parse(record)) read_more();
  return record.fields.size();
}

// Splits the record at pos_ into fields. False when it goes on behind the buffer.
bool CsvReader::parse(CsvRecord& record) {
  has_quotes_ = false;
  std::size_t count = 0;
  for (char* p = pos_;; ++p) {
    if (count == record.fields.size()) record.fields.emplace_back();
    CsvField& field = record.fields[count++];
    p = parse_field(p, field);
    if (p == nullptr) return false;
    if (*p == delimiter_) continue;
    const bool is_last_byte = p + 1 == end_;
    if (p == end_ || (*p == '\r' && is_last_byte)) {
      if (!at_eof_) return false;
    } else if (*p != '\n' && *p != '\r') {
      refuse_byte(p, field);
    }
    next_pos_ = p == end_ ? p : p + (*p == '\r' && p[1] == '\n' ? 2 : 1);
    break;
  }
  record.fields.resize(count);
  return true;
}

// Reads a field and gives its end; null when it goes on behind the buffer.
char* CsvReader::parse_field(char* p, CsvField& field) {
  if (*p == '"') return parse_quoted(p, field);
  char* const begin = p;
  while (!ends_field_[static_cast<unsigned char>(*p)]) ++p;
  field = {{begin, static_cast<std::size_t>(p - begin)}};
  return p;
}

char* CsvReader::parse_quoted(char* p, CsvField& field) {
  has_quotes_ = true;
  char* const begin = p + 1;
  bool has_doubled = false;
  for (char* quote = begin;; quote += 2) {
    quote = static_cast<char*>(std::memchr(quote, '"', static_cast<std::size_t>(end_ - quote)));
    const bool goes_on = quote == nullptr || quote + 1 == end_;
    if (goes_on && !at_eof_) return nullptr;
    if (quote == nullptr) fail(line_at(p), "the quote that opens a field is never closed");
    if (quote[1] != '"') {
      field = {{begin, static_cast<std::size_t>(quote - begin)}, true, has_doubled};
      return quote + 1;
    }
    has_doubled = true;
  }
}

std::size_t CsvReader::line_at(const char* p) const { return line_ + line_ends(pos_, p); }

// What stands at p, between the end of a field and the delimiter, belongs to no CSV.
void CsvReader::refuse_byte(const char* p, const CsvField& field) const {
  if (*p == '\0') fail(line_at(p), "there is a zero byte, so this is no CSV text");
  if (field.is_quoted) {
    fail(line_at(p), "there is something between a closing quote and the " +
                         std::string(delimiter_ == ',' ? "comma" : "delimiter") + " behind it");
  }
  fail(
      line_at(p),
      "a quote stands inside a field without quotes; put the field in quotes and double the quote");
}

// Counts lines and takes doubled quotes for one: the record lies in the buffer as a whole.
void CsvReader::finish(CsvRecord& record) {
  std::size_t lines = next_pos_ > pos_ && (next_pos_[-1] == '\n' || next_pos_[-1] == '\r') ? 1 : 0;
  if (has_quotes_) {
    for (CsvField& field : record.fields) {
      if (!field.is_quoted) continue;
      const std::string_view text = field.text;
      if (contains(text, '\0')) {
        fail(line_at(text.data()), "there is a zero byte, so this is no CSV text");
      }
      lines += line_ends(text.data(), text.data() + text.size());
      if (!field.has_doubled_quotes) continue;
      char* const begin = pos_ + (text.data() - pos_);
      field.text = {begin, halve_quotes(begin, text.size())};
    }
  }
  line_ += lines;
  pos_ = next_pos_;
}

}  // namespace tool
