// Comma-separated files: the sources of a store.
#pragma once

#include <filesystem>
#include <stdexcept>
#include <string>
#include <vector>

namespace tabdll {

// An error in a source file, with its place: "zones.csv:12: column zone_name: ...".
class SourceError : public std::runtime_error {
 public:
  explicit SourceError(const std::string& what) : std::runtime_error(what) {}
  SourceError(const std::filesystem::path& file, int line, const std::string& what)
      : std::runtime_error(file.string() + ":" + std::to_string(line) + ": " + what) {}
};

struct CsvRecord {
  int line;  // where it begins, from 1
  std::vector<std::string> cells;
};

struct CsvFile {
  std::filesystem::path path;
  CsvRecord header;
  std::vector<CsvRecord> records;

  // The place of a column in the records; a file without it is an error.
  std::size_t column(const std::string& name) const;
};

// Reads a file whose first record names the columns.  Lines that begin with # and empty lines are
// passed over; cells may be quoted, with "" for a quote.  Every record has as many cells as the
// header.
CsvFile read_csv(const std::filesystem::path& path);

// A cell as it is written in such a file.
std::string csv_cell(const std::string& text);

}  // namespace tabdll
