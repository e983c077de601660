#include "core/io/disk_file.h"

#include <fcntl.h>
#include <sys/stat.h>

#include <cerrno>

#ifdef _WIN32
#include <io.h>

#include <cwchar>

#include "core/io/wide_name.h"
#else
#include <unistd.h>
#endif

namespace tevpf {
namespace {

#ifdef _WIN32
constexpr int kNoWait = _O_BINARY;

int open_descriptor(const char* name, int flags) noexcept {
  const WideName wide(name);
  if (wide.get() == nullptr) return -1;
  return _wopen(wide.get(), flags | _O_BINARY, _S_IREAD | _S_IWRITE);
}
bool is_regular(int file) noexcept {
  struct _stat64 facts;
  return _fstat64(file, &facts) == 0 && (facts.st_mode & _S_IFMT) == _S_IFREG;
}
std::FILE* stream_of(int file, const char* mode) noexcept { return _fdopen(file, mode); }
void close_descriptor(int file) noexcept { _close(file); }
#else
constexpr int kNoWait = O_NONBLOCK;  // opening a pipe would wait for its other end

int open_descriptor(const char* name, int flags) noexcept {
  constexpr mode_t kMode = 0666;
  return open(name, flags | O_CLOEXEC, kMode);
}
bool is_regular(int file) noexcept {
  struct stat facts;
  return fstat(file, &facts) == 0 && S_ISREG(facts.st_mode);
}
std::FILE* stream_of(int file, const char* mode) noexcept { return fdopen(file, mode); }
void close_descriptor(int file) noexcept { close(file); }
#endif

// A stream for a descriptor. Closes the descriptor when no stream can be created.
std::FILE* adopt(int file, const char* mode) noexcept {
  std::FILE* const stream = stream_of(file, mode);
  if (stream == nullptr) close_descriptor(file);
  return stream;
}

}  // namespace

std::FILE* open_regular(const char* name, Access access) noexcept {
  constexpr int kFlags[] = {O_RDONLY, O_RDWR, O_WRONLY};
  constexpr const char* kModes[] = {"rb", "r+b", "wb"};
  const auto which = static_cast<int>(access);
  const int file = open_descriptor(name, kFlags[which] | kNoWait);
  if (file < 0) return nullptr;
  if (is_regular(file)) return adopt(file, kModes[which]);
  close_descriptor(file);
  errno = EINVAL;
  return nullptr;
}

std::FILE* create_file(const char* name) noexcept {
  const int file = open_descriptor(name, O_WRONLY | O_CREAT | O_EXCL);
  if (file < 0) return nullptr;
  std::FILE* const stream = adopt(file, "wb");
  if (stream != nullptr) return stream;
  const int why = errno;
  remove_file(name);  // this call has made it
  errno = why;
  return nullptr;
}

#ifdef _WIN32

std::FILE* open_stream(const char* name, const char* mode) noexcept {
  const WideName wide(name), wide_mode(mode);
  return wide.get() != nullptr ? _wfopen(wide.get(), wide_mode.get()) : nullptr;
}

void remove_file(const char* name) noexcept {
  const WideName wide(name);
  if (wide.get() != nullptr) _wremove(wide.get());
}

bool empty_file(std::FILE* stream) noexcept { return _chsize_s(_fileno(stream), 0) == 0; }

// On Windows, nobody else can remove or replace an open file.
void remove_own_file(const char* name, std::FILE* stream) noexcept {
  std::fclose(stream);
  remove_file(name);
}

#else

std::FILE* open_stream(const char* name, const char* mode) noexcept {
  return std::fopen(name, mode);
}

void remove_file(const char* name) noexcept { unlink(name); }

bool empty_file(std::FILE* stream) noexcept { return ftruncate(fileno(stream), 0) == 0; }

void remove_own_file(const char* name, std::FILE* stream) noexcept {
  struct stat own, named;
  const bool is_own = fstat(fileno(stream), &own) == 0 && lstat(name, &named) == 0 &&
                      own.st_dev == named.st_dev && own.st_ino == named.st_ino;
  std::fclose(stream);
  if (is_own) unlink(name);
}

#endif

}  // namespace tevpf
