// What becomes of an element that comes into a file where its name is taken.
#pragma once

#include <optional>
#include <string>

#include "tevpf.hpp"

namespace tool {

enum class Conflict { kRefuse, kRename, kReplace, kSkip };

Conflict conflict_named(const std::string& word);  // a Failure: there is none of that name

// The name that the element gets, none when it is left out. What it replaces is removed here.
std::optional<std::string> name_in(tevpf::File& file, tevpf::Kind kind, const std::string& name,
                                   Conflict conflict);

}  // namespace tool
