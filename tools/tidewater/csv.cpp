#include "csv.hpp"

#include <algorithm>
#include <stdexcept>

namespace tidewater::command {

namespace {

std::string lowered(std::string_view text) {
  std::string out;
  for (const char c : text) out += c >= 'A' && c <= 'Z' ? static_cast<char>(c + 32) : c;
  while (!out.empty() && out.back() == ' ') out.pop_back();
  return out.substr(std::min(out.find_first_not_of(' '), out.size()));
}

}  // namespace

bool Record::take(std::string_view& text, char separator) {
  if (text.empty()) return false;
  fields_.clear();
  lines_ = 1;
  const char* const begin = text.data();
  const char* const end = begin + text.size();
  const char* at = begin;
  const char* field = begin;
  for (;; ++at) {
    if (at == end || *at == '\n') break;
    if (*at == separator) {
      fields_.emplace_back(field, static_cast<std::size_t>(at - field));
      field = at + 1;
    } else if (*at == '"' && at == field) {
      for (++at; at != end; ++at) {
        if (*at == '\n') ++lines_;
        if (*at != '"') continue;
        if (at + 1 == end || at[1] != '"') break;
        ++at;
      }
      if (at == end) break;
    }
  }
  const char* stop = at;
  if (stop != field && stop[-1] == '\r') --stop;
  fields_.emplace_back(field, static_cast<std::size_t>(stop - field));
  whole_ = {begin, static_cast<std::size_t>(stop - begin)};
  if (at != end) ++at;
  line_end_ = {stop, static_cast<std::size_t>(at - stop)};
  text.remove_prefix(static_cast<std::size_t>(at - begin));
  return true;
}

std::string Record::value(std::size_t i) const {
  std::string_view field = fields_[i];
  if (field.empty() || field[0] != '"') return std::string(field);
  field.remove_prefix(1);
  if (!field.empty() && field.back() == '"') field.remove_suffix(1);
  std::string value;
  for (std::size_t at = 0; at < field.size(); ++at) {
    value += field[at];
    if (field[at] == '"' && at + 1 < field.size() && field[at + 1] == '"') ++at;
  }
  return value;
}

Table::Table(std::string_view first_line, char given_separator) {
  separator = given_separator;
  if (separator == 0) {
    std::size_t most = 0;
    separator = ',';
    const std::string_view line = first_line.substr(0, first_line.find('\n'));
    for (const char c : {',', ';', '\t', '|'}) {
      const auto count = static_cast<std::size_t>(std::count(line.begin(), line.end(), c));
      if (count > most) {
        most = count;
        separator = c;
      }
    }
  }
  Record record;
  if (!record.take(first_line, separator))
    throw std::runtime_error("the table has no line of names");
  for (std::size_t i = 0; i < record.size(); ++i) names.push_back(record.value(i));
}

std::size_t Table::column(const std::string& name) const {
  for (std::size_t i = 0; i < names.size(); ++i) {
    if (names[i] == name) return i;
  }
  const int found = guess({name});
  if (found >= 0) return static_cast<std::size_t>(found);
  throw std::invalid_argument("the table has no column \"" + name + "\"; it has " + all_names());
}

int Table::guess(const std::vector<std::string_view>& wanted) const {
  for (const std::string_view name : wanted) {
    for (std::size_t i = 0; i < names.size(); ++i) {
      if (lowered(names[i]) == lowered(name)) return static_cast<int>(i);
    }
  }
  return -1;
}

std::string Table::new_name(const std::string& name) const {
  std::string unused = name;
  for (int i = 2; guess({unused}) >= 0; ++i) unused = name + "_" + std::to_string(i);
  return unused;
}

std::string Table::all_names() const {
  constexpr std::size_t kShown = 200;
  std::string text;
  for (const std::string& name : names) text += (text.empty() ? "" : ", ") + name;
  if (text.size() > kShown) text = text.substr(0, kShown) + "...";
  for (char& c : text) {
    if (static_cast<unsigned char>(c) < ' ' || c == 127) c = '?';
  }
  return text;
}

void append_field(Buffer& out, std::string_view value, char separator) {
  const bool plain =
      value.find_first_of("\"\r\n") == value.npos && value.find(separator) == value.npos;
  if (plain) return out.add(value);
  out.add('"');
  for (const char c : value) {
    if (c == '"') out.add('"');
    out.add(c);
  }
  out.add('"');
}

char separator_of(const std::string& text) {
  if (text.empty()) return 0;
  if (text == "tab" || text == "\\t") return '\t';
  if (text.size() == 1 && text[0] != '"' && text[0] != '\n') return text[0];
  throw std::invalid_argument("--separator takes one character, or tab");
}

}  // namespace tidewater::command
