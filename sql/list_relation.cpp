#include "list_relation.h"

#include <charconv>
#include <cmath>
#include <string_view>

#include "from_chars.h"
#include "refusal.h"
#include "values.h"

namespace sql {
namespace {

using tevpf::Parameter;
using tevpf::Type;

enum Column { kName, kType, kValue, kMinimum, kMaximum, kUnits, kPrecision, kDescription };

struct BeforeParameter : Before {
  explicit BeforeParameter(Parameter p) : parameter(std::move(p)) {}
  Parameter parameter;
};

class ListCursor : public Cursor {
 public:
  explicit ListCursor(const ListRelation& relation) : relation_(relation) {}

  void filter(int by_id, Values arguments) override {
    next_ = 0;
    end_ = relation_.size();
    if (by_id != 0) {
      const auto number = relation_.ids().number_of(sqlite3_value_int64(arguments[0]));
      next_ = number.value_or(end_);
      end_ = number ? *number + 1 : end_;
    }
    advance();
  }
  void advance() override {
    parameter_.reset();
    if (next_ < end_ && next_ < relation_.size()) parameter_ = relation_.list().at(next_++);
  }
  bool at_end() const noexcept override { return !parameter_.has_value(); }
  RowIds::Id id() const override { return relation_.ids().id_at(next_ - 1); }
  void deliver(sqlite3_context* context, int column) const override;

 private:
  const ListRelation& relation_;
  std::size_t next_ = 0, end_ = 0;
  std::optional<Parameter> parameter_;
};

// A real as the double that its shortest text stands for: 0.1, not 0.10000000149011612. Values of a list
// are few, and compared with what people write.
void deliver_shortest(sqlite3_context* context, const tevpf::Value& value) {
  const float* const real = std::get_if<float>(&value);
  if (real == nullptr || !std::isfinite(*real)) return sql::deliver(context, value);
  char text[32];
  const char* const end = std::to_chars(text, text + sizeof text, *real).ptr;
  double number = 0;
  sql::from_chars(text, end, number);
  sql::deliver(context, number);
}

void ListCursor::deliver(sqlite3_context* context, int column) const {
  const Parameter& p = *parameter_;
  switch (column) {
    case kName:
      return sql::deliver(context, std::string_view(p.name()));
    case kType:
      return sql::deliver(context, std::string_view(tevpf::to_string(p.type())));
    case kValue:
      return deliver_shortest(context, p.value());
    case kMinimum:
    case kMaximum:
      if (p.bounds())
        deliver_shortest(context, column == kMinimum ? p.bounds()->min : p.bounds()->max);
      return;
    case kUnits:
      return sql::deliver(context, std::string_view(p.units()));
    case kPrecision:
      if (p.precision() > 0) sqlite3_result_int(context, p.precision());
      return;
    default:
      return sql::deliver(context, std::string_view(p.description()));
  }
}

// ---- Parameters from rows -----------------------------------------------------------------------

bool is_given(sqlite3_value* value) {
  return sqlite3_value_nochange(value) == 0 && sqlite3_value_type(value) != SQLITE_NULL;
}

Type type_named(std::string_view word) {
  for (const Type type : {Type::int32, Type::int16, Type::float32, Type::float64, Type::string}) {
    if (word == tevpf::to_string(type)) return type;
  }
  throw tevpf::Error(PF_BADTYPE, std::string(word), {},
                     "there is no type '" + std::string(word) +
                         "'; there are integer, short, real, double and string");
}

// The type of a new parameter that says none: that of its value.
Type type_of(sqlite3_value* value) {
  switch (sqlite3_value_type(value)) {
    case SQLITE_INTEGER:
      return std::in_range<std::int32_t>(sqlite3_value_int64(value)) ? Type::int32 : Type::float64;
    case SQLITE_TEXT:
    case SQLITE_BLOB:
      return Type::string;
    default:
      return Type::float64;
  }
}

tevpf::Value empty_value(Type type) {
  switch (type) {
    case Type::int32:
      return std::int32_t{0};
    case Type::int16:
      return std::int16_t{0};
    case Type::float32:
      return 0.0F;
    case Type::float64:
      return 0.0;
    case Type::string:
      break;
  }
  return std::string();
}

void set_bounds(Parameter& parameter, sqlite3_value* min, sqlite3_value* max,
                const std::string& name) {
  if (parameter.type() == Type::string) {
    if (is_given(min) || is_given(max)) {
      throw tevpf::Error(PF_BADTYPE, "parameter " + name, "string",
                         "'" + name + "': a string has no bounds");
    }
    return;
  }
  const auto side = [&](sqlite3_value* given, const tevpf::Value& else_value) {
    return is_given(given) ? to_cell(given, parameter.type(), "parameter", name)
                           : tevpf::Cell(else_value);
  };
  const tevpf::Bounds old = *parameter.bounds();
  parameter.bounds(side(min, old.min), side(max, old.max));
}

std::int32_t digits_of(sqlite3_value* value) {
  const std::int64_t digits = sqlite3_value_int64(value);
  return std::in_range<std::int32_t>(digits) ? static_cast<std::int32_t>(digits) : 0;
}

// What a row's values make of a parameter that is of another type, or new; `old` gives the rest.
Parameter retyped(Values values, Type type, const Parameter* old) {
  const std::string name(old == nullptr ? text_of(values[kName]) : old->name());
  Parameter result(name, empty_value(type));
  if (old != nullptr) result.units(old->units()).description(old->description());
  return result;
}

Parameter changed(Values values, const Parameter* old) {
  const Type type = is_given(values[kType]) ? type_named(text_of(values[kType]))
                    : old != nullptr        ? old->type()
                                            : type_of(values[kValue]);
  const bool is_same_type = old != nullptr && old->type() == type;
  Parameter result = is_same_type ? *old : retyped(values, type, old);
  const std::string name = result.name();
  if (sqlite3_value_nochange(values[kName]) == 0) result.name(text_of(values[kName]));
  if (!is_same_type && sqlite3_value_nochange(values[kValue]) != 0) {
    result.value(old->value());
  } else if (sqlite3_value_nochange(values[kValue]) == 0) {
    result.value(to_cell(values[kValue], type, "parameter", name));
  }
  set_bounds(result, values[kMinimum], values[kMaximum], name);
  if (sqlite3_value_nochange(values[kUnits]) == 0) result.units(text_of(values[kUnits]));
  if (is_given(values[kPrecision])) result.precision(digits_of(values[kPrecision]));
  if (sqlite3_value_nochange(values[kDescription]) == 0) {
    result.description(text_of(values[kDescription]));
  }
  return result;
}

}  // namespace

// ---- The relation -------------------------------------------------------------------------------

std::string ListRelation::declaration() const {
  return "CREATE TABLE list(name TEXT NOT NULL, type TEXT NOT NULL, value, minimum, maximum, "
         "units TEXT, precision INTEGER, description TEXT)";
}

void ListRelation::plan(sqlite3_index_info& info) const {
  const double rows = static_cast<double>(size());
  info.estimatedCost = rows * 10;
  info.estimatedRows = static_cast<sqlite3_int64>(rows);
  for (int i = 0; i < info.nConstraint; ++i) {
    const auto& constraint = info.aConstraint[i];
    if (constraint.usable == 0 || constraint.iColumn >= 0 ||
        constraint.op != SQLITE_INDEX_CONSTRAINT_EQ) {
      continue;
    }
    info.aConstraintUsage[i].argvIndex = 1;
    info.idxNum = 1;
    info.estimatedCost = 10;
    info.estimatedRows = 1;
    info.idxFlags = SQLITE_INDEX_SCAN_UNIQUE;
    return;
  }
}

std::unique_ptr<Cursor> ListRelation::open() { return std::make_unique<ListCursor>(*this); }

void ListRelation::refuse(const tevpf::Error& error, std::size_t number) const {
  throw Refusal(code_of(error), "row " + std::to_string(number + 1) + " of list '" +
                                    std::string(list_.name()) + "': " + error.what());
}

void ListRelation::note(Change::Kind kind, RowIds::Id id, std::size_t number,
                        const Parameter* before) {
  ++version_;
  journal_.note({kind, this, id, number,
                 before == nullptr ? nullptr : std::make_unique<const BeforeParameter>(*before)});
}

Parameter ListRelation::at(std::size_t number) const {
  Parameter result = list_.at(number);
  if (list_.position(result.name()) != number) {
    throw tevpf::Error(PF_DUPLICATE, result.name(), {},
                       "two parameters are named '" + result.name() + "'");
  }
  return result;
}

RowIds::Id ListRelation::insert(Values values, bool replaces) {
  const std::size_t number = size();
  const std::size_t mark = journal_.size();
  try {
    const Parameter parameter = changed(values, nullptr);
    if (replaces) {
      if (const auto same = list_.position(parameter.name())) remove(ids_.id_at(*same));
    }
    list_.add(parameter);
  } catch (const tevpf::Error& error) {
    journal_.undo_to(mark);
    refuse(error, number);
  }
  const RowIds::Id id = ids_.add();
  note(Change::Kind::added, id, size() - 1, nullptr);
  return id;
}

// A new name first: taking it back cannot be refused.
void ListRelation::replace(const Parameter& old, const Parameter& changed) {
  const bool is_renamed = changed.name() != old.name();
  if (is_renamed) list_.rename(old.name(), changed.name());
  try {
    list_.redefine(changed);
  } catch (...) {
    if (is_renamed) list_.rename(changed.name(), old.name());
    throw;
  }
}

void ListRelation::update(RowIds::Id id, Values values, bool replaces) {
  std::size_t number = number_of(id);
  const std::size_t mark = journal_.size();
  try {
    const Parameter old = at(number);
    const Parameter parameter = changed(values, &old);
    const auto same = replaces ? list_.position(parameter.name()) : std::nullopt;
    if (same && *same != number) {
      remove(ids_.id_at(*same));
      number = number_of(id);
    }
    replace(old, parameter);
    note(Change::Kind::replaced, id, number, &old);
  } catch (const tevpf::Error& error) {
    journal_.undo_to(mark);
    refuse(error, number);
  }
}

void ListRelation::remove(RowIds::Id id) {
  const std::size_t number = number_of(id);
  try {
    const Parameter old = at(number);
    list_.remove(old.name());
    ids_.remove(id);
    note(Change::Kind::removed, id, number, &old);
  } catch (const tevpf::Error& error) {
    refuse(error, number);
  }
}

void ListRelation::revert(const Change& change) {
  const auto* const before = static_cast<const BeforeParameter*>(change.before.get());
  ++version_;
  switch (change.kind) {
    case Change::Kind::added:
      list_.remove(at(change.number).name());
      return ids_.remove_last();
    case Change::Kind::replaced:
      return replace(at(change.number), before->parameter);
    case Change::Kind::removed:
      list_.insert(change.number, before->parameter);
      return ids_.restore(change.id);
  }
}

}  // namespace sql
