#include "core/io/replacement.h"

#include <fcntl.h>
#include <stdlib.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <climits>
#include <cstring>

namespace tevpf {

namespace {

constexpr char kSuffix[] = ".XXXXXX";  // appended to the file's name for the image
constexpr mode_t kModeBits = 07777;

class Descriptor {
 public:
  explicit Descriptor(int fd) noexcept : fd_(fd) {}
  ~Descriptor() {
    if (fd_ >= 0) close(fd_);
  }
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;
  int get() const noexcept { return fd_; }
  int release() noexcept {
    const int fd = fd_;
    fd_ = -1;
    return fd;
  }

 private:
  int fd_;
};

// Gets the metadata of a file that can be replaced: it is writable, regular and has no other hard
// link.
bool describe(const char* path, struct stat& facts) noexcept {
  const Descriptor file(open(path, O_WRONLY | O_CLOEXEC | O_NONBLOCK));
  return file.get() >= 0 && fstat(file.get(), &facts) == 0 && S_ISREG(facts.st_mode) &&
         facts.st_nlink == 1;
}

// Sets the owner first: changing it may clear set-user-ID bits of the mode.
bool take_over(int image, const struct stat& facts) noexcept {
  struct stat own;
  if (fstat(image, &own) != 0) return false;
  const bool same_owner = own.st_uid == facts.st_uid && own.st_gid == facts.st_gid;
  if (!same_owner && fchown(image, facts.st_uid, facts.st_gid) != 0) return false;
  return fchmod(image, facts.st_mode & kModeBits) == 0;
}

// Some file systems do not support fsync; there is nothing to wait for then.
bool is_flushed(int fd) noexcept {
  return fsync(fd) == 0 || errno == EINVAL || errno == ENOTSUP || errno == EROFS;
}

// The system does not allow a file next to this one, or replacing it; the disk is not at fault.
bool may_be_written_plainly(int error_number) noexcept {
  return error_number == EACCES || error_number == EPERM || error_number == EROFS ||
         error_number == EBUSY || error_number == EXDEV || error_number == ENAMETOOLONG;
}

// Makes the new name survive a power failure; the file is whole either way. A folder without read
// permission cannot be flushed.
bool flush_folder(char* path) noexcept {
  *std::strrchr(path, '/') = '\0';
  const Descriptor folder(open(path[0] == '\0' ? "/" : path, O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  return folder.get() < 0 ? errno == EACCES : is_flushed(folder.get());
}

}  // namespace

Replacement::Replacement(const char* name) noexcept {
  static_assert(kPathSize >= PATH_MAX);
  image_[0] = '\0';
  struct stat facts;
  if (realpath(name, target_) == nullptr || !describe(target_, facts)) return;
  const std::size_t length = std::strlen(target_);
  if (length + sizeof kSuffix > sizeof image_) return;
  std::memcpy(image_, target_, length);
  std::memcpy(image_ + length, kSuffix, sizeof kSuffix);
  Descriptor image(mkostemp(image_, O_CLOEXEC));
  if (image.get() < 0) {
    failed_ = facts.st_size > 0 && !may_be_written_plainly(errno);
    image_[0] = '\0';
    return;
  }
  if (!take_over(image.get(), facts)) return;
  stream_ = fdopen(image.get(), "wb");
  if (stream_ != nullptr) image.release();
}

void Replacement::discard() noexcept {
  if (std::FILE* stream = release_stream()) std::fclose(stream);
  if (image_[0] != '\0') unlink(image_);
  image_[0] = '\0';
}

Replacement::Outcome Replacement::put_in_place(std::FILE*&) noexcept {
  if (!is_flushed(fileno(stream_))) return Outcome::kFailed;
  if (std::rename(image_, target_) != 0) {
    const Outcome outcome =
        may_be_written_plainly(errno) ? Outcome::kNotPossible : Outcome::kFailed;
    discard();  // it may occupy the space that a plain write needs
    return outcome;
  }
  image_[0] = '\0';
  return flush_folder(target_) ? Outcome::kDone : Outcome::kNotFlushed;
}

}  // namespace tevpf
