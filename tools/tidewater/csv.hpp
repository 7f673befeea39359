// Tables with a line of names: fields parted by commas or what the table uses, quoted where they
// must be (RFC 4180).
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "buffer.hpp"

namespace tidewater::command {

// The fields of a record as they stand in the text, with their quotes.
class Record {
 public:
  // Takes the next record off the front of text; false where there is none.
  bool take(std::string_view& text, char separator);

  std::size_t size() const { return fields_.size(); }
  std::string_view field(std::size_t i) const { return fields_[i]; }
  // Without its quotes.
  std::string value(std::size_t i) const;
  std::string_view whole() const { return whole_; }  // without the line end
  std::string_view line_end() const { return line_end_; }
  std::int64_t lines() const { return lines_; }  // of text, more than one with line ends in quotes

 private:
  std::vector<std::string_view> fields_;
  std::string_view whole_, line_end_;
  std::int64_t lines_ = 1;
};

// The names of a table and where it keeps what.
struct Table {
  char separator = ',';
  std::vector<std::string> names;

  // The separator is found where none is given: the one of , ; tab | that the line has most often.
  Table(std::string_view first_line, char given_separator);
  // The column of a name, without regard to case.  Throws std::invalid_argument that says which
  // there are.
  std::size_t column(const std::string& name) const;
  // The first column that has one of these names; -1 where there is none.
  int guess(const std::vector<std::string_view>& names) const;
  // A name that the table does not have yet: this, or this with a number.
  std::string new_name(const std::string& name) const;
  std::string all_names() const;
};

// A field with quotes where it needs them.
void append_field(Buffer& out, std::string_view value, char separator);

// The separator that an option names: a character, or "tab".
char separator_of(const std::string& text);

}  // namespace tidewater::command
