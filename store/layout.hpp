// The layouts of packed rows: for a table, which column stands at which byte, with what type and
// size.  They lie in the store file beside the tables, so that any table packs by data.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace tabdll {

enum class FieldType { kText, kInt16, kInt32, kFloat64, kPad };

// The names of the types in layout tables and files: text, int16, int32, float64, pad.
std::optional<FieldType> field_type(std::string_view name);
std::string_view type_name(FieldType type);

// A text field holds its terminator too; a pad has no column and packs as zeros.
struct Field {
  std::string column;
  FieldType type;
  int64_t offset;
  int64_t size;

  bool operator==(const Field&) const = default;
};

struct Layout {
  std::vector<Field> fields;

  // Up to the end of the last field; meaningful for a sound layout.
  std::size_t row_size() const;
  const Field* find(std::string_view column) const;
};

// What is wrong with a layout: a field that reaches out of the longest row or into another, a size
// that is not that of its type, a column named twice or not at all.  Empty where it is sound.
std::string fault_of(const Layout& layout);

}  // namespace tabdll
