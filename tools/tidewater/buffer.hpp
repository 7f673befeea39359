// A text that is written at its end, without the checks of a string in the inner loop.
#pragma once

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <memory>
#include <string_view>

namespace tidewater::command {

// Holds any double with this many decimals at most.
inline constexpr int kMostDecimals = 15;
inline constexpr std::size_t kNumberRoom = 400;

// Writes a number with so many decimals, rounded to nearest; what rounds to zero has no sign.
inline char* format_fixed(char* out, double value, int decimals) {
  static constexpr double kPowers[] = {1,   1e1, 1e2,  1e3,  1e4,  1e5,  1e6,  1e7,
                                       1e8, 1e9, 1e10, 1e11, 1e12, 1e13, 1e14, 1e15};
  const double scaled = std::fabs(value) * kPowers[decimals];
  if (scaled < 4e15) {
    // The product is a rounding off: near a half the digits are found the long way.
    const double whole = std::floor(scaled);
    const double part = scaled - whole;
    if (std::fabs(part - 0.5) > 0x1p-51 * scaled) {
      const auto digits = static_cast<std::uint64_t>(whole) + (part > 0.5 ? 1 : 0);
      if (value < 0 && digits != 0) *out++ = '-';
      const auto power = static_cast<std::uint64_t>(kPowers[decimals]);
      out = std::to_chars(out, out + 20, digits / power).ptr;
      if (decimals == 0) return out;
      std::uint64_t rest = digits % power;
      *out = '.';
      for (int i = decimals; i > 0; --i) {
        out[i] = static_cast<char>('0' + rest % 10);
        rest /= 10;
      }
      return out + decimals + 1;
    }
  }
  char* const end =
      std::to_chars(out, out + kNumberRoom, value, std::chars_format::fixed, decimals).ptr;
  if (*out == '-' &&
      std::string_view(out, static_cast<std::size_t>(end - out)).find_first_of("123456789in") ==
          std::string_view::npos) {
    std::memmove(out, out + 1, static_cast<std::size_t>(end - out - 1));
    return end - 1;
  }
  return end;
}

class Buffer {
 public:
  std::string_view text() const { return {data_.get(), size_}; }
  std::size_t size() const { return size_; }
  void clear() { size_ = 0; }
  // Cuts what stands behind a place.
  void cut(std::size_t size) { size_ = size; }

  // Where so many bytes can be written; used() tells up to where they were.
  char* room(std::size_t bytes) {
    if (capacity_ - size_ < bytes) grow(bytes);
    return data_.get() + size_;
  }
  void used(const char* end) { size_ = static_cast<std::size_t>(end - data_.get()); }

  void add(std::string_view text) {
    char* const to = room(text.size());
    if (!text.empty()) std::memcpy(to, text.data(), text.size());
    size_ += text.size();
  }
  void add(char c) {
    *room(1) = c;
    ++size_;
  }
  void add_fixed(double value, int decimals) {
    used(format_fixed(room(kNumberRoom), value, decimals));
  }

 private:
  void grow(std::size_t bytes) {
    const std::size_t capacity = std::max<std::size_t>(2 * capacity_, size_ + bytes + 4096);
    std::unique_ptr<char[]> bigger(new char[capacity]);
    if (size_ != 0) std::memcpy(bigger.get(), data_.get(), size_);
    data_ = std::move(bigger);
    capacity_ = capacity;
  }

  std::unique_ptr<char[]> data_;
  std::size_t size_ = 0;
  std::size_t capacity_ = 0;
};

}  // namespace tidewater::command
