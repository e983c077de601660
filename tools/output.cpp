#include "output.h"

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
  fs::path result = fs::weakly_canonical(path, error);
  return error ? path : result;
}

}  // namespace

Output::Output(const std::string& name, const fs::path& source) : name_(name) {
  if (name.empty() || name == "-") {
    if (!source.empty() && stdout_is(source)) {
      throw Failure(kRefused, "standard output is " + in_quotes(source.string()) +
                                  " itself; send the output to another file");
    }
    stream_ = stdout;
    to_terminal_ = is_terminal(stdout);
    return;
  }
  std::error_code ignored;
  if (fs::equivalent(name, source, ignored)) {
    throw Failure(kRefused, "-o names " + in_quotes(source.string()) +
                                " itself; the output would destroy it, so choose another file");
  }
  target_ = followed(name);
  if (!fs::exists(target_, ignored) || fs::is_regular_file(target_, ignored)) {
    if (fs::exists(target_, ignored)) {
      std::FILE* writable = std::fopen(name.c_str(), "r+b");
      if (writable == nullptr) fail(last_error());
      std::fclose(writable);
    }
    temp_.emplace(target_);
    stream_ = temp_->stream();
    return;
  }
  stream_ = std::fopen(target_.string().c_str(), "wb");
  if (stream_ == nullptr) fail(last_error());
  to_terminal_ = is_terminal(stream_);
}

Output::~Output() {
  if (stream_ != nullptr && stream_ != stdout && !temp_) std::fclose(stream_);
}

void Output::fail(const std::error_code& error) {
  if (error == std::errc::broken_pipe) throw ClosedPipe{};
  throw Failure(kCannotWrite, (target_.empty() ? "standard output" : in_quotes(name_)) +
                                  " cannot be written: " + error.message() +
                                  "; make room or choose another file");
}

void Output::put(std::string_view text) {
  if (std::fwrite(text.data(), 1, text.size(), stream_) != text.size()) fail(last_error());
}

void Output::write(std::string_view text) {
  if (!to_terminal_) return put(text);
  line_ += text;
  const std::size_t whole_lines = line_.rfind('\n') + 1;
  put(visible_lines(std::string_view(line_).substr(0, whole_lines)));
  line_.erase(0, whole_lines);
}

void Output::finish() {
  put(visible_lines(line_));
  if (std::fflush(stream_) != 0) fail(last_error());
  if (temp_) {
    if (const std::error_code error = temp_->replace_target()) fail(error);
    return;
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
