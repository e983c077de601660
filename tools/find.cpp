#include "find.h"

#include <algorithm>

#include "failure.h"
#include "text.h"

namespace tool {
namespace {

const char* word_of(Kind kind) {
  return !kind ? "list or table" : *kind == tevpf::Kind::list ? "list" : "table";
}

}  // namespace

tevpf::Element find_element(const tevpf::File& file, const std::string& name, Kind kind) {
  std::vector<tevpf::Element> named = file.elements();
  std::erase_if(named, [&](const tevpf::Element& element) { return element.name != name; });
  const auto found = std::find_if(named.begin(), named.end(), [&](const tevpf::Element& element) {
    return !kind || element.kind == *kind;
  });
  if (found == named.end()) {
    const std::string other =
        named.empty() ? ""
                      : std::string(", only a ") + word_of(named.front().kind) + " of that name";
    std::vector<std::string> names;
    for (const tevpf::Element& element : file.elements()) names.push_back(element.name);
    const std::string guess = named.empty() ? did_you_mean(name, names) : "";
    throw Failure(kRefused, visible(file.name()) + ": there is no " + word_of(kind) + " " +
                                in_quotes(name) + other +
                                (guess.empty() ? "; 'tevpf info' shows what there is" : guess));
  }
  if (named.size() > 1 && !kind) {
    throw Failure(kRefused, visible(file.name()) + ": both a list and a table are named " +
                                in_quotes(name) + "; say which with --list or --table");
  }
  return *found;
}

tevpf::Parameter find_parameter(const tevpf::File& file, const std::string& list,
                                const std::string& name) {
  if (auto found = file.list(list).find(name)) return *std::move(found);
  std::vector<std::string> names;
  for (const tevpf::Parameter& parameter : file.list(list)) names.push_back(parameter.name());
  const std::string guess = did_you_mean(name, names);
  throw Failure(kRefused, visible(file.name()) + ": list " + in_quotes(list) +
                              " has no parameter " + in_quotes(name) +
                              (guess.empty() ? "; 'tevpf show' shows those it has" : guess));
}

Columns::Columns(const tevpf::File& file, const tevpf::Table& table)
    : table_(visible(file.name()) + ": table " + in_quotes(table.name())), all_(table.columns()) {}

bool Columns::has(const std::string& name) const {
  return std::any_of(all_.begin(), all_.end(),
                     [&](const tevpf::Column& column) { return column.name() == name; });
}

std::size_t Columns::position_of(const std::string& name) const {
  std::vector<std::string> names;
  std::string listed;
  for (std::size_t i = 0; i < all_.size(); ++i) {
    if (all_[i].name() == name) return i;
    if (i > 0) listed += ", ";
    listed += visible(all_[i].name());
    names.push_back(all_[i].name());
  }
  throw Failure(kRefused, table_ + " has no column " + in_quotes(name) + "; it has " +
                              (listed.empty() ? "none" : listed) + did_you_mean(name, names));
}

void check_new_name(const std::string& name, const std::string& what) {
  if (name.empty()) throw Failure(kRefused, what + " is empty; give it at least one character");
  if (name.size() >= TEVPF_NAME_SIZE) {
    throw Failure(kRefused, what + " " + in_quotes(name) + " has " + std::to_string(name.size()) +
                                " characters; names have at most " +
                                std::to_string(TEVPF_NAME_SIZE - 1));
  }
  if (name.front() == ' ') {
    throw Failure(kRefused, what + " " + in_quotes(name) + " starts with a blank; take it away");
  }
}

}  // namespace tool
