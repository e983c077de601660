// How commands open FILE and write it to the disk: as it was or whole, never created by reading.
#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <system_error>

#include "failure.h"
#include "platform.h"
#include "temp_file.h"
#include "tevpf.hpp"

namespace tool {

// To look at. A damaged file is opened as far as it can be read.
tevpf::File open_to_read(const std::string& path);

// To copy from. A damaged file is refused, because the copy would lack what could not be read.
tevpf::File open_undamaged(const std::string& path);

// Refuses to read and change one file at once.
void refuse_same_file(const std::string& read, const std::string& changed);

// How reading commands end: of a damaged file, this says that only a part was shown.
ExitStatus finish_reading(const tevpf::File& file);

// To change. A damaged file is refused, because saving it would drop what could not be read.
tevpf::File open_to_change(const std::string& path);

// Writes it as the library does, interrupts waiting meanwhile.
void save(tevpf::File& file);

// FILE of a command that changes it. Locked: no other program that locks it, too, changes it from
// the moment it is read until it is saved.
struct Target {
  std::string path;
  bool is_locked = true;
};

// Waits for the lock of a file and holds it as long as `lock` lives.
void take_lock(const std::string& path, std::optional<FileLock>& lock);

enum class Missing { kRefused, kMade };

// Opens the file, changes and saves it. `change` is called again, on a fresh copy of the file, when
// another program has made a missing file meanwhile. True: the file was made.
bool change_file(const Target& target, Missing missing,
                 const std::function<void(tevpf::File& file)>& change);

// Says on standard output what was done. Where that fails, the message says that FILE is changed.
void report(const Target& target, const std::string& done);

bool exists(const std::string& path);  // a link that leads nowhere does, too

// A file that appears under its name only when it is saved. An existing one is refused.
class NewFile {
 public:
  static NewFile create(const std::string& path);

  tevpf::File& file() { return file_; }
  // And closes it. An error: the name is taken meanwhile, nothing is left of the file.
  std::error_code save();

 private:
  NewFile(const std::string& path, tevpf::File file);

  std::string path_;
  TempName temp_;  // removed when the file has been closed
  tevpf::File file_;
};

// What is wrong with a damaged file, and where; the file is "it".
std::string damage_of(const tevpf::File& file);

std::uintmax_t size_on_disk(const tevpf::File& file);

}  // namespace tool
