// The message texts that the library leaves to its callers: one sentence for a status and the two
// texts that came with it.
#pragma once

#include <string>

#include "failure.h"
#include "tevpf.h"

namespace tool {

// Why an operation of the library failed just now, as the second half of a sentence.
std::string reason(TEVPF_STATUS status);

// "FILE: cannot DOING: reason", with the exit status that goes with the status.
Failure library_failure(TEVPF_STATUS status, const std::string& file, const std::string& doing);

// Throws that when the status is a failure.
void require(TEVPF_STATUS status, const std::string& file, const char* doing);

// What is wrong with a file that could not be loaded, and where. The last list and the last table
// that were loaded are the ones in which loading may have stopped.
std::string damage(TEVPF_STATUS status, const std::string& last_list,
                   const std::string& last_table);

}  // namespace tool
