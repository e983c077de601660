// The five default definitions of a list, as a block that the list owns.
#pragma once

#include "lists/list.h"

namespace tevpf {

// Releases the block with its texts; null is fine.
void release_defaults(TEVPF_PARAM_DEF* table) noexcept;

// A copy of the block with texts of its own, null for null; false when memory runs out.
[[nodiscard]] bool copy_defaults(const TEVPF_PARAM_DEF* source, TEVPF_PARAM_DEF*& copy) noexcept;

}  // namespace tevpf
