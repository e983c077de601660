#include "output.h"

#include <array>
#include <cerrno>
#include <cstring>
#include <system_error>
#include <utility>

#include "failure.h"
#include "platform.h"
#include "text.h"

namespace fs = std::filesystem;

namespace tool {
namespace {

// Dumps do not report a full disk. When one was cut short by it, the bytes behind it find no room
// either.
bool has_room_behind(const fs::path& file) {
  std::error_code error;
  const std::uintmax_t size = fs::file_size(file, error);
  if (error) return false;
  std::FILE* stream = std::fopen(file.string().c_str(), "ab");
  if (stream == nullptr) return false;
  static constexpr std::array<char, 65536> kProbe{};
  const bool written = std::fwrite(kProbe.data(), 1, kProbe.size(), stream) == kProbe.size();
  const bool flushed = std::fflush(stream) == 0;
  const int reason = errno;
  const bool closed = std::fclose(stream) == 0;
  fs::resize_file(file, size, error);
  if (!(written && flushed)) errno = reason;
  return written && flushed && closed && !error;
}

// The file that a path names in the end: an existing link stays a link.
fs::path followed(const fs::path& path) {
  std::error_code error;
  fs::path result = fs::weakly_canonical(path, error);
  return error ? path : result;
}

}  // namespace

Output::Output(const std::string& name, const fs::path& source) : name_(name) {
  if (name.empty() || name == "-") {
    if (!source.empty() && stdout_is(source)) {
      throw Failure(kRefused, "standard output is " + in_quotes(source.string()) +
                                  " itself; send the output to another file");
    }
    stream_ = stdout;
    return;
  }
  std::error_code ignored;
  if (fs::equivalent(name, source, ignored)) {
    throw Failure(kRefused, "-o names " + in_quotes(source.string()) +
                                " itself; the output would destroy it, so choose another file");
  }
  target_ = followed(name);
  if (!fs::exists(target_, ignored) || fs::is_regular_file(target_, ignored)) {
    if (fs::exists(target_, ignored)) {
      std::FILE* writable = std::fopen(name.c_str(), "r+b");
      if (writable == nullptr) fail(errno);
      std::fclose(writable);
    }
    temp_.emplace(TempFile::beside(target_));
  }
  open_stream();
}

Output::~Output() {
  if (stream_ != nullptr && stream_ != stdout) std::fclose(stream_);
}

void Output::open_stream() {
  stream_ = std::fopen((temp_ ? temp_->path() : target_).string().c_str(), "wb");
  if (stream_ == nullptr) fail(errno);
}

void Output::fail(int error) {
  if (error == EPIPE) throw ClosedPipe{};
  throw Failure(kCannotWrite, (target_.empty() ? "standard output" : in_quotes(name_)) +
                                  " cannot be written: " + std::generic_category().message(error) +
                                  "; make room or choose another file");
}

void Output::write(std::string_view text) {
  if (std::fwrite(text.data(), 1, text.size(), stream_) != text.size()) fail(errno);
}

void Output::write_file(const std::function<void(const std::string& path)>& make) {
  if (temp_) {
    std::fclose(std::exchange(stream_, nullptr));
    make(temp_->path().string());
    if (!has_room_behind(temp_->path())) fail(errno);
    return;
  }
  TempFile made = TempFile::anywhere();
  make(made.path().string());
  if (!has_room_behind(made.path())) {
    throw Failure(kCannotWrite, "there is no room for a temporary file in " +
                                    in_quotes(made.path().parent_path().string()) + ": " +
                                    std::strerror(errno) + "; make room or use -o");
  }
  copy_from(made.path());
}

void Output::copy_from(const fs::path& file) {
  std::FILE* source = std::fopen(file.string().c_str(), "rb");
  if (source == nullptr) fail(errno);
  std::array<char, 65536> block;
  std::size_t count = 0;
  do {
    count = std::fread(block.data(), 1, block.size(), source);
    try {
      write({block.data(), count});
    } catch (...) {
      std::fclose(source);
      throw;
    }
  } while (count > 0);
  std::fclose(source);
}

void Output::finish() {
  if (stream_ != nullptr) {
    if (std::fflush(stream_) != 0) fail(errno);
    if (stream_ != stdout && std::fclose(std::exchange(stream_, nullptr)) != 0) fail(errno);
  }
  if (temp_) temp_->replace(target_);
}

void print(const std::string& text) {
  Output output({}, {});
  output.write(text);
  output.finish();
}

}  // namespace tool
