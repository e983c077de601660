#include "names.h"

#include <algorithm>
#include <set>
#include <string_view>

#include "values.h"

namespace sql {
namespace {

std::string folded(std::string_view name) {
  std::string result(name);
  for (char& c : result) {
    if (c >= 'A' && c <= 'Z') c = static_cast<char>(c - 'A' + 'a');
  }
  return result;
}

class TakenNames {
 public:
  bool take(const std::string& name) { return taken_.insert(folded(name)).second; }

  // NAME with the first prefix that makes it free: "kind:", "kind2:", "kind3:" ...
  std::string take_variant(const std::string& name, const std::string& kind, int first) {
    for (int number = first;; ++number) {
      std::string variant = kind + (number > 1 ? std::to_string(number) : "") + ":" + name;
      if (take(variant)) return variant;
    }
  }

 private:
  std::set<std::string> taken_;
};

bool is_reserved(const std::string& name) {
  return name.empty() || folded(name).starts_with("sqlite_");
}

}  // namespace

std::vector<NamedElement> named_elements(const tevpf::File& file) {
  std::vector<NamedElement> result;
  for (tevpf::Element& element : file.elements()) result.push_back({std::move(element), {}});
  std::stable_partition(result.begin(), result.end(), [](const NamedElement& named) {
    return named.element.kind == tevpf::Kind::table;
  });
  TakenNames taken;
  for (NamedElement& named : result) {
    std::string name = utf8(named.element.name);
    if (!is_reserved(name) && taken.take(name)) named.name = std::move(name);
  }
  for (NamedElement& named : result) {
    if (!named.name.empty()) continue;
    const char* const kind = named.element.kind == tevpf::Kind::table ? "table" : "list";
    named.name = taken.take_variant(utf8(named.element.name), kind, 1);
  }
  return result;
}

std::vector<std::string> column_names(const std::vector<tevpf::Column>& columns) {
  std::vector<std::string> result(columns.size());
  TakenNames taken;
  for (std::size_t i = 0; i < columns.size(); ++i) {
    std::string name = utf8(columns[i].name());
    if (!name.empty() && taken.take(name)) result[i] = std::move(name);
  }
  for (std::size_t i = 0; i < columns.size(); ++i) {
    if (result[i].empty()) result[i] = taken.take_variant(utf8(columns[i].name()), "", 2);
  }
  return result;
}

}  // namespace sql
