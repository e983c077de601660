// What a command had to make first, and says so.
#pragma once

#include "commands.h"

namespace tool {

struct Made {
  bool file = false, element = false;
};

// "made engine.pf with list 'Engine'"; nothing when everything was there.
void report_made(const Arguments& arguments, const Made& made, const char* kind);

}  // namespace tool
