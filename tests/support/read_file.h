// The bytes of a file, read at once: tests compare files after every step.
#pragma once

#include <fstream>
#include <sstream>
#include <string>
#include <utility>

inline std::string read_file(const std::string& path,
                             std::ios::openmode mode = std::ios::in | std::ios::binary) {
  std::ostringstream bytes;
  if (std::ifstream in(path, mode); in && in.peek() != EOF) bytes << in.rdbuf();
  return std::move(bytes).str();
}
