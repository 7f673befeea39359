#include "stream.hpp"

#include <fcntl.h>
#include <poll.h>
#include <sched.h>
#include <sys/stat.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <cinttypes>
#include <condition_variable>
#include <cstdio>
#include <cstring>
#include <exception>
#include <mutex>
#include <stdexcept>
#include <thread>

#include "commands.hpp"
#include "progress.hpp"
#include "status_name.hpp"

namespace tidewater::command {

namespace {

constexpr std::size_t kChunk = 256 << 10;

// Reads whole lines of one file or of standard input.
class Source {
 public:
  Source(const std::string& name, bool records)
      : name_(name == "-" ? "standard input" : name), records_(records) {
    if (name == "-") return;
    file_ = open(name.c_str(), O_RDONLY | O_CLOEXEC);
    if (file_ < 0) throw std::runtime_error(name + ": " + std::strerror(errno));
    struct stat about = {};
    if (fstat(file_, &about) == 0 && S_ISREG(about.st_mode)) size_ = about.st_size;
  }
  ~Source() {
    if (file_ != STDIN_FILENO) close(file_);
  }
  Source(const Source&) = delete;
  Source& operator=(const Source&) = delete;

  const std::string& name() const { return name_; }
  std::int64_t size() const { return size_; }

  // The next lines, as many as there are without waiting; false at the end.
  bool next(std::vector<char>& buffer, Chunk& chunk) {
    chunk = {};
    chunk.first = first_;
    if (buffer.size() < kChunk) buffer.resize(kChunk);
    std::size_t filled = carry_.size();
    if (filled > 0) std::memcpy(buffer.data(), carry_.data(), filled);
    carry_.clear();
    std::size_t whole = 0;
    while (!ended_) {
      const std::size_t got = read_some(buffer.data() + filled, buffer.size() - filled);
      if (got == 0) ended_ = true;
      filled += got;
      if (filled == buffer.size() || ended_ || !more_is_there()) {
        whole = end_of_lines(buffer.data(), filled);
        if (whole > 0) break;
        if (filled > kLongestLine) break;
      }
    }
    if (whole == 0) whole = end_of_lines(buffer.data(), filled);
    if (whole == 0 && !ended_) return cut(buffer, chunk);
    if (ended_) {
      whole = filled;
    } else {
      carry_.assign(buffer.data() + whole, buffer.data() + filled);
    }
    return give(buffer, whole, chunk);
  }

 private:
  bool give(const std::vector<char>& buffer, std::size_t size, Chunk& chunk) {
    std::size_t from = 0;
    if (first_ && size >= 3 && std::memcmp(buffer.data(), "\xEF\xBB\xBF", 3) == 0) from = 3;
    first_ = false;
    chunk.text = {buffer.data() + from, size - from};
    return size > 0;
  }

  // A line that is too long is given as far as it may go; the rest is passed over.
  bool cut(std::vector<char>& buffer, Chunk& chunk) {
    if (records_) {
      throw std::runtime_error(name_ + ": a record is longer than " + std::to_string(kChunk >> 10) +
                               " KB; is a quote left open?");
    }
    std::vector<char> rest(kLongestLine);
    bool found = false;
    while (!found) {
      const std::size_t got = read_some(rest.data(), rest.size());
      if (got == 0) {
        ended_ = true;
        break;
      }
      const void* newline = std::memchr(rest.data(), '\n', got);
      if (newline) {
        const auto at = static_cast<std::size_t>(static_cast<const char*>(newline) - rest.data());
        carry_.assign(rest.data() + at + 1, rest.data() + got);
        found = true;
      }
    }
    chunk.cut = true;
    return give(buffer, kLongestLine, chunk);
  }

  std::size_t read_some(char* to, std::size_t size) {
    for (;;) {
      const ssize_t got = read(file_, to, size);
      if (got >= 0) return static_cast<std::size_t>(got);
      if (errno != EINTR) throw std::runtime_error(name_ + ": " + std::strerror(errno));
    }
  }

  bool more_is_there() const {
    if (size_ >= 0) return true;
    pollfd asked = {file_, POLLIN, 0};
    return poll(&asked, 1, 0) > 0;
  }

  // Behind the last line end, or the last one outside of quotes.
  std::size_t end_of_lines(const char* text, std::size_t size) const {
    if (!records_ || !std::memchr(text, '"', size)) {
      for (std::size_t i = size; i > 0; --i) {
        if (text[i - 1] == '\n') return i;
      }
      return 0;
    }
    // A quote opens a field at its beginning only; two of them within stand for one.
    std::size_t end = 0;
    bool quoted = false;
    char before = '\n';
    for (std::size_t i = 0; i < size; ++i) {
      const char c = text[i];
      if (c == '"') {
        quoted = !quoted && std::strchr(",;\t|\n\"", before) != nullptr;
      } else if (c == '\n' && !quoted) {
        end = i + 1;
      }
      before = c;
    }
    return end;
  }

  std::string name_;
  bool records_;
  int file_ = STDIN_FILENO;
  std::int64_t size_ = -1;
  bool first_ = true;
  bool ended_ = false;
  std::vector<char> carry_;
};

}  // namespace

void Result::clear() {
  out.clear();
  complaints_.clear();
  counts_ = {};
  lines_ = 0;
}

void Result::complain(std::int64_t line, std::string_view text, std::string_view reason,
                      TWstatus status) {
  constexpr std::size_t kShown = 120;
  std::string shown(text.substr(0, kShown));
  for (char& c : shown) {
    if (static_cast<unsigned char>(c) < ' ' || c == 127) c = '?';
  }
  std::string words = "\"" + shown + (text.size() > kShown ? "..." : "") + "\": ";
  words += reason.empty() ? std::string_view(status_meaning(status)) : reason;
  words += std::string(" (") + status_name(status) + ")\n";
  complaints_.push_back({line, std::move(words)});
  ++(is_outside(status) ? counts_.outside : counts_.refused);
}

// Threads take chunks in turn, and write in the same turn.
class Stream {
 public:
  Stream(Job& job, std::vector<std::string> files, const StreamOptions& options)
      : job_(job), files_(std::move(files)), options_(options) {
    if (files_.empty()) files_.emplace_back("-");
  }

  int run() {
    unsigned count = options_.threads;
    if (count == 0) count = std::max(1U, std::thread::hardware_concurrency());
    cpu_set_size(count);
    std::vector<std::thread> others;
    for (unsigned i = 1; i < count; ++i) others.emplace_back([this] { work(); });
    work();
    for (std::thread& thread : others) thread.join();
    if (error_) std::rethrow_exception(error_);
    return finish(job_, counts_, progress_.get());
  }

  static int run_one(Job& job, const std::string& line) {
    write_out(job.prepare("command line", line));
    Result result;
    Chunk chunk;
    chunk.text = line;
    chunk.first = true;
    job.worker()->process(chunk, result);
    tell(result, "command line", 1, nullptr);
    write_out(result.out.text());
    return finish(job, result.counts_, nullptr);
  }

 private:
  // No more threads than the process may run on.
  static void cpu_set_size(unsigned& count) {
#ifdef __linux__
    cpu_set_t set;
    if (sched_getaffinity(0, sizeof set, &set) == 0) {
      count = std::min(count, static_cast<unsigned>(std::max(1, CPU_COUNT(&set))));
    }
#endif
  }

  struct Taken {
    std::uint64_t ticket = 0;
    Chunk chunk;
    std::shared_ptr<Source> source;
    std::string head;
    std::exception_ptr error;
  };

  // The next chunk of any source; false behind the last.
  bool take(std::vector<char>& buffer, Taken& taken) {
    const std::lock_guard lock(input_);
    if (no_more_) return false;
    taken.head.clear();
    taken.error = nullptr;
    taken.ticket = tickets_;
    try {
      for (;;) {
        if (!source_) {
          if (next_file_ == files_.size()) {
            no_more_ = true;
            return false;
          }
          source_ = std::make_shared<Source>(files_[next_file_++], options_.records);
        }
        if (source_->next(buffer, taken.chunk)) break;
        source_.reset();
      }
      taken.source = source_;
      if (taken.chunk.first) taken.head = job_.prepare(source_->name(), taken.chunk.text);
    } catch (...) {
      taken.error = std::current_exception();
      no_more_ = true;
    }
    ++tickets_;
    return true;
  }

  void work() {
    std::vector<char> buffer;
    Result result;
    std::unique_ptr<Worker> worker;
    Taken taken;
    while (take(buffer, taken)) {
      result.clear();
      if (!taken.error) {
        try {
          if (!worker) worker = job_.worker();
          worker->process(taken.chunk, result);
        } catch (...) {
          taken.error = std::current_exception();
        }
      }
      {
        std::unique_lock lock(output_);
        turned_.wait(lock, [&] { return turn_ == taken.ticket || stopped_; });
        if (stopped_) return;
      }
      if (!taken.error) {
        try {
          put(taken, result);
        } catch (...) {
          taken.error = std::current_exception();
        }
      }
      const std::lock_guard lock(output_);
      if (taken.error) {
        error_ = taken.error;
        stopped_ = true;
        no_more_ = true;
      }
      ++turn_;
      turned_.notify_all();
      if (stopped_) return;
    }
  }

  // One thread at a time is here: the one whose turn it is.
  void put(const Taken& taken, const Result& result) {
    if (written_ != taken.source) {
      written_ = taken.source;
      line_ = 1;
      bytes_ = 0;
      progress_ = std::make_unique<Progress>(taken.source->size());
    }
    if (!taken.head.empty()) write_out(taken.head);
    tell(result, taken.source->name(), line_, progress_.get());
    write_out(result.out.text());
    line_ += result.lines_;
    bytes_ += static_cast<std::int64_t>(taken.chunk.text.size());
    counts_.done += result.counts_.done;
    counts_.outside += result.counts_.outside;
    counts_.refused += result.counts_.refused;
    progress_->show(bytes_);
    // Somebody may be waiting for the answer.
    if (taken.source->size() < 0) flush_out();
  }

  static void tell(const Result& result, const std::string& source, std::int64_t base,
                   Progress* progress) {
    if (progress && !result.complaints_.empty()) progress->clear();
    for (const Result::Complaint& complaint : result.complaints_) {
      std::fprintf(stderr, "%s:%" PRId64 ": %s", source.c_str(), base + complaint.line,
                   complaint.text.c_str());
    }
  }

  static int finish(const Job& job, const Counts& counts, Progress* progress) {
    write_out(job.ending());
    flush_out();
    if (progress) progress->clear();
    std::fprintf(stderr, "%s\n", job.summary(counts).c_str());
    return counts.outside + counts.refused > 0 ? kSomeRefused : 0;
  }

  Job& job_;
  std::vector<std::string> files_;
  StreamOptions options_;

  std::mutex input_;
  std::size_t next_file_ = 0;
  std::shared_ptr<Source> source_;
  std::uint64_t tickets_ = 0;
  std::atomic<bool> no_more_ = false;

  std::mutex output_;
  std::condition_variable turned_;
  std::uint64_t turn_ = 0;
  bool stopped_ = false;
  std::exception_ptr error_;

  std::shared_ptr<Source> written_;
  std::int64_t line_ = 1;
  std::int64_t bytes_ = 0;
  std::unique_ptr<Progress> progress_;
  Counts counts_;
};

int run_stream(Job& job, std::vector<std::string> files, const StreamOptions& options) {
  return Stream(job, std::move(files), options).run();
}

int run_line(Job& job, const std::string& line) { return Stream::run_one(job, line); }

void write_out(std::string_view text) {
  if (text.empty()) return;  // of no place either
  if (std::fwrite(text.data(), 1, text.size(), stdout) != text.size()) {
    throw std::runtime_error("standard output cannot be written");
  }
}

void flush_out() {
  if (std::fflush(stdout) != 0) throw std::runtime_error("standard output cannot be written");
}

}  // namespace tidewater::command
