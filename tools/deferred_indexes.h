// The indexes of a table taken away while many rows are added, and then built at once.
#pragma once

#include <vector>

#include "tevpf.hpp"

namespace tool {

class DeferredIndexes {
 public:
  explicit DeferredIndexes(tevpf::Table table);

  bool has_any() const { return !columns_.empty(); }

  void take_away();

  // Builds them all. False when the library refuses one, as it does when a unique column holds a value
  // twice: the table must not be used then.
  [[nodiscard]] bool build();

 private:
  tevpf::Table table_;
  std::vector<tevpf::Column> columns_;  // that have an index, as they were
};

}  // namespace tool
