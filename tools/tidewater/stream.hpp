// The frame of the subcommands that work through files of lines or records: reading, computing and
// writing overlap on all cores, what is written stands in the order of the input, and memory is
// bounded whatever the size.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "buffer.hpp"
#include "tidewater/frame.h"

namespace tidewater::command {

// How many lines became what.
struct Counts {
  std::int64_t done = 0;
  std::int64_t outside = 0;  // beyond grids or areas of use
  std::int64_t refused = 0;
};

// Whole lines (or records, whose quoted fields may hold line ends) of one source.
struct Chunk {
  std::string_view text;
  bool first = false;  // the source begins here
  bool cut = false;    // the last line was longer than any line may be
};

// What becomes of a chunk.
class Result {
 public:
  Buffer out;

  void done() { ++counts_.done; }
  // Tells of a line that could not be done, and counts it.  The number is within the chunk, from 0.
  void complain(std::int64_t line, std::string_view text, std::string_view reason, TWstatus status);
  // How many lines the chunk had.
  void lines(std::int64_t count) { lines_ = count; }

 private:
  friend class Stream;
  struct Complaint {
    std::int64_t line;
    std::string text;
  };
  void clear();

  std::vector<Complaint> complaints_;
  Counts counts_;
  std::int64_t lines_ = 0;
};

// What one thread does.
class Worker {
 public:
  virtual ~Worker() = default;
  virtual void process(const Chunk& chunk, Result& result) = 0;
};

class Job {
 public:
  virtual ~Job() = default;
  // Before anything else is done with a source: its first lines, at least one if it has any.
  // What is given back is written before all else.
  virtual std::string prepare(const std::string& /*source*/, std::string_view /*first*/) {
    return {};
  }
  virtual std::unique_ptr<Worker> worker() const = 0;
  // What stands at the end of all output.
  virtual std::string ending() const { return {}; }
  virtual std::string summary(const Counts& counts) const = 0;
};

// Nothing longer is held; what follows of a longer line is passed over.
inline constexpr std::size_t kLongestLine = 65536;

struct StreamOptions {
  bool records = false;  // quotes may hold line ends
  unsigned threads = 0;  // 0: as many as there are cores
};

// Works through the files ("-", or none at all: standard input) and says on standard error how many
// lines were done and refused.  Gives the exit status.  Throws std::runtime_error where a file
// cannot be read or standard output cannot be written.
int run_stream(Job& job, std::vector<std::string> files, const StreamOptions& options = {});
// The same for a single line.
int run_line(Job& job, const std::string& line);

// Writes to standard output, and throws where that cannot be.
void write_out(std::string_view text);
void flush_out();

}  // namespace tidewater::command
