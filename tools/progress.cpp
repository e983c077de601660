#include "progress.h"

#include <algorithm>
#include <cstdio>

#include "platform.h"
#include "text.h"

namespace tool {
namespace {

constexpr auto kInterval = std::chrono::milliseconds(200);

std::string duration_text(double seconds) {
  const auto whole = static_cast<std::uint64_t>(std::max(seconds, 0.0) + 0.5);
  if (whole < 60) return std::to_string(whole) + " s";
  return std::to_string(whole / 60) + " min " + std::to_string(whole % 60) + " s";
}

}  // namespace

bool Progress::is_due() {
  const Clock::time_point now = Clock::now();
  if (now < next_) return false;
  next_ = now + kInterval;
  return is_terminal(stderr);
}

void Progress::show(std::uint64_t count, double share) {
  std::string line = counted(count, noun_);
  if (share > 0) {
    const double passed = std::chrono::duration<double>(Clock::now() - start_).count();
    share = std::min(share, 1.0);
    line += ", " + std::to_string(static_cast<int>(100 * share)) + " %, " +
            duration_text(passed * (1 - share) / share) + " left";
  }
  // To the start of the line, and away with what is left of a longer one.
  std::fprintf(stderr, "\r%s\033[K", line.c_str());
  is_shown_ = true;
}

void Progress::clear() {
  if (is_shown_) std::fputs("\r\033[K", stderr);
  is_shown_ = false;
}

}  // namespace tool
