#include "line_job.hpp"

#include <cstdio>
#include <stdexcept>

#include "commands.hpp"
#include "line_reader.hpp"
#include "progress.hpp"
#include "status_name.hpp"

namespace tidewater::command {

namespace {

bool is_outside(const Line& line) {
  return line.status == TW_I_OUTSIDE_NADCON || line.status == TW_I_OUTSIDE_GEOID ||
         (line.status == TW_I_OUTSIDE_CNT && !line.reason);
}

Line make_line(const std::string& text, int64_t number, bool is_cut) {
  Line line;
  line.text = text;
  line.number = number;
  const std::size_t first = text.find_first_not_of(" \t");
  line.is_data = first != std::string::npos && text[first] != '#';
  if (is_cut) line.status = TW_BAD_TEXT;
  return line;
}

}  // namespace

int LineJob::run(std::vector<std::string> files) {
  if (files.empty()) files.emplace_back("-");
  for (const std::string& file : files) {
    LineReader reader(file);
    Progress progress(reader.size());
    source_ = &reader.name();
    progress_ = &progress;
    std::size_t in_batch = 0;
    std::string text;
    while (reader.next(text)) {
      take(make_line(text, reader.number(), reader.too_long()));
      if (++in_batch == kBatch) {
        end_batch();
        in_batch = 0;
        progress.show(reader.bytes_read());
      }
    }
    end_batch();
  }
  return finish();
}

int LineJob::run_arguments(const std::vector<std::string>& arguments) {
  const std::string source = "command line";
  Progress none(0);
  source_ = &source;
  progress_ = &none;
  std::string text;
  for (const std::string& argument : arguments) text += (text.empty() ? "" : " ") + argument;
  take(make_line(text, 1, false));
  end_batch();
  return finish();
}

int LineJob::finish() {
  end();
  if (std::fflush(stdout) != 0) throw std::runtime_error("standard output cannot be written");
  std::fprintf(stderr, "%s\n", summary(counts_).c_str());
  return counts_.outside + counts_.refused > 0 ? kSomeRefused : 0;
}

void LineJob::write(std::string_view text) {
  if (std::fwrite(text.data(), 1, text.size(), stdout) != text.size()) {
    throw std::runtime_error("standard output cannot be written");
  }
}

void LineJob::complain(const Line& line) {
  constexpr std::size_t kShown = 120;
  std::string shown = line.text.substr(0, kShown);
  for (char& c : shown) {
    if (static_cast<unsigned char>(c) < ' ' || c == 127) c = '?';
  }
  progress_->clear();
  std::fprintf(stderr, "%s:%lld: \"%s%s\": %s (%s)\n", source_->c_str(),
               static_cast<long long>(line.number), shown.c_str(),
               line.text.size() > kShown ? "..." : "",
               line.reason ? line.reason : status_meaning(line.status), status_name(line.status));
  ++(is_outside(line) ? counts_.outside : counts_.refused);
}

}  // namespace tidewater::command
