// Drives whatever a parameter file holds through every reading, reporting and changing operation:
// the library must take it for lists and tables like any other. What is broken is thrown.
#pragma once

#include <cstdint>
#include <stdexcept>
#include <string>
#include <string_view>

// The bytes that choose the changes; behind the last one all choices are 0.
struct Choices {
  std::uint8_t next();
  std::string_view bytes;
};

inline void require(bool truth, const char* what) {
  if (!truth) throw std::logic_error(what);
}

// The current file, saved under another name in the folder, is read back whole and saved to the same
// bytes. False when it cannot be saved: an unknown type was loaded half-way.
bool save_and_compare(const std::string& folder);

// Reports, saves, opens and compares what the current file holds, before and after the changes.
void drive_current_file(const std::string& folder, Choices choose);
