#include "core/io/environment.h"

#include <cstdlib>

#ifdef _WIN32
#include <windows.h>

#include "core/io/wide_name.h"
#endif

namespace tevpf {

#ifdef _WIN32

const char* environment_variable(const char* name, EnvironmentText& buffer) noexcept {
  constexpr int kToTheTerminator = -1;
  const WideName wide(name);
  const wchar_t* const value = wide.get() != nullptr ? _wgetenv(wide.get()) : nullptr;
  if (value == nullptr) return nullptr;
  const int size = WideCharToMultiByte(CP_UTF8, 0, value, kToTheTerminator, buffer.text,
                                       sizeof buffer.text, nullptr, nullptr);
  return size > 0 ? buffer.text : nullptr;
}

#else

const char* environment_variable(const char* name, EnvironmentText&) noexcept {
  return std::getenv(name);
}

#endif

}  // namespace tevpf
