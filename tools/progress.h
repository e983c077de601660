// How far a command is: on a terminal, once it has taken a second; nowhere else.
#pragma once

#include <chrono>
#include <cstdint>
#include <string>

namespace tool {

class Progress {
 public:
  explicit Progress(const char* noun) : noun_(noun) {}  // of what is counted: "row"
  Progress(const Progress&) = delete;
  Progress& operator=(const Progress&) = delete;
  ~Progress() { clear(); }

  // Called often; looks at the clock now and then. `share` of the whole, 0 to 1; 0: not known.
  template <class Share>
  void step(std::uint64_t count, Share share) {
    if ((++steps_ & kStepsBetween) == 0 && is_due()) show(count, share());
  }

  void clear();  // the line disappears

 private:
  using Clock = std::chrono::steady_clock;
  static constexpr std::uint64_t kStepsBetween = 1023;

  bool is_due();
  void show(std::uint64_t count, double share);

  const char* noun_;
  std::uint64_t steps_ = 0;
  Clock::time_point start_ = Clock::now(), next_ = start_ + std::chrono::seconds(1);
  bool is_shown_ = false;
};

}  // namespace tool
