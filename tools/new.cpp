// tevpf new: makes an empty parameter file.
#include "commands.h"
#include "files.h"

namespace tool {

ExitStatus run_new(const Arguments& arguments) {
  NewFile::create(arguments.file).save();
  return kDone;
}

}  // namespace tool
