// Where a command's result goes: standard output, or the file that -o names, which appears only
// when everything has been written.
#pragma once

#include <cstdio>
#include <filesystem>
#include <optional>
#include <string>
#include <string_view>
#include <system_error>

#include "platform.h"
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

  // A terminal gets control characters as escapes, everything else the very bytes.
  void write(std::string_view text);

  // Characters of a terminal's line; 0: not a terminal, or not known.
  std::size_t line_width() const { return screen_.columns; }

  // Everything is written: the file gets its name. Without it nothing appears.
  void finish();

 private:
  [[noreturn]] void fail(const std::error_code& error);
  void put(std::string_view text);
  void hold(std::string_view text);
  void start_pager();

  std::string name_;              // as it was given, for messages
  std::filesystem::path target_;  // links followed; empty: standard output
  std::optional<TempFile> temp_;  // none for standard output and for devices
  std::FILE* stream_ = nullptr;
  bool to_terminal_ = false;
  TerminalSize screen_;         // of the terminal that standard output is
  std::string held_;            // what fits the screen as yet
  std::FILE* pager_ = nullptr;  // what does not, goes there
  std::string line_;            // that a terminal does not show yet, because it goes on
};

// A command's short answer on standard output.
void print(const std::string& text);

// Something to know beside it, on standard error: "tevpf: " and the sentence.
void note(const std::string& sentence);

}  // namespace tool
