// Conditions where SQLite is not built in: there are none.
#include "condition.h"
#include "failure.h"

namespace tool {
namespace {

[[noreturn]] void refuse_expressions() {
  throw Failure(kRefused,
                "this program was built without SQLite, so it knows no expressions; choose rows by "
                "--from and --to");
}

}  // namespace

std::vector<std::size_t> rows_where(tevpf::File&, const tevpf::Element&, const std::string&) {
  refuse_expressions();
}

void update_rows(tevpf::File&, const tevpf::Element&, const std::vector<std::size_t>&,
                 const std::string&) {
  refuse_expressions();
}

}  // namespace tool
