#include "core/io/wide_name.h"

#include <windows.h>

#include <cerrno>

namespace tevpf {

// cppcheck-suppress uninitMemberVar; a buffer
WideName::WideName(const char* name) noexcept {
  constexpr int kToTheTerminator = -1;
  is_valid_ =
      MultiByteToWideChar(CP_UTF8, MB_ERR_INVALID_CHARS, name, kToTheTerminator, text_, kSize) > 0;
  if (!is_valid_) errno = EINVAL;
}

}  // namespace tevpf
