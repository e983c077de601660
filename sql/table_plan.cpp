#include "table_plan.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <string>

#include "refusal.h"

namespace sql {
namespace {

enum Bits {
  kRow = 1,
  kIndex = 2,
  kEqual = 4,
  kLeast = 8,
  kGreatest = 16,
  kPrefix = 32,
  kOrdered = 64,
  kDescending = 128,
  kColumn = 256,
};

// Rows in the order of an index lie anywhere in memory.
constexpr double kIndexedRow = 2;

// The constraints on one column that an index serves, as places in SQLite's array; -1: none.
struct Constraints {
  int equal = -1, least = -1, greatest = -1, prefix = -1;
  bool any() const noexcept { return equal >= 0 || least >= 0 || greatest >= 0 || prefix >= 0; }
};

Constraints constraints_on(sqlite3_index_info& info, int column, bool is_text) {
  Constraints found;
  for (int i = 0; i < info.nConstraint; ++i) {
    const auto& constraint = info.aConstraint[i];
    if (constraint.usable == 0 || constraint.iColumn != column) continue;
    // An index holds texts in the order of their bytes.
    if (is_text && sqlite3_stricmp(sqlite3_vtab_collation(&info, i), "BINARY") != 0) continue;
    switch (constraint.op) {
      case SQLITE_INDEX_CONSTRAINT_EQ:
        found.equal = i;
        break;
      case SQLITE_INDEX_CONSTRAINT_GT:
      case SQLITE_INDEX_CONSTRAINT_GE:
        found.least = i;
        break;
      case SQLITE_INDEX_CONSTRAINT_LT:
      case SQLITE_INDEX_CONSTRAINT_LE:
        found.greatest = i;
        break;
      case SQLITE_INDEX_CONSTRAINT_GLOB:
        if (is_text) found.prefix = i;
        break;
      default:
        break;
    }
  }
  return found;
}

struct Candidate {
  Plan plan;
  double cost = 0, rows = 0;
  std::array<int, 2> arguments{-1, -1};  // constraints in the order of their values
  double sorting = 0;                    // what SQLite adds when the order is not right
  double whole_cost() const noexcept { return cost + sorting; }
};

// Without statistics: what SQLite itself assumes of an index that was never analysed.
double estimated_rows(const Constraints& c, const Field& field, double rows) {
  if (c.equal >= 0) return std::min(field.is_unique ? 1.0 : 10.0, rows);
  if (c.prefix >= 0) return rows / 16;
  if (c.least >= 0 && c.greatest >= 0) return rows / 16;
  if (c.least >= 0 || c.greatest >= 0) return rows / 4;
  return rows;
}

Candidate along_index(const Constraints& c, int column, const Field& field, double rows) {
  Candidate result;
  Plan& plan = result.plan;
  plan.access = Plan::Access::index;
  plan.column = column;
  if (c.equal >= 0) {
    plan.is_equal = true;
    result.arguments[0] = c.equal;
  } else if (c.prefix >= 0) {
    plan.has_prefix = true;
    result.arguments[0] = c.prefix;
  } else {
    std::size_t count = 0;
    plan.has_least = c.least >= 0;
    plan.has_greatest = c.greatest >= 0;
    if (plan.has_least) result.arguments[count++] = c.least;
    if (plan.has_greatest) result.arguments[count] = c.greatest;
  }
  result.rows = estimated_rows(c, field, rows);
  result.cost = (c.any() ? 2 * std::log2(rows + 2) : 0) + kIndexedRow * result.rows;
  return result;
}

// The order that is asked for, when it is that of one column; -1: that of the rowid.
struct Order {
  bool is_wanted = false, is_single = false, is_descending = false;
  int column = 0;
};

Order order_of(const sqlite3_index_info& info) {
  Order order;
  order.is_wanted = info.nOrderBy > 0;
  order.is_single = info.nOrderBy == 1;
  if (order.is_single) {
    order.column = info.aOrderBy[0].iColumn;
    order.is_descending = info.aOrderBy[0].desc != 0;
  }
  return order;
}

// Takes the order into the plan, or its cost into account.
void settle_order(Candidate& candidate, const Order& order) {
  if (!order.is_wanted) return;
  Plan& plan = candidate.plan;
  const bool is_there =
      plan.access == Plan::Access::row ||
      (plan.access == Plan::Access::all ? order.column < 0 : order.column == plan.column);
  if (order.is_single && is_there) {
    plan.is_ordered = true;
    plan.is_descending = order.is_descending;
  } else {
    candidate.sorting = candidate.rows * std::log2(candidate.rows + 2);
  }
}

// As EXPLAIN QUERY PLAN shows it: "melting>? AND melting<? ORDER BY melting DESC".
std::string described(const Plan& plan, const TableShape& shape) {
  if (plan.access == Plan::Access::row) return "rowid=?";
  std::string text;
  const std::string column = plan.access == Plan::Access::index
                                 ? shape.fields[static_cast<std::size_t>(plan.column)].sql_name
                                 : "rowid";
  const auto add = [&](bool holds, const char* operation) {
    if (!holds) return;
    if (!text.empty()) text += " AND ";
    text += column + operation;
  };
  add(plan.is_equal, "=?");
  add(plan.has_least, ">?");
  add(plan.has_greatest, "<?");
  add(plan.has_prefix, " GLOB ?");
  if (!plan.is_ordered) return text;
  return text + (text.empty() ? "" : " ") + "ORDER BY " + column +
         (plan.is_descending ? " DESC" : "");
}

}  // namespace

int Plan::number() const noexcept {
  return (access == Access::row ? kRow : 0) | (access == Access::index ? kIndex : 0) |
         (is_equal ? kEqual : 0) | (has_least ? kLeast : 0) | (has_greatest ? kGreatest : 0) |
         (has_prefix ? kPrefix : 0) | (is_ordered ? kOrdered : 0) |
         (is_descending ? kDescending : 0) | column * kColumn;
}

Plan Plan::from(int number) noexcept {
  Plan plan;
  plan.access = (number & kRow) != 0     ? Access::row
                : (number & kIndex) != 0 ? Access::index
                                         : Access::all;
  plan.is_equal = (number & kEqual) != 0;
  plan.has_least = (number & kLeast) != 0;
  plan.has_greatest = (number & kGreatest) != 0;
  plan.has_prefix = (number & kPrefix) != 0;
  plan.is_ordered = (number & kOrdered) != 0;
  plan.is_descending = (number & kDescending) != 0;
  plan.column = number / kColumn;
  return plan;
}

void choose_plan(const TableShape& shape, std::size_t row_count, sqlite3_index_info& info) {
  const Order order = order_of(info);
  const double rows = static_cast<double>(row_count);
  Candidate best;
  best.cost = best.rows = rows;
  settle_order(best, order);
  const auto consider = [&](Candidate candidate) {
    settle_order(candidate, order);
    if (candidate.whole_cost() < best.whole_cost()) best = candidate;
  };
  if (const Constraints c = constraints_on(info, -1, false); c.equal >= 0) {
    Candidate by_id;
    by_id.plan.access = Plan::Access::row;
    by_id.arguments[0] = c.equal;
    by_id.cost = 0;
    by_id.rows = 1;
    best = by_id;
    settle_order(best, order);
    info.idxFlags = SQLITE_INDEX_SCAN_UNIQUE;
  } else {
    for (std::size_t i = 0; i < shape.fields.size(); ++i) {
      const Field& field = shape.fields[i];
      const int column = static_cast<int>(i);
      if (!field.is_indexed) continue;
      const Constraints on = constraints_on(info, column, field.is_text());
      if (on.any() || (order.is_single && order.column == column)) {
        consider(along_index(on, column, field, rows));
      }
    }
  }
  int count = 0;
  for (const int argument : best.arguments) {
    if (argument >= 0) info.aConstraintUsage[argument].argvIndex = ++count;
  }
  info.idxNum = best.plan.number();
  info.idxStr = sqlite3_mprintf("%s", described(best.plan, shape).c_str());
  if (info.idxStr == nullptr) throw std::bad_alloc();
  info.needToFreeIdxStr = 1;
  info.orderByConsumed = best.plan.is_ordered ? 1 : 0;
  info.estimatedCost = best.cost + 1;
  info.estimatedRows = static_cast<sqlite3_int64>(best.rows) + 1;
}

}  // namespace sql
