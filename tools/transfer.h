// Elements from one file into another.
#pragma once

#include <string>

#include "tevpf.hpp"

namespace tool {

// Adds a copy of the element, which is stored in the same bytes but for its name.
void transfer(const tevpf::File& from, const tevpf::Element& element, tevpf::File& to,
              const std::string& name);

}  // namespace tool
