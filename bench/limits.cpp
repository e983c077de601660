// The plain system calls that saving and opening are held against.
#include <fcntl.h>
#include <unistd.h>

#include "common.h"

namespace bench {

namespace {

void write_all(const std::string& path, std::span<const char> bytes, bool sync) {
  const int fd = open(path.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0644);
  std::size_t done = 0;
  while (done < bytes.size()) {
    const ssize_t n = write(fd, bytes.data() + done, bytes.size() - done);
    if (n <= 0) give_up("write", n);
    done += static_cast<std::size_t>(n);
  }
  if (sync) fsync(fd);
  close(fd);
}

}  // namespace

void write_plainly(const std::string& path, std::span<const char> bytes) {
  write_all(path, bytes, false);
}

void write_and_sync(const std::string& path, std::span<const char> bytes) {
  write_all(path, bytes, true);
}

void read_plainly(const std::string& path, std::vector<char>& bytes) {
  const int fd = open(path.c_str(), O_RDONLY);
  std::size_t done = 0;
  while (done < bytes.size()) {
    const ssize_t n = read(fd, bytes.data() + done, bytes.size() - done);
    if (n <= 0) give_up("read", n);
    done += static_cast<std::size_t>(n);
  }
  close(fd);
}

std::vector<char> contents(const std::string& path) {
  std::vector<char> bytes(std::filesystem::file_size(path));
  read_plainly(path, bytes);
  return bytes;
}

}  // namespace bench

BENCHMARK_MAIN();
