#include "packed_tables.hpp"

#include <array>
#include <charconv>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <limits>
#include <string>
#include <string_view>
#include <utility>

#include "tidewater/store.h"

namespace tabdll {

namespace {

constexpr std::string_view kBegin = "TWTABLES";
constexpr std::uint64_t kMostTables = 1000;
constexpr std::uint64_t kMostBytes = std::uint64_t{64} << 20;  // of packed rows

template <class Number>
std::int64_t integer_at(const char* at) {
  Number value;
  std::memcpy(&value, at, sizeof value);
  return value;
}

class Packer {
 public:
  void whole(std::uint64_t value) {
    for (; value > 0x7f; value >>= 7) out_.push_back(static_cast<unsigned char>(value | 0x80));
    out_.push_back(static_cast<unsigned char>(value));
  }

  void text(std::string_view value) {
    out_.insert(out_.end(), value.begin(), value.end());
    out_.push_back(0);
  }

  void table(const std::string& name, const Table& table) {
    text(name);
    whole(table.layout().fields.size());
    for (const Field& f : table.layout().fields) {
      text(f.column);
      whole(static_cast<std::uint64_t>(f.type));
      whole(static_cast<std::uint64_t>(f.offset));
      whole(static_cast<std::uint64_t>(f.size));
    }
    whole(table.size());
    for (const Field& f : table.layout().fields) column(table, f);
  }

  std::vector<unsigned char> take() { return std::move(out_); }

  void begin(std::size_t tables) {
    out_.insert(out_.end(), kBegin.begin(), kBegin.end());
    whole(tables);
  }

 private:
  void column(const Table& table, const Field& field) {
    std::int64_t last = 0;
    for (std::size_t i = 0; i < table.size(); ++i) {
      const char* at = table.row(i) + field.offset;
      switch (field.type) {
        case FieldType::kText:
          text({at, strnlen(at, static_cast<std::size_t>(field.size))});
          break;
        case FieldType::kInt16:
          last = difference(integer_at<std::int16_t>(at), last);
          break;
        case FieldType::kInt32:
          last = difference(integer_at<std::int32_t>(at), last);
          break;
        case FieldType::kFloat64:
          decimal(at);
          break;
        case FieldType::kPad:
          break;
      }
    }
  }

  std::int64_t difference(std::int64_t value, std::int64_t last) {
    const std::int64_t step = value - last;
    whole(step < 0 ? static_cast<std::uint64_t>(-(step + 1)) * 2 + 1
                   : static_cast<std::uint64_t>(step) * 2);
    return value;
  }

  void decimal(const char* at) {
    double value;
    std::memcpy(&value, at, sizeof value);
    std::array<char, 32> digits;
    const char* end = digits.data();
    if (value != 0 || std::signbit(value)) {
      end = std::to_chars(digits.data(), digits.data() + digits.size(), value).ptr;
    }
    text({digits.data(), static_cast<std::size_t>(end - digits.data())});
  }

  std::vector<unsigned char> out_;
};

class Unpacker {
 public:
  explicit Unpacker(std::span<const unsigned char> bytes) : left_(bytes) {}

  std::uint64_t whole() {
    std::uint64_t value = 0;
    for (int shift = 0; shift < 63; shift += 7) {
      require(!left_.empty());
      const unsigned char byte = left_.front();
      left_ = left_.subspan(1);
      value |= static_cast<std::uint64_t>(byte & 0x7f) << shift;
      if (byte < 0x80) return value;
    }
    throw StoreError("a whole number has no end");
  }

  std::uint64_t whole_up_to(std::uint64_t most) {
    const std::uint64_t value = whole();
    require(value <= most);
    return value;
  }

  std::string_view text() {
    require(!left_.empty());
    const void* end = std::memchr(left_.data(), 0, left_.size());
    require(end != nullptr);
    const auto size =
        static_cast<std::size_t>(static_cast<const unsigned char*>(end) - left_.data());
    const std::string_view value(reinterpret_cast<const char*>(left_.data()), size);
    left_ = left_.subspan(size + 1);
    return value;
  }

  std::pair<std::string, Table> table() {
    std::string name(text());
    Layout layout;
    const std::uint64_t fields = whole_up_to(TW_STORE_ROW_LIMIT);
    for (std::uint64_t i = 0; i < fields; ++i) {
      Field& f = layout.fields.emplace_back();
      f.column = text();
      f.type = static_cast<FieldType>(whole_up_to(static_cast<std::uint64_t>(FieldType::kPad)));
      f.offset = static_cast<std::int64_t>(whole_up_to(TW_STORE_ROW_LIMIT));
      f.size = static_cast<std::int64_t>(whole_up_to(TW_STORE_ROW_LIMIT));
    }
    const std::string fault = fault_of(layout);
    if (!fault.empty()) throw StoreError("table \"" + name + "\": layout: " + fault);
    const std::size_t row_size = layout.row_size();
    const std::uint64_t rows = whole_up_to(kMostBytes / row_size);
    // Every cell takes a byte at least, so that a short image cannot ask for much memory.
    require(rows <= left_.size());
    std::vector<char> packed(static_cast<std::size_t>(rows) * row_size);
    total_ += packed.size();
    require(total_ <= kMostBytes);
    for (const Field& f : layout.fields) {
      std::int64_t last = 0;
      for (char* at = packed.data() + f.offset; at < packed.data() + packed.size();
           at += row_size) {
        cell(f, at, last);
      }
    }
    return {std::move(name), Table(std::move(layout), std::move(packed))};
  }

  void begin() {
    require(left_.size() >= kBegin.size() &&
            std::memcmp(left_.data(), kBegin.data(), kBegin.size()) == 0);
    left_ = left_.subspan(kBegin.size());
  }

  void end() const { require(left_.empty()); }

 private:
  static void require(bool condition) {
    if (!condition) throw StoreError("these are no packed tables");
  }

  void cell(const Field& field, char* at, std::int64_t& last) {
    switch (field.type) {
      case FieldType::kText: {
        const std::string_view value = text();
        require(value.size() < static_cast<std::size_t>(field.size));
        std::memcpy(at, value.data(), value.size());
        return;
      }
      case FieldType::kInt16:
        return integer<std::int16_t>(at, last);
      case FieldType::kInt32:
        return integer<std::int32_t>(at, last);
      case FieldType::kFloat64: {
        const std::string_view digits = text();
        double value = 0;
        if (!digits.empty()) {
          const char* stop = digits.data() + digits.size();
          const auto read = std::from_chars(digits.data(), stop, value);
          require(read.ec == std::errc() && read.ptr == stop && std::isfinite(value));
        }
        std::memcpy(at, &value, sizeof value);
        return;
      }
      case FieldType::kPad:
        return;
    }
  }

  template <class Number>
  void integer(char* at, std::int64_t& last) {
    const std::uint64_t code = whole_up_to(std::uint64_t{1} << 34);
    const auto half = static_cast<std::int64_t>(code >> 1);
    last += code % 2 == 0 ? half : -half - 1;
    require(std::in_range<Number>(last));
    const auto value = static_cast<Number>(last);
    std::memcpy(at, &value, sizeof value);
  }

  std::span<const unsigned char> left_;
  std::size_t total_ = 0;
};

}  // namespace

std::vector<unsigned char> pack_tables(const TableStore& store) {
  Packer packer;
  packer.begin(store.tables().size());
  for (const auto& [name, table] : store.tables()) packer.table(name, table);
  return packer.take();
}

TableStore unpack_tables(std::span<const unsigned char> bytes) {
  Unpacker unpacker(bytes);
  unpacker.begin();
  Tables tables;
  const std::uint64_t count = unpacker.whole_up_to(kMostTables);
  for (std::uint64_t i = 0; i < count; ++i) tables.insert(unpacker.table());
  unpacker.end();
  return TableStore(std::move(tables));
}

}  // namespace tabdll
