// What the standard library does not say about terminals, pipes and files. The only file with a
// branch for Windows.
#pragma once

#include <filesystem>

namespace tool {

// Standard output carries bytes unchanged, and a closed pipe is an error of writing, not a signal.
void prepare_standard_output();

bool stdout_is_terminal();

// Standard output is redirected to this very file.
bool stdout_is(const std::filesystem::path& file);

// Creates an empty file that was not there, whatever stands in the way; private: for its owner
// alone.
bool create_exclusively(const std::filesystem::path& file, bool is_private);

// What was written to the file is on the disk. False when it could not be brought there.
bool flush_to_disk(const std::filesystem::path& file);

// Gives `to` the owner and group of `from`, as far as this user may.
void copy_owner(const std::filesystem::path& from, const std::filesystem::path& to);

// The file is removed when the user interrupts the program; an empty path forgets it again.
void remove_on_interrupt(const std::filesystem::path& file);

}  // namespace tool
