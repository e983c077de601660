// Names that SQL can tell apart. SQLite ignores the case of names, and keeps one name for lists and
// tables together; parameter files do neither.
#pragma once

#include <string>
#include <vector>

#include "tevpf.hpp"

namespace sql {

struct NamedElement {
  tevpf::Element element;
  std::string name;  // in SQL
};

// The elements of a file: tables first, then lists, each in directory order. The first one of a name
// keeps it; the others, and those whose names SQLite reserves, get "table:NAME", "list:NAME",
// "table2:NAME" and so on.
std::vector<NamedElement> named_elements(const tevpf::File& file);

// The same for columns: the first one of a name keeps it, the others get "2:NAME", "3:NAME" ...
std::vector<std::string> column_names(const std::vector<tevpf::Column>& columns);

}  // namespace sql
