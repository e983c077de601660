// Saving and opening whole files, and the plain system calls that they are held against.
#include <fcntl.h>
#include <sys/mman.h>
#include <unistd.h>

#include <cstring>

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

}  // namespace

void write_plainly(const std::string& path, std::span<const char> bytes) {
  write_all(path, bytes, false);
}

void write_and_sync(const std::string& path, std::span<const char> bytes) {
  write_all(path, bytes, true);
}

std::vector<char> contents(const std::string& path) {
  std::vector<char> bytes(std::filesystem::file_size(path));
  read_plainly(path, bytes);
  return bytes;
}

void warm_memory() {
  constexpr std::size_t kBytes = std::size_t{256} << 20;
  void* const block =
      mmap(nullptr, kBytes, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0);
  if (block == MAP_FAILED) return;
  madvise(block, kBytes, MADV_HUGEPAGE);
  std::memset(block, 1, kBytes);
  munmap(block, kBytes);
}

void time_save(benchmark::State& state, std::int64_t operations) {
  const std::string path = folder().file("saved.pf");
  warm_memory();
  for (auto _ : state) {
    std::filesystem::remove(path);
    const Timer timer;
    MUST(TEV8R1_PF_save(path.c_str()));
    timer.stop(state, operations);
  }
}

void time_backup(benchmark::State& state, const Database& from, std::int64_t operations) {
  const std::string path = folder().file("saved.db");
  warm_memory();
  for (auto _ : state) {
    std::filesystem::remove(path);
    const Timer timer;
    const Database to(path);
    backup(from, to);
    timer.stop(state, operations);
  }
}

void time_serialize(benchmark::State& state, const Database& from, std::int64_t operations) {
  const std::string path = folder().file("saved.db");
  warm_memory();
  for (auto _ : state) {
    std::filesystem::remove(path);
    const Timer timer;
    sqlite3_int64 size = 0;
    unsigned char* image = sqlite3_serialize(from.get(), "main", &size, 0);
    write_plainly(path, {reinterpret_cast<const char*>(image), static_cast<std::size_t>(size)});
    timer.stop(state, operations);
    sqlite3_free(image);
  }
}

void time_write(benchmark::State& state, const std::string& source, std::int64_t operations) {
  const std::vector<char> bytes = contents(source);
  const std::string path = folder().file("saved.pf");
  warm_memory();
  for (auto _ : state) {
    std::filesystem::remove(path);
    const Timer timer;
    write_plainly(path, bytes);
    timer.stop(state, operations);
  }
}

void time_open(benchmark::State& state, const std::string& path, std::int64_t operations) {
  warm_memory();
  for (auto _ : state) {
    const Timer timer;
    MUST(TEV8R1_PF_open(path.c_str()));
    timer.stop(state, operations);
    MUST(TEV8R1_PF_close(0));
  }
}

void time_read(benchmark::State& state, const std::string& path, std::int64_t operations) {
  std::vector<char> bytes = contents(path);
  warm_memory();
  for (auto _ : state) {
    const Timer timer;
    read_plainly(path, bytes);
    timer.stop(state, operations);
  }
}

}  // namespace bench
