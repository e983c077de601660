// The current file as a handle.
#include "core/library.h"
#include "include/tevpf_access.h"

const void* tevpf_current_file() noexcept { return tevpf::library.current_file; }
