// Opens arbitrary bytes as a parameter file and drives whatever was loaded. Nothing may crash, hang,
// leak or disagree. Input: one byte n, n bytes that choose the changes, then the file.
#include <filesystem>
#include <fstream>
#include <random>

#include "core/base/heap.h"
#include "include/tevpf.h"
#include "support/drive.h"

// Rows may be as wide as a file says; what one default row takes is bounded here.
constexpr std::uint64_t kLargestBlock = 4 << 20;

// In memory where the system has such a place: a fuzzer writes many files.
static std::string scratch_folder() {
  std::error_code none;
  const std::filesystem::path memory = "/dev/shm";
  const auto parent =
      std::filesystem::is_directory(memory, none) ? memory : std::filesystem::temp_directory_path();
  return (parent / ("tevpf_fuzz_" + std::to_string(std::random_device{}()))).string();
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size == 0) return 0;
  static const std::string folder = scratch_folder();
  const std::string path = folder + "/file";
  std::filesystem::create_directory(folder);
  const std::string_view input(reinterpret_cast<const char*>(data), size);
  const std::string_view choices = input.substr(1, data[0]);
  std::ofstream out(path, std::ios::binary);
  require(static_cast<bool>(out << input.substr(1 + choices.size()) << std::flush), "scratch file");
  out.close();

  tevpf::heap_fail_above(kLargestBlock);
  TEV8R1_PF_init();
  const TEVPF_STATUS status = TEV8R1_PF_open(path.c_str());
  require(status != PF_NEWFILE && status != PF_FILEOPEN && status != PF_OPENFAIL, "opening a file");
  char current[TEVPF_FILE_NAME_SIZE];
  if (TEV8R1_PF_inq_current_file(current) == PF_NORMAL) {
    drive_current_file(folder, {choices});
    TEV8R1_PF_close(1);
    require(TEV8R1_PF_inq_current_file(current) == PF_NOFILE, "everything is closed");
  }
  TEV8R1_turn_off_interactive();
  tevpf::heap_fail_above(UINT64_MAX);
  std::filesystem::remove_all(folder);
  return 0;
}
