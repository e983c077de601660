// What the standard library does not say about terminals, pipes, signals and files. What differs between
// Windows and other systems stands in platform_windows.cpp and platform_posix.cpp alone.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <system_error>
#include <vector>

namespace tool {

// A name as it is given, in UTF-8 on Windows and in bytes elsewhere, as a path and back. A narrow text
// handed to a path directly would be in the system's code page.
std::filesystem::path path_of(const std::string& name);
std::string name_of(const std::filesystem::path& path);

// What errno says.
std::error_code last_error();

// Why writing to a stream failed. Of some systems, errno does not tell that a pipe's reader has gone.
std::error_code write_error(std::FILE* stream);

// The words of the command line in UTF-8, the program's name in front. `count` and `given` are what
// main() was given.
std::vector<std::string> command_line(int count, const char* const* given);

// To be called first. The standard streams carry bytes unchanged; a closed pipe and a size limit are
// errors of writing, not signals; an interrupt removes the file that remove_on_interrupt names,
// unless interrupts were ignored when the program started.
void prepare_process();

bool is_terminal(std::FILE* stream);

struct TerminalSize {
  std::size_t columns = 0, rows = 0;  // 0: not known
};
TerminalSize terminal_size();  // of the terminal behind standard output

// Starts a command of the shell that shows on the terminal what is written to the stream. From then on
// interrupts are the command's to handle. Null when it cannot be started.
std::FILE* open_pager(const std::string& command);

// Waits until the user has seen enough.
void close_pager(std::FILE* pager);

// The value of a variable of the environment, none when it is not set.
std::optional<std::string> environment(const char* name);

// Standard output is redirected to this very file.
bool stdout_is(const std::filesystem::path& file);

// The file is removed when the user interrupts the program; an empty path forgets it again.
void remove_on_interrupt(const std::filesystem::path& file);

// Interrupts wait while such an object lives.
class HoldInterrupts {
 public:
  HoldInterrupts();
  ~HoldInterrupts();
  HoldInterrupts(const HoldInterrupts&) = delete;
  HoldInterrupts& operator=(const HoldInterrupts&) = delete;
};

// A path for a temporary file in the folder of `target`: random, so that it is free in practice.
std::filesystem::path unused_path_beside(const std::filesystem::path& target);

// What std::fopen does.
std::FILE* open_file(const std::filesystem::path& name, const char* mode);

// The stream can be read a second time from its beginning.
bool can_seek(std::FILE* stream);

// Creates a file that was not there, readable by this user alone, and opens it for reading and
// writing. Null: errno says why.
std::FILE* create_private_file(const std::filesystem::path& name);

// Gives an open file the owner and the mode of the file `like`, as far as this user may, or the
// mode of a new file when there is none.
bool copy_rights(std::FILE* stream, const std::filesystem::path& like);

// Everything written to the stream is on the disk. False when it could not be brought there.
bool flush_to_disk(std::FILE* stream);

// Renames a file to a name that must be free. False: errno says why.
bool rename_to_new(const std::filesystem::path& from, const std::filesystem::path& to);

// A lock on a file, which one program at a time holds. The system releases it when the process ends.
// Only programs that ask for it notice it. It stays valid when the file is replaced by renaming
// another one over it: whoever waited for the old file then asks for the new one.
class FileLock {
 public:
  enum class State { kHeld, kNoFile, kRefused };

  // Waits until it is free; `wait_begins` is called when that is not at once.
  FileLock(const std::filesystem::path& path, const std::function<void()>& wait_begins);
  ~FileLock();
  FileLock(const FileLock&) = delete;
  FileLock& operator=(const FileLock&) = delete;

  State state() const { return state_; }
  const std::error_code& error() const { return error_; }  // why it is not held

 private:
  static constexpr std::intptr_t kNone = -1;
  std::intptr_t lock_ = kNone;  // what the system calls it
  State state_ = State::kHeld;
  std::error_code error_;
};

// Calls `make` with a path to write to, and `take` with all that is written there, as it comes.
void collect(const std::function<void(const std::filesystem::path& path)>& make,
             const std::function<void(std::string_view)>& take);

}  // namespace tool
