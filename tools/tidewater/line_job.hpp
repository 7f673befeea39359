// The frame of the subcommands that work line by line: reading in batches, passing through,
// complaining, counting.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "tidewater/frame.h"

namespace tidewater::command {

class Progress;

// One line of input and what becomes of it.
struct Line {
  std::string text;
  std::size_t rest = 0;  // where what follows the fields begins
  bool is_data = false;  // neither blank nor a comment
  int64_t number = 0;
  TWstatus status = TW_SUCCESS;  // TW_BAD_TEXT from the start for a line that was cut
  const char* reason = nullptr;  // beside the status, where it says more

  void refuse(TWstatus why, const char* words) {
    status = why;
    reason = words;
  }
};

class LineJob {
 public:
  virtual ~LineJob() = default;

  // Works through the files ("-", or none at all: standard input), and says on standard error how
  // many lines were done and refused.  Gives the exit status.  Throws std::runtime_error where a
  // file cannot be read or standard output cannot be written.
  int run(std::vector<std::string> files);
  // The same for a single line, the fields of which are arguments of the command.
  int run_arguments(const std::vector<std::string>& arguments);

 protected:
  static constexpr std::size_t kBatch = 4096;

  struct Counts {
    int64_t done = 0;
    int64_t outside = 0;
    int64_t refused = 0;
  };

  // Each line in turn, also those that are no data.
  virtual void take(Line line) = 0;
  // After kBatch lines, and at the end of a file.
  virtual void end_batch() {}
  // After the last file.
  virtual void end() {}
  virtual std::string summary(const Counts& counts) const = 0;

  void write(std::string_view text);
  void count_done() { ++counts_.done; }
  // Tells a line that could not be done, and counts it.
  void complain(const Line& line);

 private:
  int finish();

  const std::string* source_ = nullptr;
  Progress* progress_ = nullptr;
  Counts counts_;
};

}  // namespace tidewater::command
