// What the command line says about an import, checked as far as it can be without the CSV.
#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "column_shape.h"
#include "commands.h"
#include "csv_dialect.h"
#include "find.h"

namespace tool {

// What was said of columns by their names.
template <class T>
class PerColumnName {
 public:
  void set(std::string name, T what) { all_.emplace_back(std::move(name), std::move(what)); }
  const T* find(std::string_view name) const {  // the last word counts
    for (auto it = all_.rbegin(); it != all_.rend(); ++it) {
      if (it->first == name) return &it->second;
    }
    return nullptr;
  }
  bool empty() const { return all_.empty(); }
  auto begin() const { return all_.begin(); }
  auto end() const { return all_.end(); }

 private:
  std::vector<std::pair<std::string, T>> all_;
};

struct ImportOptions {
  Kind kind;  // --list or --table
  CsvDialect dialect;
  bool has_delimiter = false;  // given: it need not be recognised
  bool has_header = true, fills = false, shortens_names = false, is_forced = false;
  std::vector<std::string> columns;
  FieldRules rules;
  PerColumnName<tevpf::Type> types;
  std::optional<tevpf::Type> type_of_others;  // of columns without a type of their own
  PerColumnName<std::size_t> widths;
  PerColumnName<std::string> defaults;
};

// A Failure (kUsage) when an option says nothing that can be meant.
ImportOptions import_options(const Arguments& arguments);

// The type of that name ("integer", ...).
std::optional<tevpf::Type> type_named(std::string_view word);

}  // namespace tool
