// The bytes of an input, taken one after the other; zeros when they are used up.
#pragma once

#include <bit>
#include <cstddef>
#include <cstdint>
#include <string>

class Bytes {
 public:
  Bytes(const std::uint8_t* data, std::size_t size) : at_(data), end_(data + size) {}

  bool empty() const { return at_ == end_; }
  std::uint8_t byte() { return at_ == end_ ? std::uint8_t{0} : *at_++; }
  std::uint64_t bits(int bytes) {
    std::uint64_t all = 0;
    for (int i = 0; i < bytes; ++i) all = all << 8 | byte();
    return all;
  }
  double any_double() { return std::bit_cast<double>(bits(8)); }
  std::string rest() const { return {at_, end_}; }

 private:
  const std::uint8_t* at_;
  const std::uint8_t* end_;
};
