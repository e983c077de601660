// What the command line names, found in FILE, or a Failure that says what there is.
#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "tevpf.hpp"

namespace tool {

using Kind = std::optional<tevpf::Kind>;  // none: either of them

tevpf::Element find_element(const tevpf::File& file, const std::string& name, Kind kind);

tevpf::Parameter find_parameter(const tevpf::File& file, const std::string& list,
                                const std::string& name);

// The columns of a table, in their order.
class Columns {
 public:
  Columns(const tevpf::File& file, const tevpf::Table& table);

  std::size_t size() const { return all_.size(); }
  const tevpf::Column& operator[](std::size_t position) const { return all_[position]; }
  bool has(const std::string& name) const;
  std::size_t position_of(const std::string& name) const;

 private:
  std::string table_;  // as messages name it
  std::vector<tevpf::Column> all_;
};

// Refuses a name that nothing can have; `what`: "the new name".
void check_new_name(const std::string& name, const std::string& what);

}  // namespace tool
