#include "layout.hpp"

#include <algorithm>
#include <array>
#include <bitset>

#include "tidewater/store.h"

namespace tabdll {

namespace {

struct TypeName {
  FieldType type;
  std::string_view name;
  int64_t size;  // 0: any
};

constexpr std::array<TypeName, 5> kTypes = {{{FieldType::kText, "text", 0},
                                             {FieldType::kInt16, "int16", 2},
                                             {FieldType::kInt32, "int32", 4},
                                             {FieldType::kFloat64, "float64", 8},
                                             {FieldType::kPad, "pad", 0}}};

const TypeName& entry(FieldType type) {
  return *std::find_if(kTypes.begin(), kTypes.end(),
                       [type](const TypeName& t) { return t.type == type; });
}

}  // namespace

std::optional<FieldType> field_type(std::string_view name) {
  for (const TypeName& t : kTypes) {
    if (t.name == name) return t.type;
  }
  return std::nullopt;
}

std::string_view type_name(FieldType type) { return entry(type).name; }

std::size_t Layout::row_size() const {
  int64_t end = 0;
  for (const Field& f : fields) end = std::max(end, f.offset + f.size);
  return static_cast<std::size_t>(end);
}

const Field* Layout::find(std::string_view column) const {
  for (const Field& f : fields) {
    if (f.type != FieldType::kPad && f.column == column) return &f;
  }
  return nullptr;
}

std::string fault_of(const Layout& layout) {
  std::bitset<TW_STORE_ROW_LIMIT> taken;
  bool named = false;
  for (const Field& f : layout.fields) {
    const std::string where = "column \"" + f.column + "\": ";
    if (f.type == FieldType::kPad) {
      if (!f.column.empty()) return where + "a pad has no column";
    } else {
      if (f.column.empty()) return "a field that is no pad has no column";
      if (layout.find(f.column) != &f) return where + "stands twice in the layout";
      named = true;
    }
    const int64_t size = entry(f.type).size;
    if (f.size < 1 || f.size > TW_STORE_ROW_LIMIT || (size != 0 && f.size != size)) {
      return where + "a size of " + std::to_string(f.size) + " does not fit its type";
    }
    if (f.offset < 0 || f.offset > TW_STORE_ROW_LIMIT - f.size) {
      return where + "bytes " + std::to_string(f.offset) + " to " + std::to_string(f.offset) + "+" +
             std::to_string(f.size) + " lie outside a row of " + std::to_string(TW_STORE_ROW_LIMIT);
    }
    for (int64_t i = f.offset; i < f.offset + f.size; ++i) {
      if (taken.test(static_cast<std::size_t>(i))) return where + "overlaps another field";
      taken.set(static_cast<std::size_t>(i));
    }
  }
  return named ? std::string() : "no column";
}

}  // namespace tabdll
