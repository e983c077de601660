// tevpf new: makes an empty parameter file.
#include "commands.h"
#include "files.h"
#include "text.h"

namespace tool {

ExitStatus run_new(const Arguments& arguments) {
  if (const std::error_code error = NewFile::create(arguments.file).save()) {
    throw Failure(kCannotWrite, visible(arguments.file) + ": it cannot be saved: " +
                                    error.message() + "; it is as it was before");
  }
  return kDone;
}

}  // namespace tool
