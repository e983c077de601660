// Runs the benchmarks.
#include <benchmark/benchmark.h>
#include <sys/mman.h>

#include <cstddef>
#include <cstring>

namespace {

// The host of a virtual machine finds memory for it at the first touch, which can take milliseconds
// for 2 MB: that would be part of whatever comes first. Once touched and given back, the system
// hands the same pages out again.
void touch_memory() {
  constexpr std::size_t kBytes = std::size_t{2} << 30;
  void* const block =
      mmap(nullptr, kBytes, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0);
  if (block == MAP_FAILED) return;
  madvise(block, kBytes, MADV_HUGEPAGE);
  std::memset(block, 1, kBytes);
  munmap(block, kBytes);
}

}  // namespace

int main(int argc, char** argv) {
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  touch_memory();
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  return 0;
}
