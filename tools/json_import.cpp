#include "json_import.h"

#include <algorithm>
#include <charconv>
#include <limits>
#include <nlohmann/json.hpp>
#include <unordered_map>
#include <vector>

#include "definition_options.h"
#include "failure.h"
#include "find.h"
#include "index_order.h"
#include "text.h"
#include "values.h"

namespace tool {
namespace {

using Json = nlohmann::ordered_json;

// A value of the text together with where it stands: "lab.json: table 'runs', row 3".
class Part {
 public:
  Part(const Json& json, std::string place) : json_(&json), place_(std::move(place)) {}

  const Json& json() const { return *json_; }
  const std::string& place() const { return place_; }
  Part named(const std::string& place) const { return {*json_, place_ + place}; }
  Part of(const Json& json, const std::string& place) const { return {json, place_ + place}; }

  [[noreturn]] void fail(const std::string& what) const {
    const char* const end =
        what.ends_with('?') ? " Nothing was imported" : "; nothing was imported";
    throw Failure(kRefused, place_ + ": " + what + end);
  }

  bool has(const char* key) const { return json_->contains(key); }
  // The member; its place is that of the whole.
  Part operator[](const char* key) const {
    if (!has(key)) fail(std::string("\"") + key + "\" is missing");
    return {(*json_)[key], place_};
  }

  // Refuses members of other names, which would be lost.
  void require_object(const std::vector<std::string>& keys) const {
    if (!json_->is_object()) fail("it is no JSON object");
    for (const auto& [key, value] : json_->items()) {
      if (std::find(keys.begin(), keys.end(), key) == keys.end()) {
        fail("there is no member " + in_quotes(key) + did_you_mean(key, keys));
      }
    }
  }
  const Part& require_array(const char* key) const {
    if (!json_->is_array()) fail(std::string("\"") + key + "\" is no array");
    return *this;
  }

  std::string text(const char* key) const {
    if (json_->is_string()) return without_nul(json_->get<std::string>(), key);
    if (json_->is_object() && json_->contains("bytes") && (*json_)["bytes"].is_string()) {
      return without_nul(from_hex((*json_)["bytes"].get<std::string>(), key), key);
    }
    fail(std::string("\"") + key + "\" is no text");
  }
  std::string text_or_none(const char* key) const { return has(key) ? (*this)[key].text(key) : ""; }
  std::int32_t integer(const char* key) const {
    if (json_->is_number_integer()) {
      const auto number = json_->get<std::int64_t>();
      if (number >= 1 && number <= std::numeric_limits<std::int32_t>::max()) {
        return static_cast<std::int32_t>(number);
      }
    }
    fail(std::string("\"") + key + "\" is no integer from 1 on");
  }
  bool flag(const char* key) const {
    if (!has(key)) return false;
    if (!(*json_)[key].is_boolean()) fail(std::string("\"") + key + "\" is neither true nor false");
    return (*json_)[key].get<bool>();
  }

 private:
  std::string without_nul(std::string text, const char* key) const {
    if (text.find('\0') != std::string::npos) {
      fail(std::string("\"") + key + "\" holds a zero character, which ends texts in files");
    }
    return text;
  }
  std::string from_hex(const std::string& digits, const char* key) const {
    std::string result;
    for (std::size_t i = 0; i < digits.size(); i += 2) {
      unsigned byte = 0;
      const char* const end = digits.data() + std::min(i + 2, digits.size());
      if (std::from_chars(digits.data() + i, end, byte, 16).ptr != digits.data() + i + 2) {
        fail(std::string("\"") + key + "\" has bytes that are no pairs of hexadecimal digits");
      }
      result += static_cast<char>(byte);
    }
    return result;
  }

  const Json* json_;
  std::string place_;
};

// ---- Values ----

// The text of a number as the value types read it; empty: the JSON is none.
std::string number_text(const Json& json) {
  if (json.is_number_unsigned()) return std::to_string(json.get<std::uint64_t>());
  if (json.is_number_integer()) return std::to_string(json.get<std::int64_t>());
  if (json.is_number_float()) return exact_text(json.get<double>());
  if (json.is_string()) {
    const auto text = json.get<std::string>();
    if (text == "inf" || text == "-inf" || text == "nan") return text;
  }
  return json.is_null() ? "nan" : "";
}

template <class Definition>
Value number_of(const Part& part, const Definition& definition) {
  const std::string text = number_text(part.json());
  if (text.empty()) part.fail(part.json().dump() + " is not " + with_article(definition.type()));
  if (part.json().is_null() && !is_floating(definition.type())) {
    part.fail("there is no value, but " + with_article(definition.type()) + " needs one");
  }
  Value value;
  const bool is_float = definition.type() == Type::float32 && part.json().is_number();
  const Parsed parsed = parse_value(definition.type(), text, value);
  if (parsed != Parsed::kValue) part.fail(refused_value(text, parsed, definition));
  if (is_float) value = static_cast<float>(part.json().get<double>());
  return value;
}

template <class Definition>
Value value_of(const Part& part, const Definition& definition) {
  if (definition.type() != Type::string) return number_of(part, definition);
  return part.text("value");
}

// ---- Definitions ----

Type type_of(const Part& part) {
  const std::string word = part["type"].text("type");
  try {
    return required_type(word);
  } catch (const Failure&) {
    part.fail("there is no type " + in_quotes(word) +
              "; choose integer, short, real, double or string");
  }
}

// What parameters and columns have in common.
template <class Definition>
void read_definition(Definition& definition, const Part& part) {
  definition.units(part.text_or_none("units")).description(part.text_or_none("description"));
  if (part.has("precision")) definition.precision(part["precision"].integer("precision"));
  if (!part.has("min") && !part.has("max")) return;
  if (definition.type() == Type::string) part.fail("a string has no bounds");
  tevpf::Bounds bounds = *definition.bounds();
  if (part.has("min")) bounds.min = number_of(part["min"], definition);
  if (part.has("max")) bounds.max = number_of(part["max"], definition);
  definition.bounds(bounds.min, bounds.max);
}

std::string name_of(const Part& part, const char* key) {
  std::string name = part[key].text(key);
  check_new_name(name, part.place() + ": the name");
  return name;
}

void read_parameter(tevpf::List& list, const Part& whole) {
  whole.require_object(
      {"name", "type", "value", "min", "max", "precision", "units", "description"});
  const std::string name = name_of(whole, "name");
  const Part part = whole.named(", parameter " + in_quotes(name));
  tevpf::Parameter parameter(name, zero_of(type_of(part)));
  read_definition(parameter, part);
  const Value value = value_of(part["value"], parameter);
  if (!is_within(value, parameter.bounds())) {
    part.fail(refused_value(exact_text(value), Parsed::kOutOfRange, parameter));
  }
  list.add(parameter.value(value));
}

tevpf::Column read_column(const Part& whole) {
  whole.require_object({"name", "type", "width", "min", "max", "precision", "units", "description",
                        "indexed", "unique"});
  const std::string name = name_of(whole, "name");
  const Part part = whole.named(", column " + in_quotes(name));
  tevpf::Column column(name, type_of(part));
  if (part.has("width")) column.width(part["width"].integer("width"));
  read_definition(column, part);
  if (part.flag("indexed")) column.indexed();
  if (part.flag("unique")) column.unique();
  return column;
}

// ---- Rows ----

class RowReader {
 public:
  RowReader(tevpf::Table& table, const std::vector<tevpf::Column>& columns)
      : table_(table), columns_(columns), empty_(table.new_row()) {
    for (std::size_t i = 0; i < columns.size(); ++i) positions_.emplace(columns[i].name(), i);
  }

  void add(const Part& part) {
    tevpf::Row row = empty_;
    if (part.json().is_object()) {
      set_members(row, part);
    } else if (part.json().is_array() && part.json().size() == columns_.size()) {
      for (std::size_t i = 0; i < columns_.size(); ++i) set(row, i, part, part.json()[i]);
    } else {
      part.fail("it is neither an object nor an array of " + counted(columns_.size(), "value"));
    }
    try {
      table_.append(row);
    } catch (const tevpf::Error& error) {
      part.fail(visible(error.what()));
    }
  }

 private:
  void set_members(tevpf::Row& row, const Part& part) {
    static const Json kMissing;
    is_set_.assign(columns_.size(), false);
    for (const auto& [key, value] : part.json().items()) {
      const auto found = positions_.find(key);
      if (found == positions_.end()) part.fail("there is no column " + in_quotes(key) + hint(key));
      set(row, found->second, part, value);
      is_set_[found->second] = true;
    }
    for (std::size_t i = 0; i < columns_.size(); ++i) {
      if (!is_set_[i] && columns_[i].type() != Type::string) set(row, i, part, kMissing);
    }
  }
  void set(tevpf::Row& row, std::size_t position, const Part& part, const Json& json) {
    const tevpf::Column& column = columns_[position];
    const Part cell = part.of(json, ", column " + in_quotes(column.name()));
    const Value value = value_of(cell, column);
    if (const auto* text = std::get_if<std::string>(&value)) {
      if (text->size() > static_cast<std::size_t>(column.width())) {
        cell.fail("the text has " + counted(text->size(), "byte") + ", the column holds " +
                  std::to_string(column.width()));
      }
    } else if (is_nan(value) ? column.is_indexed() : !is_within(value, column.bounds())) {
      cell.fail(is_nan(value) ? "the column has an index, so each row needs a number"
                              : refused_value(exact_text(value), Parsed::kOutOfRange, column));
    }
    row.set(position, value);
  }
  std::string hint(const std::string& key) const {
    std::vector<std::string> names;
    for (const tevpf::Column& column : columns_) names.push_back(column.name());
    return did_you_mean(key, names);
  }

  tevpf::Table& table_;
  const std::vector<tevpf::Column>& columns_;
  const tevpf::Row empty_;
  std::unordered_map<std::string, std::size_t> positions_;
  std::vector<bool> is_set_;
};

// ---- Elements ----

void read_list(tevpf::List list, const Part& part) {
  if (!part.has("parameters")) return;
  for (const Json& parameter : part["parameters"].require_array("parameters").json()) {
    read_parameter(list, part.of(parameter, ""));
  }
}

void read_order(tevpf::Table& table, const std::vector<tevpf::Column>& columns, const Part& part) {
  part.require_object({"column", "rows"});
  const std::string name = part["column"].text("column");
  std::vector<std::size_t> order;
  for (const Json& row : part["rows"].require_array("rows").json()) {
    order.push_back(row.is_number_unsigned() ? row.get<std::size_t>() - 1
                                             : std::numeric_limits<std::size_t>::max());
  }
  for (const tevpf::Column& column : columns) {
    if (column.name() == name) restore_order(table, column, order);
  }
}

void read_table(tevpf::Table table, const Part& part) {
  std::vector<tevpf::Column> columns;
  if (part.has("columns")) {
    for (const Json& column : part["columns"].require_array("columns").json()) {
      columns.push_back(read_column(part.of(column, "")));
    }
  }
  add_columns(table, columns,
              part.has("display_width") ? part["display_width"].integer("display_width") : 0);
  if (part.has("rows")) {
    RowReader reader(table, columns);
    std::size_t number = 0;
    for (const Json& row : part["rows"].require_array("rows").json()) {
      reader.add(part.of(row, ", row " + std::to_string(++number)));
    }
  }
  if (part.has("index_order")) {
    for (const Json& order : part["index_order"].require_array("index_order").json()) {
      read_order(table, columns, part.of(order, ", index_order"));
    }
  }
}

// False: left out.
bool read_element(tevpf::File& file, const Part& whole, Conflict conflict) {
  const bool is_list = whole.json().is_object() && whole.has("list");
  whole.require_object(is_list ? std::vector<std::string>{"list", "description", "parameters"}
                               : std::vector<std::string>{"table", "description", "columns",
                                                          "display_width", "index_order", "rows"});
  const char* const word = is_list ? "list" : "table";
  const std::string given = name_of(whole, word);
  const auto name =
      name_in(file, is_list ? tevpf::Kind::list : tevpf::Kind::table, given, conflict);
  if (!name) return false;
  const Part part = whole.named(": " + std::string(word) + " " + in_quotes(given));
  const std::string description = part.text_or_none("description");
  try {
    is_list ? read_list(file.create_list(*name, description), part)
            : read_table(file.create_table(*name, description), part);
  } catch (const tevpf::Error& error) {
    part.fail(visible(error.what()));
  }
  return true;
}

}  // namespace

std::size_t import_json(tevpf::File& file, const JsonText& text, Conflict conflict) {
  Json json;
  const std::string name = visible(text.name);
  try {
    json = Json::parse(text.text);
  } catch (const Json::exception& error) {
    // "[json.exception.parse_error.101] parse error at line 2, column 5: ..."
    const std::string what = error.what();
    const std::size_t sentence = what.find("] ");
    throw Failure(kRefused,
                  name + ": " +
                      visible(sentence == std::string::npos ? what : what.substr(sentence + 2)) +
                      "; nothing was imported");
  }
  const Part whole(json, name);
  if (!json.is_object() || !whole.has("elements"))
    return read_element(file, whole, conflict) ? 1 : 0;
  whole.require_object({"elements"});
  std::size_t count = 0;
  for (const Json& element : whole["elements"].require_array("elements").json()) {
    count += read_element(file, whole.of(element, ""), conflict) ? 1U : 0U;
  }
  return count;
}

}  // namespace tool
