// What the transaction of a file has changed so far, to undo it.
#pragma once

#include <cstddef>
#include <memory>
#include <utility>
#include <vector>

#include "row_ids.h"

namespace sql {

// What was where a change was made, to undo it with.
struct Before {
  Before() = default;
  Before(const Before&) = delete;
  Before& operator=(const Before&) = delete;
  virtual ~Before() = default;
};

struct Change;

// Who can undo a change.
class Reverting {
 public:
  virtual void revert(const Change& change) = 0;

 protected:
  ~Reverting() = default;
};

struct Change {
  enum class Kind { added, replaced, removed };
  Kind kind;
  Reverting* changed;
  RowIds::Id id;
  std::size_t number;                    // of the row when it was changed
  std::unique_ptr<const Before> before;  // of what was replaced or removed
};

class Journal {
 public:
  bool empty() const noexcept { return changes_.empty(); }
  std::size_t size() const noexcept { return changes_.size(); }
  void note(Change change) { changes_.push_back(std::move(change)); }

  // Undoes the last changes until so many are left. When one cannot be undone, the journal is broken:
  // only reading the file again helps.
  void undo_to(std::size_t size);
  bool is_broken() const noexcept { return is_broken_; }
  void set_broken() noexcept { is_broken_ = true; }

  void clear() noexcept {
    changes_.clear();
    is_broken_ = false;
  }

 private:
  std::vector<Change> changes_;
  bool is_broken_ = false;
};

}  // namespace sql
