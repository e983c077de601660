#include "journal.h"

namespace sql {

void Journal::undo_to(std::size_t size) {
  try {
    while (changes_.size() > size) {
      const Change& last = changes_.back();
      last.changed->revert(last);
      changes_.pop_back();
    }
  } catch (...) {
    is_broken_ = true;
    throw;
  }
}

}  // namespace sql
