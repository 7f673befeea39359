#include "csv.hpp"

#include <algorithm>
#include <fstream>
#include <iterator>

namespace tabdll {

namespace {

class Reader {
 public:
  Reader(const std::filesystem::path& path, std::string text)
      : path_(path), text_(std::move(text)) {}

  // The next record; false at the end of the file.
  bool next(CsvRecord& record) {
    while (at_ < text_.size() && (text_[at_] == '#' || text_[at_] == '\n' || text_[at_] == '\r')) {
      skip_line();
    }
    if (at_ >= text_.size()) return false;
    record = {line_, {cell()}};
    while (at_ < text_.size() && text_[at_] == ',') {
      ++at_;
      record.cells.push_back(cell());
    }
    skip_line();
    return true;
  }

 private:
  void skip_line() {
    while (at_ < text_.size() && text_[at_] != '\n') ++at_;
    if (at_ < text_.size()) ++at_;
    ++line_;
  }

  bool ends_cell() const {
    return at_ >= text_.size() || text_[at_] == ',' || text_[at_] == '\n' ||
           text_.compare(at_, 2, "\r\n") == 0;
  }

  std::string cell() {
    if (at_ < text_.size() && text_[at_] == '"') return quoted_cell();
    const std::size_t start = at_;
    while (!ends_cell()) ++at_;
    return text_.substr(start, at_ - start);
  }

  std::string quoted_cell() {
    const int start = line_;
    std::string out;
    for (++at_; at_ < text_.size(); ++at_) {
      if (text_[at_] == '"') {
        if (text_.compare(at_, 2, "\"\"") != 0) break;
        ++at_;
      }
      if (text_[at_] == '\n') ++line_;
      out += text_[at_];
    }
    if (at_ >= text_.size()) throw SourceError(path_, start, "a quote is not closed");
    ++at_;
    if (!ends_cell()) throw SourceError(path_, line_, "text after a closing quote");
    return out;
  }

  const std::filesystem::path& path_;
  std::string text_;
  std::size_t at_ = 0;
  int line_ = 1;
};

}  // namespace

std::size_t CsvFile::column(const std::string& name) const {
  const auto found = std::find(header.cells.begin(), header.cells.end(), name);
  if (found == header.cells.end()) {
    throw SourceError(path, header.line, "no column \"" + name + "\"");
  }
  return static_cast<std::size_t>(found - header.cells.begin());
}

CsvFile read_csv(const std::filesystem::path& path) {
  // Neither a device without an end nor a pipe that nobody writes.
  std::error_code ignored;
  std::ifstream in;
  if (std::filesystem::is_regular_file(path, ignored)) in.open(path, std::ios::binary);
  if (!in.is_open()) throw SourceError(path.string() + ": cannot be opened");
  // By read(), which tells of a failing disk by the stream's state.
  std::string text;
  char block[1 << 14];
  while (in.read(block, sizeof block) || in.gcount() > 0) {
    text.append(block, static_cast<std::size_t>(in.gcount()));
  }
  if (in.bad()) throw SourceError(path.string() + ": cannot be read");
  Reader reader(path, std::move(text));
  CsvFile file{path, {}, {}};
  if (!reader.next(file.header)) throw SourceError(path, 1, "no header");
  for (CsvRecord record; reader.next(record);) {
    if (record.cells.size() != file.header.cells.size()) {
      throw SourceError(path, record.line,
                        std::to_string(record.cells.size()) + " cells, the header has " +
                            std::to_string(file.header.cells.size()));
    }
    file.records.push_back(std::move(record));
  }
  return file;
}

std::string csv_cell(const std::string& text) {
  if (text.find_first_of(",\"\r\n") == std::string::npos && !text.starts_with('#')) return text;
  std::string out = "\"";
  for (const char c : text) {
    if (c == '"') out += '"';
    out += c;
  }
  return out + '"';
}

}  // namespace tabdll
