// Saving without a moment in which the file on the disk is neither the old one nor the new one: the
// new image is written beside the file, flushed to the disk, and then put in its place in one step.
//
// Not every file can be replaced so: the folder must be writable, the file a regular one of a
// single name whose owner and mode the image can take over. A file that may not be written is not
// replaced either. Then the caller writes it plainly. On Windows, where an open file cannot be
// replaced, that is always so.
#pragma once

#include <cstdio>

namespace tevpf {

class Replacement {
 public:
  // Starts an image of the existing file of that name, behind symbolic links where it is one.
  explicit Replacement(const char* name) noexcept;
  ~Replacement();  // an image that was not put in place is deleted
  Replacement(const Replacement&) = delete;
  Replacement& operator=(const Replacement&) = delete;

  [[nodiscard]] bool is_possible() const noexcept { return stream_ != nullptr; }
  // There was no room for an image, and the file holds something that a plain write could lose.
  [[nodiscard]] bool has_failed() const noexcept { return failed_; }
  [[nodiscard]] std::FILE* stream() const noexcept { return stream_; }  // open for writing

  enum class Outcome {
    kDone,
    kNotFlushed,   // in place, but the system failed to flush the folder: a power cut may undo it
    kNotPossible,  // the system does not allow it: write plainly
    kFailed,       // the image did not reach the disk; the file is as it was
  };
  // Ends the image, whose stream the caller has flushed.
  [[nodiscard]] Outcome put_in_place() noexcept;

  // Hands the stream over, which stands for the new file once it is in place.
  [[nodiscard]] std::FILE* release_stream() noexcept;

 private:
#ifndef _WIN32
  void discard() noexcept;

  static constexpr int kPathSize = 4096;
  char target_[kPathSize];  // the file, behind symbolic links
  char image_[kPathSize];   // the new image; empty when there is none to be deleted
#endif
  std::FILE* stream_ = nullptr;
  bool failed_ = false;
};

}  // namespace tevpf
