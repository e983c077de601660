// What commands read beside FILE.
#pragma once

#include <string>

namespace tool {

// All of a file, or of standard input ("-"). `advice`: the end of the sentence when it cannot be read.
std::string read_whole(const std::string& path, const std::string& advice);

}  // namespace tool
