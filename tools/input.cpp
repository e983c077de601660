#include "input.h"

#include <array>
#include <cstdio>
#include <memory>

#include "failure.h"
#include "platform.h"
#include "text.h"

namespace tool {
namespace {

struct CloseFile {
  void operator()(std::FILE* stream) const {
    if (stream != stdin) std::fclose(stream);
  }
};

}  // namespace

std::string read_whole(const std::string& path, const std::string& advice) {
  const std::unique_ptr<std::FILE, CloseFile> stream{path == "-" ? stdin
                                                                 : open_file(path_of(path), "rb")};
  std::string text;
  std::array<char, 65536> block;
  while (stream) {
    const std::size_t count = std::fread(block.data(), 1, block.size(), stream.get());
    if (std::ferror(stream.get()) != 0) break;
    text.append(block.data(), count);
    if (count < block.size()) return text;
  }
  throw Failure(kUnreadable,
                visible(path) + ": it cannot be read: " + last_error().message() + "; " + advice);
}

}  // namespace tool
