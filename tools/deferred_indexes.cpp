#include "deferred_indexes.h"

#include <utility>

namespace tool {

DeferredIndexes::DeferredIndexes(tevpf::Table table) : table_(std::move(table)) {
  for (tevpf::Column& column : table_.columns()) {
    if (column.is_indexed()) columns_.push_back(std::move(column));
  }
}

bool DeferredIndexes::take_away() { return redefine(false); }

bool DeferredIndexes::build() { return redefine(true); }

bool DeferredIndexes::redefine(bool has_index) {
  try {
    for (tevpf::Column column : columns_) {
      table_.redefine(column.name(), has_index ? column : column.indexed(false));
    }
    return true;
  } catch (const tevpf::Error&) {
    return false;
  }
}

}  // namespace tool
