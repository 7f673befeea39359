// Bytes as a store file, read by the store's own classes: whatever opens can be walked, listed in
// the order of every column, and searched for each of its cells.

#include <cstdint>
#include <cstdlib>
#include <string>
#include <vector>

#include "checker.hpp"
#include "table_store.hpp"

namespace {

void require(bool holds) {
  if (!holds) std::abort();
}

void read_table(const tabdll::Table& table) {
  const auto rows = [&](const char* column) {
    tabdll::Walk walk(table, column);
    std::size_t count = 0;
    while (walk.next()) ++count;
    return count;
  };
  require(rows(nullptr) == table.size());
  for (const tabdll::Field& field : table.layout().fields) {
    if (field.type == tabdll::FieldType::kPad) continue;
    require(rows(field.column.c_str()) == table.size());
    for (std::size_t i = 0; i < table.size(); ++i) {
      // The first row that has the cell stands where the cell does, or before it.
      const char* found = table.find(field.column, table.row(i) + field.offset);
      require(found && found <= table.row(i));
    }
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  try {
    const tabdll::TableStore store(std::vector<unsigned char>(data, data + size));
    for (const auto& [name, table] : store.tables()) read_table(table);
    tabdll::faults_of(store);
  } catch (const tabdll::StoreError&) {
  }
  return 0;
}
