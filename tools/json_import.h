// Elements from JSON as export writes it.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

#include "conflict.h"
#include "tevpf.hpp"

namespace tool {

struct JsonText {
  std::string_view text, name;  // the name is for messages
};

// Adds the elements of a whole file's JSON, or the one of an element's, and returns their number. A
// Failure says where the text is wrong; the file in memory then holds a part and must not be saved.
std::size_t import_json(tevpf::File& file, const JsonText& json, Conflict conflict);

}  // namespace tool
