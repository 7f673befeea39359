#include "harmonic_degrees.hpp"

#include <cstdint>
#include <cstring>

#include "table_store.hpp"

namespace tabdll {

namespace {

// The text of a field that some other layout may have left without a terminator.
std::string_view text_at(const char* row, std::size_t offset, std::size_t size) {
  return {row + offset, strnlen(row + offset, size)};
}

const Table* find(const TableStore& store, std::string_view name, std::size_t row_size) {
  const auto found = store.tables().find(name);
  if (found == store.tables().end() || found->second.layout().row_size() < row_size) return nullptr;
  return &found->second;
}

std::string fault_of_epochs(const TableStore& store, std::string_view name) {
  const Table* epochs = find(store, name, 43);
  for (std::size_t i = 0; epochs && i < epochs->size(); ++i) {
    const char* row = epochs->row(i);
    std::int16_t degree = 0;
    std::memcpy(&degree, row + 8, sizeof degree);
    const Table* coefficients = find(store, text_at(row, 10, 33), 24);
    if (degree < 1 || !coefficients) continue;
    const std::size_t needed = rows_of_degree(static_cast<std::size_t>(degree));
    if (coefficients->size() >= needed) continue;
    return "table \"" + std::string(name) + "\": row " + std::to_string(i + 1) + ": degree " +
           std::to_string(degree) + " needs " + std::to_string(needed) + " coefficients, table \"" +
           std::string(text_at(row, 10, 33)) + "\" has " + std::to_string(coefficients->size());
  }
  return {};
}

}  // namespace

std::string fault_of_harmonic_degrees(const TableStore& store) {
  const Table* models = find(store, "magnetic models", 136);
  for (std::size_t i = 0; models && i < models->size(); ++i) {
    std::string fault = fault_of_epochs(store, text_at(models->row(i), 44, 28));
    if (!fault.empty()) return fault;
  }
  return {};
}

}  // namespace tabdll
