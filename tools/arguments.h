// The command line of one command, read by its row in the table of commands.
#pragma once

#include "commands.h"

namespace tool {

// Reads what stands behind the command's name. Prints help, or what is wrong, and returns false
// with the exit status when there is nothing to run.
bool read_arguments(const Command& command, int argc, const char* const* argv, Arguments& arguments,
                    ExitStatus& status);

}  // namespace tool
