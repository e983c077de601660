// tevpf sql where the tool was built without SQLite.
#include "commands.h"

namespace tool {

ExitStatus run_sql(const Arguments&) {
  throw Failure(kRefused, "this tevpf was built without SQLite and knows no SQL");
}

}  // namespace tool
