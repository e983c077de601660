// The indexes of a table taken away while many rows are added, and then built at once.
#pragma once

#include <vector>

#include "tevpf.hpp"

namespace tool {

class DeferredIndexes {
 public:
  explicit DeferredIndexes(tevpf::Table table);

  bool has_any() const { return !columns_.empty(); }

  // Takes them all away; builds them all. False when the library refuses one, as it does when a unique
  // column holds a value twice, or any column one outside its bounds: the table must not be used then.
  [[nodiscard]] bool take_away();
  [[nodiscard]] bool build();

 private:
  bool redefine(bool has_index);

  tevpf::Table table_;
  std::vector<tevpf::Column> columns_;  // that have an index, as they were
};

}  // namespace tool
