// Names on the command line, and names made to fit.
#pragma once

#include <functional>
#include <string>
#include <vector>

namespace tool {

// The values of an option that may be given several times, each one name or several with commas
// between them.
std::vector<std::string> split_at_commas(const std::vector<std::string>& values);

// The same where names themselves may have commas: a value that is a name stays whole.
std::vector<std::string> split_names(const std::vector<std::string>& values,
                                     const std::function<bool(const std::string&)>& is_name);

// Cuts names to what a name may have, never inside a character of UTF-8, and numbers those that are
// not the only ones of their kind ("flow", "flow_2"); empty ones become "column" and their number.
void shorten_names(std::vector<std::string>& names);

}  // namespace tool
