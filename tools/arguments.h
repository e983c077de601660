// The command line of one command, read by its row in the table of commands.
#pragma once

#include "commands.h"

namespace tool {

// Reads the words that stand behind the command's name. Prints help, or what is wrong, and returns false
// with the exit status when there is nothing to run.
bool read_arguments(const Command& command, std::vector<std::string> words, Arguments& arguments,
                    ExitStatus& status);

}  // namespace tool
