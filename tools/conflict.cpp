#include "conflict.h"

#include "failure.h"
#include "text.h"

namespace tool {
namespace {

bool is_taken(const tevpf::File& file, tevpf::Kind kind, const std::string& name) {
  return kind == tevpf::Kind::list ? file.find_list(name).has_value()
                                   : file.find_table(name).has_value();
}

// "pump-2", cut to the length of names.
std::string free_name(const tevpf::File& file, tevpf::Kind kind, const std::string& name) {
  for (std::size_t number = 2;; ++number) {
    const std::string end = "-" + std::to_string(number);
    std::string candidate = name.substr(0, TEVPF_NAME_SIZE - 1 - end.size()) + end;
    if (!is_taken(file, kind, candidate)) return candidate;
  }
}

}  // namespace

Conflict conflict_named(const std::string& word) {
  if (word == "refuse") return Conflict::kRefuse;
  if (word == "rename") return Conflict::kRename;
  if (word == "replace") return Conflict::kReplace;
  if (word == "skip") return Conflict::kSkip;
  throw Failure(kUsage, "--on-conflict: there is no " + in_quotes(word) +
                            "; choose refuse, rename, replace or skip");
}

std::optional<std::string> name_in(tevpf::File& file, tevpf::Kind kind, const std::string& name,
                                   Conflict conflict) {
  if (!is_taken(file, kind, name)) return name;
  const bool is_list = kind == tevpf::Kind::list;
  switch (conflict) {
    case Conflict::kRename:
      return free_name(file, kind, name);
    case Conflict::kReplace:
      is_list ? file.remove_list(name) : file.remove_table(name);
      return name;
    case Conflict::kSkip:
      return std::nullopt;
    case Conflict::kRefuse:
      break;
  }
  throw Failure(kRefused, visible(file.name()) + ": " + (is_list ? "list " : "table ") +
                              in_quotes(name) +
                              " is in it already; --on-conflict says what to do: rename, replace "
                              "or skip");
}

}  // namespace tool
