#include "csv_source.h"

#include <algorithm>
#include <cstring>
#include <filesystem>
#include <system_error>

#include "failure.h"
#include "platform.h"
#include "text.h"

namespace fs = std::filesystem;

namespace tool {

CsvSource::CsvSource(const std::string& path)
    : path_(path),
      name_(path == "-" ? "standard input" : visible(path)),
      stream_(path == "-" ? stdin : open_file(path_of(path), "rb")) {
  if (stream_ == nullptr) fail();
  std::setvbuf(stream_.get(), nullptr, _IONBF, 0);  // blocks are large
  can_seek_ = can_seek(stream_.get()) && std::fgetpos(stream_.get(), &start_) == 0;
  std::error_code ignored;
  if (path != "-" && fs::is_regular_file(path_of(path), ignored)) {
    const std::uintmax_t bytes = fs::file_size(path_of(path), ignored);
    if (!ignored) size_ = bytes;
  }
}

void CsvSource::fail() const {
  throw Failure(kUnreadable, visible(path_) + ": it cannot be read: " + last_error().message() +
                                 "; name a CSV file, or - for standard input");
}

std::size_t CsvSource::read(char* into, std::size_t room) {
  if (block_ < kept_.size()) return read_kept(into, room);
  const std::size_t count = std::fread(into, 1, room, stream_.get());
  if (std::ferror(stream_.get()) != 0) fail();
  bytes_read_ += count;
  if (!can_seek_ && !is_last_time_ && count > 0) {
    kept_.emplace_back(into, count);
    block_ = kept_.size();
  }
  return count;
}

std::size_t CsvSource::read_kept(char* into, std::size_t room) {
  const std::string& block = kept_[block_];
  const std::size_t count = std::min(room, block.size() - block_pos_);
  std::memcpy(into, block.data() + block_pos_, count);
  block_pos_ += count;
  bytes_read_ += count;
  if (block_pos_ < block.size()) return count;
  block_pos_ = 0;
  if (is_last_time_) {
    kept_.pop_front();
  } else {
    ++block_;
  }
  return count;
}

void CsvSource::start_over() {
  bytes_read_ = 0;
  block_ = block_pos_ = 0;
  if (can_seek_ && std::fsetpos(stream_.get(), &start_) != 0) fail();
}

void CsvSource::start_over_for_the_last_time() {
  start_over();
  is_last_time_ = true;
}

}  // namespace tool
