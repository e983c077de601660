#include "relation.h"

#include "refusal.h"

namespace sql {

std::size_t Relation::number_of(RowIds::Id id) const {
  if (const auto number = ids_.number_of(id)) return *number;
  throw Refusal(SQLITE_ERROR, "there is no row " + std::to_string(id));
}

}  // namespace sql
