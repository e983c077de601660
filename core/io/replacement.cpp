#include "core/io/replacement.h"

namespace tevpf {

Replacement::~Replacement() { discard(); }

std::FILE* Replacement::release_stream() noexcept {
  std::FILE* stream = stream_;
  stream_ = nullptr;
  return stream;
}

}  // namespace tevpf
