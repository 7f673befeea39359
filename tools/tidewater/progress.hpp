// A progress bar on a terminal, for long files.
#pragma once

#include <cstdint>

namespace tidewater::command {

class Progress {
 public:
  // A bar for total bytes; none where total is small or unknown, or standard error no terminal.
  explicit Progress(int64_t total);
  ~Progress();
  Progress(const Progress&) = delete;
  Progress& operator=(const Progress&) = delete;

  void show(int64_t done);
  // Takes the bar off the line, before a message is printed.
  void clear();

 private:
  int64_t total_;
  bool active_;
  int shown_ = -1;
};

}  // namespace tidewater::command
