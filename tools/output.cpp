#include "output.h"

#include <algorithm>
#include <cerrno>
#include <system_error>
#include <utility>

#include "failure.h"
#include "platform.h"
#include "text.h"

namespace fs = std::filesystem;

namespace tool {
namespace {

// The file that a path names in the end: an existing link stays a link.
fs::path followed(const fs::path& path) {
  std::error_code error;
  if (!fs::exists(path, error)) return path;  // as it was given, for messages
  fs::path result = fs::weakly_canonical(path, error);
  return error ? path : result;
}

}  // namespace

Output::Output(const std::string& name, const fs::path& source) : name_(name) {
  if (name.empty() || name == "-") {
    if (!source.empty() && stdout_is(source)) {
      throw Failure(kRefused, "standard output is " + in_quotes(name_of(source)) +
                                  " itself; send the output to another file");
    }
    stream_ = stdout;
    to_terminal_ = is_terminal(stdout);
    if (to_terminal_) screen_ = terminal_size();
    return;
  }
  std::error_code ignored;
  if (fs::equivalent(path_of(name), source, ignored)) {
    throw Failure(kRefused, "-o names " + in_quotes(name_of(source)) +
                                " itself; the output would destroy it, so choose another file");
  }
  target_ = followed(path_of(name));
  if (!fs::exists(target_, ignored) || fs::is_regular_file(target_, ignored)) {
    if (fs::exists(target_, ignored)) {
      std::FILE* writable = open_file(path_of(name), "r+b");
      if (writable == nullptr) fail(last_error());
      std::fclose(writable);
    }
    temp_.emplace(target_);
    stream_ = temp_->stream();
    return;
  }
  stream_ = open_file(target_, "wb");
  if (stream_ == nullptr) fail(last_error());
  to_terminal_ = is_terminal(stream_);
}

Output::~Output() {
  if (pager_ != nullptr) {
    close_pager(pager_);
  } else if (stream_ != nullptr && stream_ != stdout && !temp_) {
    std::fclose(stream_);
  }
}

void Output::fail(const std::error_code& error) {
  if (error == std::errc::broken_pipe) throw ClosedPipe{};
  throw Failure(kCannotWrite, (target_.empty() ? "standard output" : in_quotes(name_)) +
                                  " cannot be written: " + error.message() +
                                  "; make room or choose another file");
}

void Output::put(std::string_view text) {
  if (std::fwrite(text.data(), 1, text.size(), stream_) != text.size()) fail(write_error(stream_));
}

// The user's pager, where one is wanted.
void Output::start_pager() {
  static constexpr const char* kLess =
      "if command -v less >/dev/null; then exec less; else exec cat; fi";
  const std::string command = environment("PAGER").value_or(kLess);
  if (!command.empty() && command != "cat") pager_ = open_pager(command);
  if (pager_ != nullptr) stream_ = pager_;
  screen_.rows = 0;  // from now on, nothing is held
  put(std::exchange(held_, {}));
}

// Keeps what one screen holds, until it is known that there is more.
void Output::hold(std::string_view text) {
  held_ += text;
  const auto lines = static_cast<std::size_t>(std::count(held_.begin(), held_.end(), '\n'));
  if (lines >= screen_.rows) start_pager();
}

void Output::write(std::string_view text) {
  if (!to_terminal_) return put(text);
  line_ += text;
  const std::size_t whole_lines = line_.rfind('\n') + 1;
  const std::string shown = visible_lines(std::string_view(line_).substr(0, whole_lines));
  screen_.rows > 0 ? hold(shown) : put(shown);
  line_.erase(0, whole_lines);
}

void Output::finish() {
  put(std::exchange(held_, {}));
  put(visible_lines(line_));
  if (std::fflush(stream_) != 0) fail(write_error(stream_));
  if (temp_) {
    if (const std::error_code error = temp_->replace_target()) fail(error);
    return;
  }
  if (pager_ != nullptr) {
    stream_ = nullptr;
    return close_pager(std::exchange(pager_, nullptr));
  }
  if (stream_ != stdout && std::fclose(std::exchange(stream_, nullptr)) != 0) fail(last_error());
}

void print(const std::string& text) {
  Output output({}, {});
  output.write(text);
  output.finish();
}

void note(const std::string& sentence) { std::fprintf(stderr, "tevpf: %s\n", sentence.c_str()); }

}  // namespace tool
