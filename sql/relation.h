// A list or a table of a parameter file as SQL has it: rows to read and to change.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <span>
#include <string>

#include "journal.h"
#include "row_ids.h"
#include "sqlite.h"

namespace sql {

using Values = std::span<sqlite3_value*>;

// A read of some rows. While it is active no other connection changes the file.
class Cursor {
 public:
  Cursor() = default;
  Cursor(const Cursor&) = delete;
  Cursor& operator=(const Cursor&) = delete;
  virtual ~Cursor() = default;

  // Starts with the rows that Relation::plan has numbered so; may deliver more than were asked for.
  virtual void filter(int plan, Values arguments) = 0;
  // Goes on to a row that is at hand; needs no lock. False: advance() has to find it.
  virtual bool step() noexcept { return false; }
  virtual void advance() = 0;
  virtual bool at_end() const noexcept = 0;
  virtual void deliver(sqlite3_context* context, int column) const = 0;
  virtual RowIds::Id id() const = 0;
};

// All but cursors' step() and delivery is called with the library locked. Changes throw Refusal, and have
// then changed nothing, or std::bad_alloc; what they have done stands in the journal of the file.
class Relation : public Reverting {
 public:
  virtual ~Relation() = default;
  Relation(const Relation&) = delete;
  Relation& operator=(const Relation&) = delete;

  virtual std::string declaration() const = 0;  // CREATE TABLE
  virtual void plan(sqlite3_index_info& info) const = 0;
  virtual std::unique_ptr<Cursor> open() = 0;

  // `replaces`: rows with the same unique values go (INSERT OR REPLACE).
  virtual RowIds::Id insert(Values values, bool replaces) = 0;
  virtual void update(RowIds::Id id, Values values, bool replaces) = 0;
  virtual void remove(RowIds::Id id) = 0;

  virtual std::size_t size() const = 0;
  void renew_ids() { ids_ = RowIds(size()); }
  const RowIds& ids() const noexcept { return ids_; }
  // Changes so far: what was read ahead is good while they stand still.
  std::uint64_t version() const noexcept { return version_; }

 protected:
  Relation() = default;
  // The number of a row; a Refusal when it is gone.
  std::size_t number_of(RowIds::Id id) const;

  RowIds ids_;
  std::uint64_t version_ = 0;
};

}  // namespace sql
