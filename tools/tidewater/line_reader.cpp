#include "line_reader.hpp"

#include <sys/stat.h>

#include <cerrno>
#include <cstring>
#include <stdexcept>

namespace tidewater::command {

LineReader::LineReader(const std::string& name)
    : name_(name == "-" ? "standard input" : name),
      file_(name == "-" ? stdin : std::fopen(name.c_str(), "rb")),
      buffer_(1 << 16) {
  if (!file_) throw std::runtime_error(name + ": " + std::strerror(errno));
  struct stat about = {};
  if (fstat(fileno(file_), &about) == 0 && S_ISREG(about.st_mode)) size_ = about.st_size;
}

LineReader::~LineReader() {
  if (file_ != stdin) std::fclose(file_);
}

bool LineReader::next(std::string& line) {
  line.clear();
  too_long_ = false;
  bool any = false;
  for (;;) {
    if (at_ == end_) {
      end_ = std::fread(buffer_.data(), 1, buffer_.size(), file_);
      at_ = 0;
      bytes_read_ += static_cast<int64_t>(end_);
      if (end_ == 0) {
        if (std::ferror(file_)) throw std::runtime_error(name_ + ": " + std::strerror(errno));
        break;
      }
    }
    any = true;
    const char* from = buffer_.data() + at_;
    const char* newline = static_cast<const char*>(std::memchr(from, '\n', end_ - at_));
    const std::size_t length = newline ? static_cast<std::size_t>(newline - from) : end_ - at_;
    const std::size_t room = kLongestLine - line.size();
    line.append(from, std::min(length, room));
    too_long_ = too_long_ || length > room;
    at_ += length + (newline ? 1 : 0);
    if (newline) break;
  }
  if (!any) return false;
  ++number_;
  if (!line.empty() && line.back() == '\r') line.pop_back();
  return true;
}

}  // namespace tidewater::command
