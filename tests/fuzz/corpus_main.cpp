// Runs a fuzz target as an ordinary test: over the files of a corpus folder, and over each of them with
// every byte changed or every four bytes overwritten in one of several ways; with a step of n, at every
// n-th place.
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <string>
#include <vector>

#include "support/read_file.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

namespace {

void run(const std::string& input) {
  const std::vector<std::uint8_t> exact(input.begin(), input.end());  // no terminator behind it
  const std::uint8_t nothing = 0;  // an empty input has an address too, as under the fuzzer
  LLVMFuzzerTestOneInput(exact.empty() ? &nothing : exact.data(), exact.size());
}

std::string damaged(std::string input, std::size_t place, std::size_t way) {
  constexpr std::uint8_t kFlips[] = {0x01, 0x80, 0xff};
  constexpr std::int32_t kWords[] = {-1, 0, 1, INT32_MAX, INT32_MIN};
  if (way >= std::size(kFlips) && place + 4 <= input.size()) {
    std::memcpy(&input[place], &kWords[way - std::size(kFlips)], 4);
  } else {
    input[place] = static_cast<char>(input[place] ^ kFlips[way % std::size(kFlips)]);
  }
  return input;
}

}  // namespace

int main(int argc, char** argv) {
  const std::size_t step = argc > 2 ? std::strtoul(argv[2], nullptr, 10) : 1;
  std::size_t inputs = 0;
  for (const auto& entry : std::filesystem::directory_iterator(argc > 1 ? argv[1] : ".")) {
    const std::string bytes = read_file(entry.path().string());
    std::printf("%s\n", entry.path().string().c_str());
    std::fflush(stdout);
    run(bytes);
    for (std::size_t i = inputs % step; i < bytes.size(); i += step) {
      run(damaged(bytes, i, (i / step + inputs) % 8));
    }
    ++inputs;
  }
  return inputs > 0 ? 0 : 1;
}
