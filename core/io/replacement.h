// Saves a file so that the file on disk is always either the old one or the new one: the new image
// is written next to the file, flushed to disk, and then renamed over it in one step.
//
// Not every file can be replaced: the folder must be writable, and the file must be writable and
// regular, have a single hard link, and have an owner and mode that the image can take over; on
// Windows, no other program may have it open. Otherwise the caller writes the file plainly.
#pragma once

#include <cstdio>

namespace tevpf {

class Replacement {
 public:
  // Starts an image of the existing file of that name, following symbolic links.
  explicit Replacement(const char* name) noexcept;
  ~Replacement();  // an image that was not put in place is deleted
  Replacement(const Replacement&) = delete;
  Replacement& operator=(const Replacement&) = delete;

  [[nodiscard]] bool is_possible() const noexcept { return stream_ != nullptr; }
  // The image could not be created, and the file has content that a plain write could lose.
  [[nodiscard]] bool has_failed() const noexcept { return failed_; }
  [[nodiscard]] std::FILE* stream() const noexcept { return stream_; }  // open for writing

  enum class Outcome {
    kDone,
    kNotFlushed,   // in place, but flushing the folder failed: a power failure may undo it
    kNotPossible,  // the system does not allow it: write plainly
    kFailed,       // the image did not reach the disk; the file is as it was
  };
  // Completes the image; the caller has flushed its stream. `old` is the caller's stream of the file
  // that is replaced, or null. Windows replaces no open file: there, it is closed and set to null, or
  // to a new stream of the file when that is as it was.
  [[nodiscard]] Outcome put_in_place(std::FILE*& old) noexcept;

  // Transfers ownership of the stream, which refers to the new file once it is in place. Null if it
  // could not be opened again, which Windows requires.
  [[nodiscard]] std::FILE* release_stream() noexcept;

 private:
  void discard() noexcept;

#ifdef _WIN32
  using Letter = wchar_t;
#else
  using Letter = char;
#endif
  static constexpr int kPathSize = 4096;
  Letter target_[kPathSize];  // the file, symbolic links resolved
  Letter image_[kPathSize];   // the new image; empty if there is none to delete
  std::FILE* stream_ = nullptr;
  bool failed_ = false;
};

}  // namespace tevpf
