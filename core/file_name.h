// Translates the file names that callers pass into names that the system knows.
#pragma once

#include "include/tevpf.h"

namespace tevpf {

struct FileName {
  char text[TEVPF_FILE_NAME_SIZE];
};

// Translates a name: a leading "$NAME", up to the first "/", is replaced by the value of the
// environment variable of that name; the "$" is part of the variable's name.
//   PF_OPENFAIL  undefined variable; texts: the name as given, the second one stays
//   PF_OPENFAIL  too long; texts: the translated name
[[nodiscard]] TEVPF_STATUS translate_file_name(const char* name, FileName& out) noexcept;

}  // namespace tevpf
