// The platform of Windows. Names are UTF-8 here and UTF-16 in the system; the standard library's narrow
// paths are UTF-8, too.
#ifndef NOMINMAX
#define NOMINMAX
#endif
#define WIN32_LEAN_AND_MEAN
#include <windows.h>
// After windows.h, which it needs.
#include <fcntl.h>
#include <io.h>
#include <shellapi.h>
#include <sys/stat.h>

#include <array>
#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <cwchar>
#include <cwctype>
#include <memory>
#include <utility>

#include "platform.h"

namespace fs = std::filesystem;

namespace tool {
namespace {

constexpr DWORD kShareAll = FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE;

struct CloseHandleOf {
  void operator()(void* handle) const { CloseHandle(handle); }
};
using Handle = std::unique_ptr<void, CloseHandleOf>;

std::error_code system_error() {
  return {static_cast<int>(GetLastError()), std::system_category()};
}

std::string utf8(const wchar_t* text) {
  constexpr int kToTheTerminator = -1;
  const int size =
      WideCharToMultiByte(CP_UTF8, 0, text, kToTheTerminator, nullptr, 0, nullptr, nullptr);
  if (size <= 0) return {};
  std::string result(static_cast<std::size_t>(size), '\0');
  WideCharToMultiByte(CP_UTF8, 0, text, kToTheTerminator, result.data(), size, nullptr, nullptr);
  result.pop_back();
  return result;
}

HANDLE handle_of(std::FILE* stream) {
  const int file = _fileno(stream);
  return file < 0 ? INVALID_HANDLE_VALUE : reinterpret_cast<HANDLE>(_get_osfhandle(file));
}

// A handle that says what file a name means. Null: it cannot be opened.
Handle open_to_look(const fs::path& name) {
  const HANDLE file = CreateFileW(name.c_str(), 0, kShareAll, nullptr, OPEN_EXISTING,
                                  FILE_ATTRIBUTE_NORMAL, nullptr);
  return Handle(file == INVALID_HANDLE_VALUE ? nullptr : file);
}

// ---- Interrupts ----

constexpr int kInterrupts[] = {SIGINT, SIGBREAK, SIGTERM};

// The system handles an interrupt in a thread of its own, which this lets wait. It may be entered again.
class Gate {
 public:
  Gate() { InitializeCriticalSection(&section_); }
  ~Gate() = delete;  // an interrupt may come at any time
  Gate(const Gate&) = delete;
  Gate& operator=(const Gate&) = delete;
  void enter() { EnterCriticalSection(&section_); }
  void leave() { LeaveCriticalSection(&section_); }

 private:
  CRITICAL_SECTION section_;
};

Gate& gate() {
  static Gate& only = *new Gate;
  return only;
}

std::array<wchar_t, 4096> interrupted_file;  // empty when there is nothing to remove

UINT code_page_before = 0;

void restore_terminal() {
  if (code_page_before != 0) SetConsoleOutputCP(code_page_before);
}

extern "C" void on_interrupt(int) {
  constexpr UINT kInterrupted = 0xC000013A;  // as programs end that handle no interrupt
  gate().enter();
  if (interrupted_file[0] != L'\0') DeleteFileW(interrupted_file.data());
  restore_terminal();
  TerminateProcess(GetCurrentProcess(), kInterrupted);
}

void catch_interrupts() {
  (void)gate();
  for (const int signal : kInterrupts) {
    const bool was_ignored = std::signal(signal, SIG_IGN) == SIG_IGN;
    if (!was_ignored) std::signal(signal, on_interrupt);
  }
}

// ---- The terminal ----

// Until the program ends, the terminal takes UTF-8, and the escapes of the progress line.
void prepare_terminal() {
  const HANDLE messages = handle_of(stderr);
  DWORD mode = 0;
  if (GetConsoleMode(messages, &mode)) {
    SetConsoleMode(messages, mode | ENABLE_VIRTUAL_TERMINAL_PROCESSING);
  }
  const UINT now = GetConsoleOutputCP();
  if (now == 0 || now == CP_UTF8 || !SetConsoleOutputCP(CP_UTF8)) return;
  code_page_before = now;
  std::atexit(restore_terminal);
}

// ---- Locks ----

// The name of the lock on a file: the same for every name of the file that leads to its one place.
// Empty, with the system's error set: there is no such file.
std::wstring lock_name(const fs::path& path) {
  const Handle file = open_to_look(path);
  std::wstring place(32768, L'\0');
  const DWORD length = file ? GetFinalPathNameByHandleW(file.get(), place.data(),
                                                        static_cast<DWORD>(place.size()), 0)
                            : 0;
  if (length == 0 || length >= place.size()) return {};
  place.resize(length);
  CharUpperBuffW(place.data(), length);
  std::uint64_t hash = 14695981039346656037u;
  for (const wchar_t letter : place) hash = (hash ^ letter) * 1099511628211u;
  return L"Global\\tevpf-" + std::to_wstring(hash);
}

// Everybody who may see the file may lock it.
HANDLE create_mutex(const std::wstring& name) {
  SECURITY_DESCRIPTOR everybody;
  InitializeSecurityDescriptor(&everybody, SECURITY_DESCRIPTOR_REVISION);
  SetSecurityDescriptorDacl(&everybody, TRUE, nullptr, FALSE);
  SECURITY_ATTRIBUTES attributes{sizeof attributes, &everybody, FALSE};
  return CreateMutexW(&attributes, FALSE, name.c_str());
}

// A program that ended without releasing the lock did release it.
bool wait_for(HANDLE mutex, DWORD milliseconds) {
  const DWORD outcome = WaitForSingleObject(mutex, milliseconds);
  return outcome == WAIT_OBJECT_0 || outcome == WAIT_ABANDONED;
}

}  // namespace

// Pipes fail in no other way, but by several errors.
std::error_code write_error(std::FILE* stream) {
  const std::error_code error = last_error();
  const bool is_pipe = GetFileType(handle_of(stream)) == FILE_TYPE_PIPE;
  return is_pipe ? std::make_error_code(std::errc::broken_pipe) : error;
}

// The command line that the C runtime hands to main() is in the system's code page, with its wildcards
// replaced by file names.
std::vector<std::string> command_line(int, const char* const*) {
  int count = 0;
  const std::unique_ptr<LPWSTR, decltype(&LocalFree)> words(
      CommandLineToArgvW(GetCommandLineW(), &count), &LocalFree);
  if (words == nullptr) throw std::system_error(system_error(), "command line");
  std::vector<std::string> result;
  for (int i = 0; i < count; ++i) result.push_back(utf8(words.get()[i]));
  return result;
}

void prepare_process() {
  for (std::FILE* const stream : {stdin, stdout, stderr}) {
    // What is typed ends with Ctrl-Z. To a terminal, text would go through the system's code page.
    const bool is_typed = stream == stdin && is_terminal(stream);
    if (_fileno(stream) >= 0 && !is_typed) _setmode(_fileno(stream), _O_BINARY);
  }
  // A terminal does not put characters together whose bytes come one by one.
  if (is_terminal(stdout)) std::setvbuf(stdout, nullptr, _IOFBF, BUFSIZ);
  prepare_terminal();
  catch_interrupts();
}

bool is_terminal(std::FILE* stream) {
  DWORD mode = 0;
  return GetConsoleMode(handle_of(stream), &mode) != 0;
}

TerminalSize terminal_size() {
  CONSOLE_SCREEN_BUFFER_INFO facts;
  if (!GetConsoleScreenBufferInfo(handle_of(stdout), &facts)) return {};
  const SMALL_RECT& seen = facts.srWindow;
  return {static_cast<std::size_t>(seen.Right - seen.Left + 1),
          static_cast<std::size_t>(seen.Bottom - seen.Top + 1)};
}

std::FILE* open_pager(const std::string&) { return nullptr; }
void close_pager(std::FILE*) {}

std::optional<std::string> environment(const char* name) {
  const wchar_t* const value = _wgetenv(fs::path(name).c_str());
  if (value == nullptr) return std::nullopt;
  return utf8(value);
}

bool stdout_is(const fs::path& path) {
  BY_HANDLE_FILE_INFORMATION out, named;
  const Handle file = open_to_look(path);
  return file && GetFileInformationByHandle(handle_of(stdout), &out) &&
         GetFileInformationByHandle(file.get(), &named) &&
         out.dwVolumeSerialNumber == named.dwVolumeSerialNumber &&
         out.nFileIndexHigh == named.nFileIndexHigh && out.nFileIndexLow == named.nFileIndexLow;
}

void remove_on_interrupt(const fs::path& file) {
  const HoldInterrupts hold;
  const std::wstring& name = file.native();
  interrupted_file[0] = L'\0';
  if (name.size() < interrupted_file.size()) std::wcscpy(interrupted_file.data(), name.c_str());
}

HoldInterrupts::HoldInterrupts() { gate().enter(); }
HoldInterrupts::~HoldInterrupts() { gate().leave(); }

std::FILE* open_file(const fs::path& name, const char* mode) {
  std::FILE* const stream = _wfopen(name.c_str(), fs::path(mode).c_str());
  std::error_code ignored;
  if (stream == nullptr && errno == EACCES && fs::is_directory(name, ignored)) errno = EISDIR;
  return stream;
}

// Where it cannot be found out otherwise: the C runtime moves about in pipes, too.
bool can_seek(std::FILE* stream) { return GetFileType(handle_of(stream)) == FILE_TYPE_DISK; }

// Open as it is, it can be removed by an interrupt.
std::FILE* create_private_file(const fs::path& name) {
  const HANDLE handle = CreateFileW(name.c_str(), GENERIC_READ | GENERIC_WRITE, kShareAll, nullptr,
                                    CREATE_NEW, FILE_ATTRIBUTE_NORMAL, nullptr);
  if (handle == INVALID_HANDLE_VALUE) {
    errno = system_error().default_error_condition().value();
    return nullptr;
  }
  const int file = _open_osfhandle(reinterpret_cast<std::intptr_t>(handle), _O_RDWR | _O_BINARY);
  return _fdopen(file, "w+b");
}

bool copy_rights(std::FILE*, const fs::path&) { return true; }

bool flush_to_disk(std::FILE* stream) {
  return std::fflush(stream) == 0 && _commit(_fileno(stream)) == 0;
}

bool rename_to_new(const fs::path& from, const fs::path& to) {
  return _wrename(from.c_str(), to.c_str()) == 0;
}

// A lock on the place of the file. One on the file itself would need it open, and the system replaces no
// open file.
FileLock::FileLock(const fs::path& path, const std::function<void()>& wait_begins) {
  const std::wstring name = lock_name(path);
  if (name.empty()) {
    error_ = system_error();
    state_ = State::kNoFile;
    return;
  }
  if (const HANDLE mutex = create_mutex(name)) {
    lock_ = reinterpret_cast<std::intptr_t>(mutex);
    if (wait_for(mutex, 0)) return;
    wait_begins();
    if (wait_for(mutex, INFINITE)) return;
  }
  error_ = system_error();
  state_ = State::kRefused;
}

FileLock::~FileLock() {
  if (lock_ == kNone) return;
  const auto mutex = reinterpret_cast<HANDLE>(lock_);
  ReleaseMutex(mutex);
  CloseHandle(mutex);
}

// By way of a file in the user's own folder for temporary files. Lines end there as Windows ends them.
void collect(const std::function<void(const fs::path& path)>& make,
             const std::function<void(std::string_view)>& take) {
  struct Removed {
    fs::path name = unused_path_beside(fs::temp_directory_path() / "dump");
    std::FILE* stream = create_private_file(name);
    ~Removed() {
      if (stream == nullptr) return;
      std::fclose(stream);
      DeleteFileW(name.c_str());
    }
  };
  const Removed file;
  if (file.stream == nullptr) throw std::system_error(last_error(), name_of(file.name));
  make(file.name);
  std::array<char, 65536> block;
  std::string text;
  while (const std::size_t count = std::fread(block.data(), 1, block.size(), file.stream)) {
    text.append(block.data(), count);
    const bool may_go_on = text.back() == '\r';
    if (may_go_on) text.pop_back();
    for (std::size_t at = 0; (at = text.find("\r\n", at)) != text.npos;) text.erase(at, 1);
    take(text);
    text = may_go_on ? "\r" : "";
  }
  take(text);
}

}  // namespace tool
