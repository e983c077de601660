// How commands open FILE and write it to the disk: as it was or whole, never created by reading.
#pragma once

#include <cstdint>
#include <string>

#include "failure.h"
#include "temp_file.h"
#include "tevpf.hpp"

namespace tool {

// To look at. A damaged file is opened as far as it can be read.
tevpf::File open_to_read(const std::string& path);

// How reading commands end: of a damaged file, this says that only a part was shown.
ExitStatus finish_reading(const tevpf::File& file);

// To change. A damaged file is refused, because saving it would drop what could not be read.
tevpf::File open_to_change(const std::string& path);

// Writes it as the library does, interrupts waiting meanwhile.
void save(tevpf::File& file);

// A file that appears under its name only when it is saved. An existing one is refused.
class NewFile {
 public:
  static NewFile create(const std::string& path);

  tevpf::File& file() { return file_; }
  void save();  // and closes it

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
