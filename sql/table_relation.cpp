#include "table_relation.h"

#include "refusal.h"
#include "table_cursor.h"
#include "table_plan.h"
#include "values.h"

namespace sql {
namespace {

using tevpf::Row;
using tevpf::Type;

struct BeforeRow : Before {
  explicit BeforeRow(Row r) : row(std::move(r)) {}
  Row row;
};

// Rows that are put back are not checked: a file may hold values that are out of range.
class Unchecked {
 public:
  explicit Unchecked(const char* table) {
    tevpf::detail::check(TEV8R1_set_interactive_table(table));
  }
  ~Unchecked() { TEV8R1_turn_off_interactive(); }
  Unchecked(const Unchecked&) = delete;
  Unchecked& operator=(const Unchecked&) = delete;
};

// SQLite gives columns of these types the affinity of integers, reals and texts.
std::string column_type(const Field& field) {
  switch (field.type) {
    case Type::int32:
      return " INTEGER NOT NULL";
    case Type::int16:
      return " SMALLINT NOT NULL";
    case Type::float32:
      return " REAL";
    case Type::float64:
      return " DOUBLE";
    case Type::string:
      break;
  }
  return " VARCHAR(" + std::to_string(field.size - 1) + ")";
}

}  // namespace

// SQLite knows no table without columns.
std::string TableRelation::declaration() const {
  std::string text = "CREATE TABLE rows(";
  if (shape_.fields.empty()) return text + "nothing HIDDEN)";
  for (std::size_t i = 0; i < shape_.fields.size(); ++i) {
    const Field& field = shape_.fields[i];
    text += (i == 0 ? "" : ", ") + identifier(field.sql_name) + column_type(field);
  }
  return text + ")";
}

void TableRelation::plan(sqlite3_index_info& info) const { choose_plan(shape_, size(), info); }

std::unique_ptr<Cursor> TableRelation::open() { return std::make_unique<TableCursor>(*this); }

void TableRelation::refuse(const tevpf::Error& error, std::size_t number) const {
  throw Refusal(code_of(error), "row " + std::to_string(number + 1) + " of table '" +
                                    std::string(table_.name()) + "': " + error.what());
}

void TableRelation::values_added(std::size_t number) {
  ++version_;
  std::optional<RowBlocks> rows;
  for (auto& order : orders_) {
    if (!order || !order->is_known()) continue;
    if (!rows) rows.emplace(table_, shape_.row_size, std::string());
    order->value_added(rows->probe(number));
  }
}

void TableRelation::fill(Row& row, Values values) const {
  for (std::size_t i = 0; i < shape_.fields.size(); ++i) {
    if (sqlite3_value_nochange(values[i]) != 0) continue;
    const Field& field = shape_.fields[i];
    row.set(i, to_cell(values[i], field.type, "column", field.name));
  }
}

void TableRelation::remove_equal(const Row& row, std::optional<RowIds::Id> but) {
  for (std::size_t i = 0; i < shape_.fields.size(); ++i) {
    if (!shape_.fields[i].is_unique) continue;
    while (const auto same = table_.find(shape_.fields[i].name, row.value(i))) {
      const RowIds::Id id = ids_.id_at(same->number());
      if (id == but) break;
      remove(id);
    }
  }
}

RowIds::Id TableRelation::insert(Values values, bool replaces) {
  std::size_t number = size();
  const std::size_t mark = journal_.size();
  try {
    Row row = table_.new_row();
    fill(row, values);
    if (replaces) remove_equal(row, std::nullopt);
    number = size();
    table_.append(row);
  } catch (const tevpf::Error& error) {
    journal_.undo_to(mark);
    refuse(error, number);
  }
  const RowIds::Id id = ids_.add();
  journal_.note({Change::Kind::added, this, id, number, nullptr});
  values_added(number);
  return id;
}

void TableRelation::update(RowIds::Id id, Values values, bool replaces) {
  std::size_t number = number_of(id);
  const std::size_t mark = journal_.size();
  try {
    Row row = table_.row(number);
    auto before = std::make_unique<const BeforeRow>(row);
    fill(row, values);
    if (replaces) {
      remove_equal(row, id);
      number = number_of(id);
    }
    table_.replace(number, row);
    journal_.note({Change::Kind::replaced, this, id, number, std::move(before)});
  } catch (const tevpf::Error& error) {
    journal_.undo_to(mark);
    refuse(error, number);
  }
  values_added(number);
}

void TableRelation::remove(RowIds::Id id) {
  const std::size_t number = number_of(id);
  try {
    auto before = std::make_unique<const BeforeRow>(table_.row(number));
    table_.remove(number);
    ids_.remove(id);
    journal_.note({Change::Kind::removed, this, id, number, std::move(before)});
  } catch (const tevpf::Error& error) {
    refuse(error, number);
  }
  ++version_;
  for (auto& order : orders_) {
    if (order) order->row_removed();
  }
}

// ---- Undoing ------------------------------------------------------------------------------------

void TableRelation::insert_unchecked(std::size_t number, const Row& row) {
  const std::string name(table_.name());
  static_cast<void>(table_.size());  // makes the file current
  const Unchecked unchecked(name.c_str());
  table_.insert(number, row);
}

void TableRelation::replace_unchecked(std::size_t number, const Row& row) {
  try {
    table_.replace(number, row);
  } catch (const tevpf::Error&) {
    table_.remove(number);
    insert_unchecked(number, row);
  }
}

void TableRelation::revert(const Change& change) {
  const auto* const before = static_cast<const BeforeRow*>(change.before.get());
  ++version_;
  switch (change.kind) {
    case Change::Kind::added:
      table_.remove(change.number);
      ids_.remove_last();
      for (auto& order : orders_) {
        if (order) order->row_removed();
      }
      return;
    case Change::Kind::replaced:
      replace_unchecked(change.number, before->row);
      return values_added(change.number);
    case Change::Kind::removed:
      insert_unchecked(change.number, before->row);
      ids_.restore(change.id);
      return values_added(change.number);
  }
}

}  // namespace sql
