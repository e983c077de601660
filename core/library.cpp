// Process-wide state: initialisation and settings.
#include "core/library.h"

#include <cstdlib>

namespace tevpf {

Library library = {
    .num_files = 0,
    .first_file = nullptr,
    .last_file = nullptr,
    .current_file = nullptr,
    .interactive = 0,
    .debug_value = nullptr,
    .alloc_initial = kDefaultInitial,
    .alloc_increment = kDefaultIncrement,
    .init_done = 0,
    .dup_row = 0,
};

namespace {

// Applies a setting; 0 stands for the default. False if the value is negative, and then nothing
// changes.
bool take_setting(std::int32_t& setting, std::int32_t value, std::int32_t standard) noexcept {
  if (value < 0) return false;
  setting = value == 0 ? standard : value;
  return true;
}

}  // namespace

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_PF_init() noexcept {
  library.debug_value = std::getenv("TEV8R1_debug");
  if (library.init_done != 0) return PF_INITDONE;
  library.num_files = 0;
  library.first_file = nullptr;
  library.last_file = nullptr;
  library.current_file = nullptr;
  library.init_done = 1;
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_set_memory_allocation(std::int32_t initial,
                                             std::int32_t increment) noexcept {
  const bool initial_taken = take_setting(library.alloc_initial, initial, kDefaultInitial);
  const bool increment_taken = take_setting(library.alloc_increment, increment, kDefaultIncrement);
  return initial_taken && increment_taken ? PF_NORMAL : PF_BADARG;
}
