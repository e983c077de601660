// Where a command's result goes: standard output, or the file that -o names, which appears only
// when everything has been written.
#pragma once

#include <cstdio>
#include <filesystem>
#include <functional>
#include <optional>
#include <string>
#include <string_view>

#include "temp_file.h"

namespace tool {

class Output {
 public:
  // `name`: the path after -o; empty or "-" for standard output. `source`: FILE, which must not be
  // written over.
  Output(const std::string& name, const std::filesystem::path& source);
  Output(const Output&) = delete;
  Output& operator=(const Output&) = delete;
  ~Output();

  void write(std::string_view text);

  // Has `make` write a file by its path and takes over what it wrote, instead of any write().
  // `make` cannot notice a full disk; this does.
  void write_file(const std::function<void(const std::string& path)>& make);

  // Everything is written: the file gets its name. Without it nothing appears.
  void finish();

 private:
  [[noreturn]] void fail(int error);
  void open_stream();
  void copy_from(const std::filesystem::path& file);

  std::string name_;              // as it was given, for messages
  std::filesystem::path target_;  // links followed; empty: standard output
  std::optional<TempFile> temp_;  // none for standard output and for devices
  std::FILE* stream_ = nullptr;
};

// A command's short answer on standard output.
void print(const std::string& text);

}  // namespace tool
