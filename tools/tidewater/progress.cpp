#include "progress.hpp"

#include <unistd.h>

#include <cstdio>
#include <string>

namespace tidewater::command {

namespace {

constexpr int64_t kSmall = 4 << 20;
constexpr int kWidth = 50;

}  // namespace

Progress::Progress(int64_t total)
    : total_(total), active_(total >= kSmall && isatty(STDERR_FILENO)) {}

Progress::~Progress() { clear(); }

void Progress::show(int64_t done) {
  if (!active_) return;
  const int percent =
      static_cast<int>(100.0 * static_cast<double>(done) / static_cast<double>(total_));
  if (percent == shown_) return;
  shown_ = percent;
  const int filled = percent * kWidth / 100;
  std::fprintf(stderr, "\r[%s%s] %3d %%",
               std::string(static_cast<std::size_t>(filled), '#').c_str(),
               std::string(static_cast<std::size_t>(kWidth - filled), ' ').c_str(), percent);
}

void Progress::clear() {
  if (shown_ < 0) return;
  std::fprintf(stderr, "\r%*s\r", kWidth + 10, "");
  shown_ = -1;
}

}  // namespace tidewater::command
