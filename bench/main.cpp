// Runs the benchmarks; or, when it is told a measurement and a size, that one alone.
#include <unistd.h>

#include <cstring>
#include <fstream>

#include "fresh_process.h"

namespace bench {

namespace {

constexpr char kFresh[] = "--fresh";

struct Measurement {
  std::string name;
  Measured (*measure)(std::int64_t n);
};

std::vector<Measurement>& measurements() {
  static std::vector<Measurement> all;
  return all;
}

Measured run_fresh(const std::string& name, std::int64_t n) {
  const std::string program = std::filesystem::read_symlink("/proc/self/exe").string();
  const std::string command =
      "'" + program + "' " + kFresh + " '" + name + "' " + std::to_string(n);
  std::FILE* const output = popen(command.c_str(), "r");
  if (output == nullptr) give_up("popen", 0);
  Measured result{};
  const int read =
      std::fscanf(output, "%lf %lf %lf", &result.seconds, &result.operations, &result.bytes);
  if (pclose(output) != 0 || read != 3) give_up(command.c_str(), read);
  return result;
}

int measure_here(const char* name, std::int64_t n) {
  for (const Measurement& measurement : measurements()) {
    if (measurement.name != name) continue;
    const Measured result = measurement.measure(n);
    std::printf("%.9g %.0f %.0f\n", result.seconds, result.operations, result.bytes);
    return 0;
  }
  return 1;
}

}  // namespace

void add_fresh(const char* workload, const char* contestant, Measured (*measure)(std::int64_t n),
               const std::vector<std::int64_t>& sizes) {
  const std::string name = std::string(workload) + "/" + contestant;
  measurements().push_back({name, measure});
  const auto body = [name](benchmark::State& state) {
    for (auto _ : state) {
      const Measured result = run_fresh(name, state.range(0));
      state.SetIterationTime(result.seconds);
      state.counters["operations"] = result.operations;
      if (result.bytes > 0) state.counters["bytes"] = result.bytes;
    }
  };
  for (const std::int64_t n : sizes)
    benchmark::RegisterBenchmark(name.c_str(), body)->Arg(n)->UseManualTime()->Iterations(1);
}

double resident_bytes() {
  std::ifstream statm("/proc/self/statm");
  double whole = 0, resident = 0;
  statm >> whole >> resident;
  return resident * static_cast<double>(sysconf(_SC_PAGESIZE));
}

}  // namespace bench

int main(int argc, char** argv) {
  if (argc == 4 && std::strcmp(argv[1], bench::kFresh) == 0)
    return bench::measure_here(argv[2], std::atoll(argv[3]));
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  return 0;
}
