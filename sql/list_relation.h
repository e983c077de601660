// A list in SQL: a row for each parameter, in order.
#pragma once

#include "relation.h"
#include "tevpf.hpp"

namespace sql {

class ListRelation : public Relation {
 public:
  ListRelation(Journal& journal, tevpf::List list) : journal_(journal), list_(std::move(list)) {}

  std::string declaration() const override;
  void plan(sqlite3_index_info& info) const override;
  std::unique_ptr<Cursor> open() override;
  RowIds::Id insert(Values values, bool replaces) override;
  void update(RowIds::Id id, Values values, bool replaces) override;
  void remove(RowIds::Id id) override;
  void revert(const Change& change) override;
  std::size_t size() const override { return list_.size(); }

  const tevpf::List& list() const noexcept { return list_; }

 private:
  // The parameter of that number, by whose name it can be changed.
  tevpf::Parameter at(std::size_t number) const;
  void replace(const tevpf::Parameter& old, const tevpf::Parameter& changed);
  [[noreturn]] void refuse(const tevpf::Error& error, std::size_t number) const;
  void note(Change::Kind kind, RowIds::Id id, std::size_t number, const tevpf::Parameter* before);

  Journal& journal_;
  tevpf::List list_;
};

}  // namespace sql
