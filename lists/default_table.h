// The five default definitions of a list, in one block that the list owns.
#pragma once

#include "lists/list.h"

namespace tevpf {

// Releases the block and its texts; null is allowed.
void release_defaults(TEVPF_PARAM_DEF* table) noexcept;

// Copies the block and its texts; a null source leaves `copy` unchanged. False when out of memory.
[[nodiscard]] bool copy_defaults(const TEVPF_PARAM_DEF* source, TEVPF_PARAM_DEF*& copy) noexcept;

}  // namespace tevpf
