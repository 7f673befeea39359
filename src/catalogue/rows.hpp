// The packed rows of the parameter store: where each field stands, and how it is read.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <cstring>

#include "tidewater/store.h"

namespace tidewater::detail {

// A text field: its first byte and its size with the terminator.
struct TextField {
  std::size_t offset;
  std::size_t size;
};

// Names of a list stand this many bytes apart.
inline constexpr std::size_t kNameSlot = 41;

// Copies a text and its terminator, at most size bytes of both: a field without a terminator is
// cut.
inline void copy_field(const char* field, std::size_t size, char* out) {
  const void* end = std::memchr(field, '\0', size - 1);
  const std::size_t length =
      end ? static_cast<std::size_t>(static_cast<const char*>(end) - field) : size - 1;
  std::memcpy(out, field, length);
  out[length] = '\0';
}

// A row as the store packs it, numbers in the machine's own byte order.  Until the store has
// written one it is all zeros: a number 0, an empty text.
class Row {
 public:
  void* data() { return bytes_.data(); }

  template <class Number>
  Number number(std::size_t offset) const {
    Number value;
    std::memcpy(&value, bytes_.data() + offset, sizeof value);
    return value;
  }

  void text(const TextField& field, char* out) const {
    copy_field(bytes_.data() + field.offset, field.size, out);
  }

  // The text in entry index of a name list; what is longer than an entry is cut.
  void list_name(const TextField& field, char* names, std::size_t index) const {
    copy_field(bytes_.data() + field.offset, field.size < kNameSlot ? field.size : kNameSlot,
               names + index * kNameSlot);
  }

 private:
  std::array<char, TW_STORE_ROW_LIMIT> bytes_ = {};
};

// "system" and "dt_models".
namespace class_row {
inline constexpr TextField kClass = {0, 16};
inline constexpr TextField kName = {16, 41};
inline constexpr std::size_t kNumber = 58;  // int16
inline constexpr std::size_t kForm = 60;    // int16
inline constexpr std::size_t kMask = 64;    // int32
}  // namespace class_row

// "vert_datum".
namespace vertical_datum_row {
inline constexpr std::size_t kNumber = 0;  // int32
inline constexpr TextField kName = {4, 44};
}  // namespace vertical_datum_row

// "undul".
namespace undulation_row {
inline constexpr TextField kClass = {0, 16};
inline constexpr TextField kName = {16, 41};
inline constexpr TextField kParameter = {57, 17};
inline constexpr std::size_t kNumber = 74;  // int16
}  // namespace undulation_row

// "spcs27_tbl" and "spcs83_tbl".
namespace zone_row {
inline constexpr std::size_t kNumber = 0;  // int16
inline constexpr TextField kName = {2, 42};
}  // namespace zone_row

// "Satellites".
namespace satellite_row {
inline constexpr TextField kName = {0, 32};
inline constexpr std::size_t kReal1 = 32, kReal2 = 40, kReal3 = 64, kReal4 = 72, kReal5 = 80;
inline constexpr std::size_t kAngle1 = 48, kAngle2 = 56, kAngle3 = 88;  // double, degrees
inline constexpr std::size_t kCount1 = 96;                              // int32
inline constexpr std::size_t kShort1 = 100, kShort2 = 102, kShort3 = 104;
inline constexpr std::size_t kId = 106;  // int16
}  // namespace satellite_row

// "mre models".
namespace regression_row {
inline constexpr std::size_t kSize = 144;
inline constexpr TextField kName = {0, 44};
inline constexpr std::size_t kNumber = 44;  // int32
inline constexpr TextField kTable1 = {74, 21}, kTable2 = {95, 21}, kTable3 = {116, 21};
}  // namespace regression_row

// "Complex Models".
namespace complex_row {
inline constexpr std::size_t kSize = 112;
inline constexpr TextField kName = {0, 44};
inline constexpr std::size_t kNumber = 44;  // int32
inline constexpr TextField kTable = {88, 24};
}  // namespace complex_row

// "magnetic models".
namespace magnetic_row {
inline constexpr TextField kName = {0, 42};
inline constexpr std::size_t kNumber = 42;  // int16
inline constexpr TextField kEpochTable = {44, 28};
inline constexpr std::size_t kConstant1 = 72;
inline constexpr std::size_t kNormalisation = 80;  // int16
inline constexpr TextField kText = {82, 30};
inline constexpr std::size_t kLowerBound = 112, kUpperBound = 120, kConstant2 = 128;
}  // namespace magnetic_row

// The epoch table of a magnetic model.
namespace epoch_row {
inline constexpr std::size_t kDate = 0;
inline constexpr std::size_t kDegree = 8;  // int16
inline constexpr TextField kTable = {10, 33};
}  // namespace epoch_row

// The coefficient tables of complex and magnetic models.
namespace coefficient_row {
inline constexpr std::size_t kFirst = 8, kSecond = 16;
}  // namespace coefficient_row

}  // namespace tidewater::detail
