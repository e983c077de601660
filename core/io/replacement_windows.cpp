#include "core/io/replacement.h"

#include <windows.h>
// After windows.h, which it needs.
#include <aclapi.h>
#include <fcntl.h>
#include <io.h>
#include <sys/stat.h>

#include <cerrno>
#include <cstdint>
#include <cwchar>
#include <iterator>

#include "core/io/wide_name.h"

namespace tevpf {

namespace {

constexpr wchar_t kSuffix[] = L".tevpf-000000";  // appended to the file's name for the image

class Handle {
 public:
  explicit Handle(const wchar_t* path) noexcept
      : handle_(CreateFileW(path, GENERIC_READ | GENERIC_WRITE, kShareAll, nullptr, OPEN_EXISTING,
                            FILE_ATTRIBUTE_NORMAL, nullptr)) {}
  ~Handle() {
    if (is_open()) CloseHandle(handle_);
  }
  Handle(const Handle&) = delete;
  Handle& operator=(const Handle&) = delete;
  bool is_open() const noexcept { return handle_ != INVALID_HANDLE_VALUE; }
  HANDLE get() const noexcept { return handle_; }

 private:
  static constexpr DWORD kShareAll = FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE;
  HANDLE handle_;
};

struct Target {
  bool can_be_replaced = false;  // writable, regular, no other hard link
  bool has_content = false;
};

// Finds the file that a name means, links followed.
Target find_target(const wchar_t* name, wchar_t* path, DWORD room) noexcept {
  const Handle file(name);
  BY_HANDLE_FILE_INFORMATION facts;
  if (!file.is_open() || GetFileType(file.get()) != FILE_TYPE_DISK ||
      !GetFileInformationByHandle(file.get(), &facts)) {
    return {};
  }
  const DWORD length = GetFinalPathNameByHandleW(file.get(), path, room, FILE_NAME_NORMALIZED);
  return {length > 0 && length < room && facts.nNumberOfLinks == 1,
          facts.nFileSizeHigh != 0 || facts.nFileSizeLow != 0};
}

// Creates a file with an unused name: digits from the clock take the place of the suffix's.
int create_beside(wchar_t* path, std::size_t digits) noexcept {
  constexpr int kTries = 100;
  auto number = static_cast<std::uint32_t>(GetTickCount64() ^ GetCurrentProcessId());
  for (int i = 0; i < kTries; ++i, ++number) {
    std::uint32_t rest = number;
    for (std::size_t d = digits; path[d] != L'\0'; ++d, rest /= 10)
      path[d] = static_cast<wchar_t>(L'0' + rest % 10);
    const int file = _wopen(path, _O_CREAT | _O_EXCL | _O_WRONLY | _O_BINARY, _S_IREAD | _S_IWRITE);
    if (file >= 0 || errno != EEXIST) return file;
  }
  return -1;
}

// The image gets the access rights of the file. False if that is not permitted.
bool take_over(wchar_t* image, wchar_t* target) noexcept {
  PACL rights = nullptr;
  PSECURITY_DESCRIPTOR descriptor = nullptr;
  if (GetNamedSecurityInfoW(target, SE_FILE_OBJECT, DACL_SECURITY_INFORMATION, nullptr, nullptr,
                            &rights, nullptr, &descriptor) != ERROR_SUCCESS) {
    return false;
  }
  const DWORD error = SetNamedSecurityInfoW(image, SE_FILE_OBJECT, DACL_SECURITY_INFORMATION,
                                            nullptr, nullptr, rights, nullptr);
  LocalFree(descriptor);
  return error == ERROR_SUCCESS;
}

// The system does not allow replacing the file: it is in use, or may not be changed so. The disk is not
// at fault.
bool may_be_written_plainly(DWORD error) noexcept {
  return error == ERROR_ACCESS_DENIED || error == ERROR_SHARING_VIOLATION ||
         error == ERROR_LOCK_VIOLATION || error == ERROR_USER_MAPPED_FILE ||
         error == ERROR_NOT_SAME_DEVICE;
}

// Programs that look at every new file, such as virus scanners, have it open for a moment.
DWORD move_over(const wchar_t* image, const wchar_t* target) noexcept {
  constexpr DWORD kLongestPause = 128;  // milliseconds; twice as long in all
  for (DWORD pause = 1;; pause *= 2) {
    if (MoveFileExW(image, target, MOVEFILE_REPLACE_EXISTING | MOVEFILE_WRITE_THROUGH)) {
      return ERROR_SUCCESS;
    }
    const DWORD error = GetLastError();
    if (!may_be_written_plainly(error) || pause > kLongestPause) return error;
    Sleep(pause);
  }
}

}  // namespace

Replacement::Replacement(const char* name) noexcept {
  image_[0] = L'\0';
  const WideName wide(name);
  if (wide.get() == nullptr) return;
  const Target target = find_target(wide.get(), target_, kPathSize);
  const std::size_t length = target.can_be_replaced ? std::wcslen(target_) : kPathSize;
  if (length + std::size(kSuffix) > kPathSize) return;
  std::wcscpy(image_, target_);
  std::wcscpy(image_ + length, kSuffix);
  const int image = create_beside(image_, length + std::wcslen(L".tevpf-"));
  if (image < 0) {
    failed_ = target.has_content && errno != EACCES;
    image_[0] = L'\0';
    return;
  }
  if (take_over(image_, target_)) stream_ = _fdopen(image, "wb");
  if (stream_ == nullptr) _close(image);
}

void Replacement::discard() noexcept {
  if (std::FILE* stream = release_stream()) std::fclose(stream);
  if (image_[0] != L'\0') _wremove(image_);
  image_[0] = L'\0';
}

Replacement::Outcome Replacement::put_in_place(std::FILE*& old) noexcept {
  const bool is_flushed = _commit(_fileno(stream_)) == 0;
  const bool is_closed = std::fclose(release_stream()) == 0;
  if (!is_flushed || !is_closed) return Outcome::kFailed;
  const bool had_old = old != nullptr;
  if (had_old) std::fclose(old);
  old = nullptr;
  if (const DWORD error = move_over(image_, target_); error != ERROR_SUCCESS) {
    discard();  // it may occupy the space that a plain write needs
    if (may_be_written_plainly(error)) return Outcome::kNotPossible;
    if (had_old) old = _wfopen(target_, L"r+b");
    return Outcome::kFailed;
  }
  image_[0] = L'\0';
  stream_ = _wfopen(target_, L"r+b");
  return Outcome::kDone;
}

}  // namespace tevpf
