// Files on the disk as the library opens, makes and removes them: regular files only, and none that
// somebody else has just put there is emptied or removed.
#pragma once

#include <cstdio>

namespace tevpf {

enum class Access { kRead, kUpdate, kWrite };

// Opens an existing regular file; its content stays. Null with errno set on failure; EINVAL for what is
// no regular file (a pipe, a device, a folder), which is not waited for.
[[nodiscard]] std::FILE* open_regular(const char* name, Access access) noexcept;

// Makes an empty file for writing. Null with errno set on failure, EEXIST where there is a file already.
[[nodiscard]] std::FILE* create_file(const char* name) noexcept;

// Empties a file that is open for writing; false with errno set on failure.
[[nodiscard]] bool empty_file(std::FILE* stream) noexcept;

// Removes a file that this process made: the name must still stand for the file behind the stream, which
// is closed.
void remove_own_file(const char* name, std::FILE* stream) noexcept;

}  // namespace tevpf
