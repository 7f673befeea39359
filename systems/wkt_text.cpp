#include "wkt_text.hpp"

#include <charconv>
#include <cmath>

#include "number_text.hpp"
#include "tidewater/error.hpp"

namespace tidewater::detail {

namespace {

constexpr std::size_t kLongest = 1 << 20;
constexpr int kDeepest = 24;

class Parser {
 public:
  explicit Parser(std::string_view text) : text_(text) {}

  std::vector<WktNode> all() {
    std::vector<WktNode> objects;
    do {
      skip_blanks();
      objects.push_back(object(1));
      skip_blanks();
    } while (take(','));
    if (at_ != text_.size()) refuse("has something behind its last bracket");
    return objects;
  }

 private:
  [[noreturn]] void refuse(const std::string& what) const {
    throw Error("The WKT " + what + ", at character " + std::to_string(at_ + 1) + ".");
  }

  bool ended() const { return at_ == text_.size(); }
  char next() const { return ended() ? '\0' : text_[at_]; }  // no part of any text's syntax
  bool take(char c) {
    if (next() != c) return false;
    ++at_;
    return true;
  }
  void skip_blanks() {
    while (next() == ' ' || next() == '\t' || next() == '\r' || next() == '\n') ++at_;
  }
  static bool is_letter(char c) {
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || c == '_';
  }

  std::string word() {
    std::string result;
    while (is_letter(next()) || is_digit(next())) result += text_[at_++];
    return result;
  }

  WktNode object(int depth) {
    WktNode node;
    node.at = at_ + 1;
    if (!is_letter(next())) {
      refuse(ended() ? "ends where a keyword should stand" : "has no keyword");
    }
    node.value = word();
    skip_blanks();
    if (next() == '[' || next() == '(') {
      read_children(node, depth);
    } else if (depth == 1) {
      refuse("has no bracket behind \"" + node.value.substr(0, 40) + "\"");
    } else {
      node.kind = WktNode::Kind::word;
    }
    return node;
  }

  void read_children(WktNode& node, int depth) {
    if (depth > kDeepest) refuse("has brackets deeper than any system needs");
    for (char& c : node.value) c = c >= 'a' ? static_cast<char>(c - 32) : c;  // nothing behind z
    const char closing = text_[at_++] == '[' ? ']' : ')';
    skip_blanks();
    if (take(closing)) return;
    while (true) {
      skip_blanks();
      node.children.push_back(child(depth));
      skip_blanks();
      if (take(closing)) return;
      if (!take(',')) {
        refuse(ended() ? "ends before the bracket of " + node.value + " is closed"
                       : "has neither a comma nor a closing bracket in " + node.value);
      }
    }
  }

  WktNode child(int depth) {
    if (is_letter(next())) return object(depth + 1);
    WktNode node;
    node.at = at_ + 1;
    if (take('"')) {
      node.kind = WktNode::Kind::text;
      while (true) {
        if (ended()) refuse("ends within a quoted text");
        const char c = text_[at_++];
        if (c == '"' && !take('"')) return node;  // a doubled mark stands for itself
        node.value += c;
      }
    }
    node.kind = WktNode::Kind::number;
    const std::size_t begin = at_;
    if (next() == '+') ++at_;
    const char* const first = text_.data() + at_;
    const auto result = std::from_chars(first, text_.data() + text_.size(), node.number);
    if (result.ec != std::errc() || !std::isfinite(node.number)) {
      at_ = begin;
      refuse(ended() ? "ends where a value should stand" : "has a value that is no number");
    }
    at_ += static_cast<std::size_t>(result.ptr - first);
    // A date such as 2010-05-02 is a word.
    if (next() == '-' || next() == ':') {
      node.kind = WktNode::Kind::word;
      while (is_digit(next()) || is_letter(next()) || next() == '-' || next() == ':' ||
             next() == '.' || next() == '+') {
        ++at_;
      }
    }
    node.value = std::string(text_.substr(begin, at_ - begin));
    return node;
  }

  std::string_view text_;
  std::size_t at_ = 0;
};

}  // namespace

const WktNode* WktNode::find(std::string_view keyword, std::string_view or_keyword,
                             std::string_view or_third, std::string_view or_fourth) const {
  for (const WktNode& child : children) {
    if (child.kind != Kind::object) continue;
    if (child.value == keyword || (!or_keyword.empty() && child.value == or_keyword) ||
        (!or_third.empty() && child.value == or_third) ||
        (!or_fourth.empty() && child.value == or_fourth)) {
      return &child;
    }
  }
  return nullptr;
}

std::string WktNode::text(std::size_t place) const {
  return place < children.size() && children[place].kind == Kind::text ? children[place].value
                                                                       : std::string();
}

double WktNode::figure(std::size_t place, double otherwise) const {
  return place < children.size() && children[place].kind == Kind::number ? children[place].number
                                                                         : otherwise;
}

std::vector<WktNode> parse_wkt(std::string_view text) {
  if (text.size() > kLongest) throw Error("The WKT is longer than a megabyte.");
  return Parser(text).all();
}

}  // namespace tidewater::detail
