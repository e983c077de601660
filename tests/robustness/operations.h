// Every exported operation as a row of one table, and the elements that the rows work on: what must hold
// for all of them is then one loop.
#pragma once

#include <cstdint>
#include <functional>
#include <string_view>
#include <vector>

#include "support/temp_file.h"

using Numbers = const std::int32_t*;

// What a failure may do beyond the rule that it does nothing.
enum Leeway {
  kNone,
  kPartStays,    // as its description says: an element, a file, a setting, defaults
  kNoStatus,     // the result is a number or a comparison
  kNumbersOnly,  // several operations in one row
};

struct Call {
  const char* operation;              // without the common prefix
  std::vector<std::int32_t> numbers;  // its integer arguments, those in definitions included
  std::function<std::uint32_t(Numbers)> run;
  Leeway leeway = kNone;
  std::string_view arguments{};  // as they are written; none of rows with a body of their own
};

// One row or more for each operation, on what make_elements makes in the current file, "file" in the
// folder; "other" is such a file as well, "new" is none.
std::vector<Call> all_calls(const TempDir& dir);

// A list and a table of every value type without spare slots, their cursors and defaults set; an empty
// table; and so many more lists, all empty, that names of elements are hashed.
void make_elements();
