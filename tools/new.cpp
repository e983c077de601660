// tevpf new: makes an empty parameter file.
#include "commands.h"

namespace tool {

ExitStatus run_new(const Arguments& arguments) {
  PfFile::create(arguments.file).save();
  return kDone;
}

}  // namespace tool
