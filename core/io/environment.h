// Environment variables.
#pragma once

namespace tevpf {

struct EnvironmentText {
  char text[4096];
};

// The value of a variable, in UTF-8 on Windows; null if it is not defined. The value may lie in
// `buffer`.
[[nodiscard]] const char* environment_variable(const char* name, EnvironmentText& buffer) noexcept;

}  // namespace tevpf
