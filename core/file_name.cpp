#include "core/file_name.h"

#include <cstring>

#include "core/base/heap.h"
#include "core/base/status.h"
#include "core/io/environment.h"

namespace tevpf {

namespace {

// Joins the two halves of a name.
TEVPF_STATUS join(const char* lead, const char* rest, FileName& out) noexcept {
  const std::size_t lead_length = std::strlen(lead);
  const std::size_t rest_length = std::strlen(rest);
  if (lead_length + rest_length >= sizeof out.text) return fail(PF_OPENFAIL, {lead, rest});
  std::memcpy(out.text, lead, lead_length);
  std::memcpy(out.text + lead_length, rest, rest_length + 1);
  return PF_NORMAL;
}

}  // namespace

TEVPF_STATUS translate_file_name(const char* name, FileName& out) noexcept {
  if (name[0] != '$') return join(name, "", out);
  const std::size_t length = std::strcspn(name, "/");
  Owned<char> variable(heap_copy(name));
  if (!variable) return fail_empty(PF_NOMEM);
  variable[length] = '\0';
  EnvironmentText buffer;
  const char* value = environment_variable(variable.get(), buffer);
  if (value == nullptr) return fail_item(PF_OPENFAIL, name);
  return join(value, name + length, out);
}

}  // namespace tevpf
