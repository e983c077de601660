#include "platform.h"

#include <fcntl.h>
#include <sys/stat.h>

#include <array>
#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstring>
#include <string>

#ifdef _WIN32
#include <io.h>
#else
#include <unistd.h>
#endif

namespace tool {
namespace {

#ifdef _WIN32
constexpr int kCreate = _O_CREAT | _O_EXCL | _O_WRONLY | _O_BINARY;
constexpr int kUpdate = _O_RDWR | _O_BINARY;
constexpr int kPrivate = _S_IREAD | _S_IWRITE, kShared = kPrivate;
int descriptor(std::FILE* stream) { return _fileno(stream); }
int open_file(const char* name, int mode, int permissions) {
  return _open(name, mode, permissions);
}
int sync_file(int file) { return _commit(file); }
int close_file(int file) { return _close(file); }
int is_terminal(int file) { return _isatty(file); }
int remove_name(const char* name) { return _unlink(name); }
#else
constexpr int kCreate = O_CREAT | O_EXCL | O_WRONLY | O_CLOEXEC;
constexpr int kUpdate = O_RDWR | O_CLOEXEC;
constexpr unsigned kPrivate = 0600, kShared = 0666;
int descriptor(std::FILE* stream) { return fileno(stream); }
int open_file(const char* name, int mode, unsigned permissions) {
  return open(name, mode, permissions);
}
int sync_file(int file) { return fsync(file); }
int close_file(int file) { return close(file); }
int is_terminal(int file) { return isatty(file); }
int remove_name(const char* name) { return unlink(name); }
#endif

bool sync_and_close(int file) {
  const bool synced = sync_file(file) == 0;
  return close_file(file) == 0 && synced;
}

// Read by the signal handler: a fixed buffer, empty when there is nothing to remove.
std::array<char, 4096> interrupted_file;

extern "C" void on_interrupt(int signal) {
  if (interrupted_file[0] != '\0') (void)remove_name(interrupted_file.data());
  std::signal(signal, SIG_DFL);
  std::raise(signal);
}

}  // namespace

void prepare_standard_output() {
#ifdef _WIN32
  _setmode(_fileno(stdout), _O_BINARY);
  _setmode(_fileno(stdin), _O_BINARY);
#else
  std::signal(SIGPIPE, SIG_IGN);
#endif
}

bool stdout_is_terminal() { return is_terminal(descriptor(stdout)) != 0; }

bool stdout_is(const std::filesystem::path& file) {
#ifdef _WIN32
  (void)file;  // has no cheap identity of an open file there
  return false;
#else
  struct stat output, other;
  return fstat(descriptor(stdout), &output) == 0 && stat(file.c_str(), &other) == 0 &&
         output.st_dev == other.st_dev && output.st_ino == other.st_ino;
#endif
}

bool create_exclusively(const std::filesystem::path& file, bool is_private) {
  const int made = open_file(file.string().c_str(), kCreate, is_private ? kPrivate : kShared);
  if (made < 0) return false;
  if (sync_and_close(made)) return true;
  const int reason = errno;  // for the message
  (void)remove_name(file.string().c_str());
  errno = reason;
  return false;
}

bool flush_to_disk(const std::filesystem::path& file) {
  const int opened = open_file(file.string().c_str(), kUpdate, kShared);
  return opened >= 0 && sync_and_close(opened);
}

void copy_owner(const std::filesystem::path& from, const std::filesystem::path& to) {
#ifdef _WIN32
  (void)from, (void)to;
#else
  struct stat owner;
  if (stat(from.c_str(), &owner) != 0) return;
  // Only the administrator may give files away; anyone else keeps at least the group.
  if (chown(to.c_str(), owner.st_uid, owner.st_gid) != 0 &&
      chown(to.c_str(), static_cast<uid_t>(-1), owner.st_gid) != 0) {
    return;
  }
#endif
}

void remove_on_interrupt(const std::filesystem::path& file) {
  const std::string name = file.string();
  interrupted_file[0] = '\0';
  if (name.empty() || name.size() >= interrupted_file.size()) return;
  std::memcpy(interrupted_file.data() + 1, name.c_str() + 1, name.size());
  interrupted_file[0] = name[0];  // last: the handler sees nothing or the whole name
  std::signal(SIGINT, on_interrupt);
  std::signal(SIGTERM, on_interrupt);
#ifndef _WIN32
  std::signal(SIGHUP, on_interrupt);
#endif
}

}  // namespace tool
