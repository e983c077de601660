// The bytes of a CSV file or of a pipe, in order, and again from the start.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <deque>
#include <memory>
#include <string>

namespace tool {

class CsvSource {
 public:
  explicit CsvSource(const std::string& path);  // - for standard input

  const std::string& name() const { return name_; }  // as messages say it

  // The next bytes, `room` at most; 0 at the end. A Failure when the file cannot be read.
  std::size_t read(char* into, std::size_t room);

  // The next read starts over. What comes out of a pipe is kept for that, until it is read for the
  // last time.
  void start_over();
  void start_over_for_the_last_time();

  std::uintmax_t size() const { return size_; }  // 0: not known
  std::uintmax_t bytes_read() const { return bytes_read_; }

 private:
  struct CloseFile {
    void operator()(std::FILE* stream) const {
      if (stream != stdin) std::fclose(stream);
    }
  };
  std::size_t read_kept(char* into, std::size_t room);
  [[noreturn]] void fail() const;

  std::string path_, name_;
  std::unique_ptr<std::FILE, CloseFile> stream_;
  std::fpos_t start_{};
  bool can_seek_ = false;
  std::uintmax_t size_ = 0, bytes_read_ = 0;
  std::deque<std::string> kept_;  // what has come out of a pipe
  std::size_t block_ = 0;         // of them, that is read next; their number: the pipe itself is
  std::size_t block_pos_ = 0;     // in that block
  bool is_last_time_ = false;
};

}  // namespace tool
