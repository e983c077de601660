#include "core/io/stream_size.h"

#include <sys/stat.h>
#include <sys/types.h>

#ifdef _WIN32
#include <io.h>
#endif

namespace tevpf {

std::int64_t stream_bytes_left(std::FILE* stream) noexcept {
#ifdef _WIN32
  struct _stat64 facts;
  if (_fstat64(_fileno(stream), &facts) != 0 || (facts.st_mode & _S_IFMT) != _S_IFREG) return -1;
  const std::int64_t place = _ftelli64(stream);
#else
  struct stat facts;
  if (fstat(fileno(stream), &facts) != 0 || !S_ISREG(facts.st_mode)) return -1;
  const std::int64_t place = ftello(stream);
#endif
  if (place < 0) return -1;
  return facts.st_size > place ? facts.st_size - place : 0;
}

}  // namespace tevpf
