// How a command ends: exit statuses, and the exception that carries one clear sentence to main.
#pragma once

#include <stdexcept>
#include <string>

namespace tool {

enum ExitStatus {
  kDone = 0,
  kRefused = 1,      // not found, or the request breaks a rule; nothing was changed
  kUsage = 2,        // the command line itself is wrong
  kUnreadable = 3,   // a file is missing, damaged or may not be read
  kCannotWrite = 4,  // a file, or standard output, could not be written
};

class Failure : public std::runtime_error {
 public:
  Failure(ExitStatus status, const std::string& sentence)
      : std::runtime_error(sentence), status_(status) {}
  ExitStatus status() const { return status_; }

 private:
  ExitStatus status_;
};

// The reader of standard output has gone: the program ends quietly.
struct ClosedPipe {};

}  // namespace tool
