#include "deferred_indexes.h"

#include <utility>

namespace tool {

DeferredIndexes::DeferredIndexes(tevpf::Table table) : table_(std::move(table)) {
  for (tevpf::Column& column : table_.columns()) {
    if (column.is_indexed()) columns_.push_back(std::move(column));
  }
}

void DeferredIndexes::take_away() {
  for (tevpf::Column column : columns_) table_.redefine(column.name(), column.indexed(false));
}

bool DeferredIndexes::build() {
  try {
    for (const tevpf::Column& column : columns_) table_.redefine(column.name(), column);
    return true;
  } catch (const tevpf::Error&) {
    return false;
  }
}

}  // namespace tool
