// Opens, creates and removes files on disk: regular files only. A file that somebody else has just
// put in place is neither emptied nor removed. Names are UTF-8 on Windows, and bytes elsewhere.
#pragma once

#include <cstdio>

namespace tevpf {

enum class Access { kRead, kUpdate, kWrite };

// Opens an existing regular file; its content is kept. Null with errno set on failure; EINVAL if it
// is not a regular file (a pipe, a device, a directory), and then the call does not block.
[[nodiscard]] std::FILE* open_regular(const char* name, Access access) noexcept;

// Creates an empty file for writing. Null with errno set on failure; EEXIST if the file already
// exists.
[[nodiscard]] std::FILE* create_file(const char* name) noexcept;

// What std::fopen does.
[[nodiscard]] std::FILE* open_stream(const char* name, const char* mode) noexcept;

void remove_file(const char* name) noexcept;

// Empties a file that is open for writing; false with errno set on failure.
[[nodiscard]] bool empty_file(std::FILE* stream) noexcept;

// Closes the stream of a file that this process created and removes the file, provided that the
// name still refers to it.
void remove_own_file(const char* name, std::FILE* stream) noexcept;

}  // namespace tevpf
