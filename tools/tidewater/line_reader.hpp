// Lines of files and standard input, in bounded memory.
#pragma once

#include <cstdint>
#include <cstdio>
#include <string>
#include <vector>

namespace tidewater::command {

class LineReader {
 public:
  // Nothing longer is held; what follows of a longer line is passed over.
  static constexpr std::size_t kLongestLine = 65536;

  // Opens a file, or standard input for "-".  Throws std::runtime_error.
  explicit LineReader(const std::string& name);
  ~LineReader();
  LineReader(const LineReader&) = delete;
  LineReader& operator=(const LineReader&) = delete;

  // The next line without its newline (and carriage return); false at the end.  Throws
  // std::runtime_error when reading fails.
  bool next(std::string& line);

  bool too_long() const { return too_long_; }  // the line last read was cut
  int64_t number() const { return number_; }   // of the line last read, from 1
  const std::string& name() const { return name_; }
  int64_t bytes_read() const { return bytes_read_; }
  int64_t size() const { return size_; }  // of the file; -1 where it cannot be told

 private:
  std::string name_;
  std::FILE* file_;
  std::vector<char> buffer_;
  std::size_t at_ = 0;
  std::size_t end_ = 0;
  bool too_long_ = false;
  int64_t number_ = 0;
  int64_t bytes_read_ = 0;
  int64_t size_ = -1;
};

}  // namespace tidewater::command
