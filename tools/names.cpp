#include "names.h"

#include <algorithm>
#include <cstddef>
#include <string_view>
#include <unordered_set>

#include "tevpf.hpp"
#include "text.h"

namespace tool {

std::vector<std::string> split_at_commas(const std::vector<std::string>& values) {
  return split_names(values, [](const std::string&) { return false; });
}

std::vector<std::string> split_names(const std::vector<std::string>& values,
                                     const std::function<bool(const std::string&)>& is_name) {
  std::vector<std::string> names;
  for (const std::string& value : values) {
    const bool is_whole = is_name(value);
    for (std::size_t begin = 0; begin <= value.size();) {
      const std::size_t end =
          is_whole ? value.size() : std::min(value.find(',', begin), value.size());
      names.push_back(value.substr(begin, end - begin));
      begin = end + 1;
    }
  }
  return names;
}

void shorten_names(std::vector<std::string>& names) {
  constexpr std::size_t kLongest = TEVPF_NAME_SIZE - 1;
  // Names that fit as they are keep them, wherever they stand.
  std::unordered_set<std::string> taken;
  std::vector<bool> is_settled(names.size());
  for (std::size_t i = 0; i < names.size(); ++i) {
    names[i] = trimmed(names[i]);
    is_settled[i] =
        !names[i].empty() && names[i].size() <= kLongest && taken.insert(names[i]).second;
  }
  for (std::size_t i = 0; i < names.size(); ++i) {
    if (is_settled[i]) continue;
    const std::string wanted = names[i].empty() ? "column" + std::to_string(i + 1) : names[i];
    std::string name(trimmed(cut(wanted, kLongest)));
    for (std::size_t number = 2; !taken.insert(name).second; ++number) {
      const std::string end = "_" + std::to_string(number);
      name = std::string(cut(wanted, kLongest - end.size())) + end;
    }
    names[i] = name;
  }
}

}  // namespace tool
