// Where the files that SQL names come from.
#pragma once

#include <functional>
#include <memory>
#include <string>

#include "shared_file.h"

namespace sql {

struct Files {
  // Called with the library locked; throws Refusal.
  std::function<std::shared_ptr<SharedFile>(const std::string& name)> find;
  // What tevpf_elements and tevpf_columns list when no file is named; empty: one must be named.
  std::string usual;
};

}  // namespace sql
