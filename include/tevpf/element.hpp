// What a file holds: its lists and tables as its directory names them.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "open_file.hpp"

namespace tevpf {
inline namespace v1 {

enum class Kind : std::int32_t { list = PF_ELEM_LIST, table = PF_ELEM_TABLE };

struct Element {
  Kind kind;
  std::string name, description;
  bool operator==(const Element&) const = default;
};

namespace detail {

// The elements of the current file: lists first, each kind in directory order.
inline std::vector<Element> elements() {
  using Names = char[TEVPF_NAME_SIZE];
  using Descriptions = char[TEVPF_DESC_SIZE];
  char file_name[TEVPF_FILE_NAME_SIZE];
  std::int32_t counts[] = {0, 0};
  Names* names[] = {nullptr, nullptr};
  Descriptions* descriptions[] = {nullptr, nullptr};
  const TEVPF_STATUS status = TEV8R1_PF_inq_file_elements(
      file_name, &counts[0], &names[0], &descriptions[0], &counts[1], &names[1], &descriptions[1]);
  const Block<Names> owned_names[] = {Block<Names>(names[0]), Block<Names>(names[1])};
  const Block<Descriptions> owned[] = {Block<Descriptions>(descriptions[0]),
                                       Block<Descriptions>(descriptions[1])};
  check(status);
  std::vector<Element> result;
  for (const int kind : {0, 1}) {
    for (std::int32_t i = 0; i < counts[kind]; ++i) {
      result.push_back(
          {kind == 0 ? Kind::list : Kind::table, names[kind][i], descriptions[kind][i]});
    }
  }
  return result;
}

inline std::string description_of(Kind kind, std::string_view name) {
  for (Element& element : elements()) {
    if (element.kind == kind && element.name == name) return std::move(element.description);
  }
  throw Error(PF_NOELEM, kind == Kind::list ? "list" : "table", std::string(name));
}

}  // namespace detail
}  // namespace v1
}  // namespace tevpf
