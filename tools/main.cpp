// tevpf: looks at parameter files, checks and changes them.
#include <algorithm>
#include <cstdio>
#include <exception>
#include <new>
#include <span>
#include <string>
#include <vector>

#include "arguments.h"
#include "commands.h"
#include "failure.h"
#include "output.h"
#include "platform.h"
#include "tevpf.hpp"
#include "text.h"

namespace {

using tool::Command;

std::string version() {
  return "tevpf " + std::to_string(TEVPF_VERSION_MAJOR) + "." +
         std::to_string(TEVPF_VERSION_MINOR) + "." + std::to_string(TEVPF_VERSION_PATCH) + "\n";
}

std::string overview() {
  std::string text =
      "Make parameter files, look at them, check and change them.\n"
      "Usage: tevpf COMMAND FILE ...\n\nCommands:\n";
  for (const Command& command : tool::commands()) {
    std::string line = "  " + std::string(command.name);
    line.resize(10, ' ');
    text += line + command.help + "\n";
  }
  return text +
         "\n'tevpf COMMAND --help' describes a command, 'tevpf --version' prints the version.\n"
         "Exit status: 0 done, 1 refused or not found (diff: different), 2 wrong command line,\n"
         "3 a file is missing, damaged or unreadable, 4 a file cannot be written.\n";
}

// What the library refused, and what helps.
tool::Failure refusal(const std::string& file, const tevpf::Error& error) {
  const bool cannot_write = error.status() == PF_OPENFAIL;
  const char* const advice = cannot_write                     ? "; check its folder and free space"
                             : error.status() == PF_DUPLICATE ? "; choose another one"
                                                              : "";
  return {cannot_write ? tool::kCannotWrite : tool::kRefused,
          tool::visible(file) + ": " + tool::visible(error.what()) + advice};
}

std::vector<std::string> names_of(std::span<const Command> commands) {
  std::vector<std::string> names;
  for (const Command& command : commands) names.emplace_back(command.name);
  return names;
}

int run(const std::vector<std::string>& words) {
  const std::string name = words.size() > 1 ? words[1] : "";
  if (name == "--help" || name == "-h" || name == "help") {
    tool::print(overview());
    return tool::kDone;
  }
  if (name == "--version") {
    tool::print(version());
    return tool::kDone;
  }
  const auto all = tool::commands();
  const auto command =
      std::find_if(all.begin(), all.end(), [&](const Command& c) { return name == c.name; });
  if (command == all.end()) {
    std::fprintf(stderr, "tevpf: %s; 'tevpf --help' lists the commands\n",
                 name.empty() ? "no command is given"
                              : ("there is no command " + tool::in_quotes(name) +
                                 tool::did_you_mean(name, names_of(all)))
                                    .c_str());
    return tool::kUsage;
  }
  tool::Arguments arguments;
  auto status = tool::kDone;
  if (!tool::read_arguments(*command, {words.begin() + 2, words.end()}, arguments, status))
    return status;
  try {
    return command->run(arguments);
  } catch (const tevpf::Error& error) {
    throw refusal(arguments.file, error);
  }
}

}  // namespace

int main(int argc, char** argv) {
  try {
    tool::prepare_process();
    return run(tool::command_line(argc, argv));
  } catch (const tool::ClosedPipe&) {
    return tool::kDone;
  } catch (const tool::Failure& failure) {
    std::fprintf(stderr, "tevpf: %s\n", failure.what());
    return failure.status();
  } catch (const std::bad_alloc&) {
    std::fprintf(stderr, "tevpf: memory ran out; nothing was changed\n");
  } catch (const std::exception& error) {
    std::fprintf(stderr, "tevpf: %s\n", error.what());
  }
  return tool::kRefused;
}
