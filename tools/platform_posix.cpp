// The platform of POSIX systems, and what only Linux has.
#include <fcntl.h>
#include <sys/file.h>
#include <sys/ioctl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <future>
#include <utility>

#include "platform.h"

namespace fs = std::filesystem;

namespace tool {
namespace {

// Read by the signal handler: a fixed buffer, empty when there is nothing to remove.
std::array<char, 4096> interrupted_file;

constexpr int kInterrupts[] = {SIGHUP, SIGINT, SIGTERM};

extern "C" void on_interrupt(int signal) {
  if (interrupted_file[0] != '\0') (void)unlink(interrupted_file.data());
  std::signal(signal, SIG_DFL);
  std::raise(signal);
}

void catch_interrupts() {
  for (const int signal : kInterrupts) {
    const bool was_ignored = std::signal(signal, SIG_IGN) == SIG_IGN;
    if (!was_ignored) std::signal(signal, on_interrupt);
  }
}

class Descriptor {
 public:
  explicit Descriptor(int fd) : fd_(fd) {}
  ~Descriptor() { close(fd_); }
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;

 private:
  int fd_;
};

// Of nested holders, the outermost one lets interrupts in again.
int holders = 0;
sigset_t mask_before;

sigset_t interrupts() {
  sigset_t set;
  sigemptyset(&set);
  for (const int signal : kInterrupts) sigaddset(&set, signal);
  return set;
}

// A stream that the caller has closed must not become the next file that is opened: messages would
// go there. What takes its place fails as a closed one does.
void occupy_closed_streams() {
  for (int fd = 0; fd <= 2; ++fd) {
    if (fcntl(fd, F_GETFD) < 0) (void)open("/dev/null", fd == 0 ? O_WRONLY : O_RDONLY);
  }
}

bool is_same_file(int file, const fs::path& path) {
  struct stat open_one, named;
  return fstat(file, &open_one) == 0 && stat(path.c_str(), &named) == 0 &&
         open_one.st_dev == named.st_dev && open_one.st_ino == named.st_ino;
}

// Some network file systems lock only what is open for writing.
int open_to_lock(const fs::path& path) {
  const int file = open(path.c_str(), O_RDWR | O_NONBLOCK | O_CLOEXEC);
  return file >= 0 ? file : open(path.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC);
}

bool lock_now(int file) { return flock(file, LOCK_EX | LOCK_NB) == 0; }

bool lock_later(int file) {
  while (flock(file, LOCK_EX) != 0) {
    if (errno != EINTR) return false;
  }
  return true;
}

mode_t mode_of_new_files() {
  const mode_t mask = umask(0);
  umask(mask);
  return 0666 & ~mask;
}

}  // namespace

std::error_code write_error(std::FILE*) { return last_error(); }

std::vector<std::string> command_line(int count, const char* const* given) {
  return {given, given + count};
}

void prepare_process() {
  occupy_closed_streams();
  std::signal(SIGPIPE, SIG_IGN);
  std::signal(SIGXFSZ, SIG_IGN);
  catch_interrupts();
}

void remove_on_interrupt(const fs::path& file) {
  const HoldInterrupts hold;
  const std::string& name = file.native();
  interrupted_file[0] = '\0';
  if (name.size() < interrupted_file.size()) {
    std::memcpy(interrupted_file.data(), name.c_str(), name.size() + 1);
  }
}

std::optional<std::string> environment(const char* name) {
  const char* const value = std::getenv(name);
  if (value == nullptr) return std::nullopt;
  return value;
}

std::FILE* open_file(const fs::path& name, const char* mode) {
  return std::fopen(name.c_str(), mode);
}

bool can_seek(std::FILE* stream) { return ftello(stream) >= 0; }

bool is_terminal(std::FILE* stream) { return isatty(fileno(stream)) != 0; }

TerminalSize terminal_size() {
  winsize size{};
  if (ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) != 0) return {};
  return {size.ws_col, size.ws_row};
}

// Without a choice of the user's, less leaves a short text on the screen and keeps colours.
std::FILE* open_pager(const std::string& command) {
  (void)setenv("LESS", "FRX", 0);
  std::fflush(stdout);
  std::FILE* const pager = popen(command.c_str(), "w");
  if (pager != nullptr) std::signal(SIGINT, SIG_IGN);
  return pager;
}

void close_pager(std::FILE* pager) { (void)pclose(pager); }

bool stdout_is(const fs::path& file) { return is_same_file(STDOUT_FILENO, file); }

HoldInterrupts::HoldInterrupts() {
  const sigset_t set = interrupts();
  if (holders++ == 0) pthread_sigmask(SIG_BLOCK, &set, &mask_before);
}

HoldInterrupts::~HoldInterrupts() {
  if (--holders == 0) pthread_sigmask(SIG_SETMASK, &mask_before, nullptr);
}

std::FILE* create_private_file(const fs::path& name) {
  const int file = open(name.c_str(), O_RDWR | O_CREAT | O_EXCL | O_CLOEXEC, 0600);
  if (file < 0) return nullptr;
  std::FILE* const stream = fdopen(file, "w+b");
  if (stream != nullptr) return stream;
  const int why = errno;
  (void)close(file);
  (void)unlink(name.c_str());  // this call has made it
  errno = why;
  return nullptr;
}

bool copy_rights(std::FILE* stream, const fs::path& like) {
  const int file = fileno(stream);
  struct stat old;
  if (stat(like.c_str(), &old) != 0 || !S_ISREG(old.st_mode)) {
    return fchmod(file, mode_of_new_files()) == 0;
  }
  mode_t mode = old.st_mode & 07777;
  // Only the administrator may give files away; anyone else keeps at least the group. Whom a file
  // of another owner or group lets in, the old one did not.
  if (fchown(file, old.st_uid, old.st_gid) != 0) {
    mode &= 0777;
    if (fchown(file, static_cast<uid_t>(-1), old.st_gid) != 0) mode &= 0707;
  }
  return fchmod(file, mode) == 0;
}

bool flush_to_disk(std::FILE* stream) {
  return std::fflush(stream) == 0 &&
         (fsync(fileno(stream)) == 0 || errno == EINVAL || errno == ENOTSUP);
}

bool rename_to_new(const fs::path& from, const fs::path& to) {
  if (renameat2(AT_FDCWD, from.c_str(), AT_FDCWD, to.c_str(), RENAME_NOREPLACE) == 0) return true;
  if (errno != EINVAL && errno != ENOSYS) return false;
  // Not every file system knows the flag. A link never replaces a file either.
  return link(from.c_str(), to.c_str()) == 0 && unlink(from.c_str()) == 0;
}

// The library opens and closes the file meanwhile, which would release a lock of fcntl's.
FileLock::FileLock(const fs::path& path, const std::function<void()>& wait_begins) {
  for (bool has_waited = false;;) {
    const int file = open_to_lock(path);
    lock_ = file;
    if (file < 0) {
      error_ = last_error();
      state_ = State::kNoFile;
      return;
    }
    bool is_locked = lock_now(file);
    if (!is_locked && errno == EWOULDBLOCK) {
      if (!std::exchange(has_waited, true)) wait_begins();
      is_locked = lock_later(file);
    }
    if (!is_locked) {
      error_ = last_error();
      state_ = State::kRefused;
      return;
    }
    if (is_same_file(file, path)) return;
    close(file);
  }
}

FileLock::~FileLock() {
  if (lock_ != kNone) close(static_cast<int>(lock_));
}

// By way of a pipe: writing into it cannot fail, and what `take` throws ends the writing.
void collect(const std::function<void(const fs::path& path)>& make,
             const std::function<void(std::string_view)>& take) {
  int ends[2];
  if (pipe2(ends, O_CLOEXEC) != 0) throw std::system_error(last_error(), "pipe");
  std::future<void> made = std::async(std::launch::async, [&make, end = ends[1]] {
    const Descriptor closed_afterwards(end);
    make("/dev/fd/" + std::to_string(end));
  });
  const Descriptor closed_first(ends[0]);
  std::array<char, 65536> block;
  for (;;) {
    const ssize_t count = read(ends[0], block.data(), block.size());
    if (count < 0) throw std::system_error(last_error(), "pipe");
    if (count == 0) break;
    take({block.data(), static_cast<std::size_t>(count)});
  }
  made.get();
}

}  // namespace tool
