// What SQL cannot do: one sentence, and the result code that SQLite hands on.
#pragma once

#include <stdexcept>
#include <string>

#include "sqlite.h"
#include "tevpf.hpp"

namespace sql {

class Refusal : public std::runtime_error {
 public:
  Refusal(int code, const std::string& sentence) : std::runtime_error(sentence), code_(code) {}
  int code() const noexcept { return code_; }

 private:
  int code_;
};

// The result code for a refusal of the library.
inline int code_of(const tevpf::Error& error) noexcept {
  switch (error.status()) {
    case PF_RANGE:
    case PF_DUPLICATE:
    case PF_BADTYPE:
    case PF_BADARG:
    case PF_BADNAME:
    case PF_BADPREC:
    case PF_BADRANGE:
      return SQLITE_CONSTRAINT;
    case PF_NOPRIV:
      return SQLITE_READONLY;
    case PF_OPENFAIL:
      return SQLITE_CANTOPEN;
    default:
      return SQLITE_ERROR;
  }
}

}  // namespace sql
