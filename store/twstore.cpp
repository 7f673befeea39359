// twstore: builds, lists, checks and packs parameter stores.

#include <CLI/CLI.hpp>
#include <array>
#include <charconv>
#include <cstring>
#include <exception>
#include <fstream>
#include <functional>
#include <iostream>
#include <string>
#include <vector>

#include "builder.hpp"
#include "checker.hpp"
#include "csv.hpp"
#include "packed_tables.hpp"
#include "table_store.hpp"

namespace {

using namespace tabdll;

template <class Number>
std::string number_text(const char* at) {
  Number value;
  std::memcpy(&value, at, sizeof value);
  std::array<char, 32> text;
  const auto end = std::to_chars(text.data(), text.data() + text.size(), value).ptr;
  return {text.data(), end};
}

std::string cell(const Field& field, const char* row) {
  const char* at = row + field.offset;
  switch (field.type) {
    case FieldType::kText:
      return csv_cell(at);
    case FieldType::kInt16:
      return number_text<int16_t>(at);
    case FieldType::kInt32:
      return number_text<int32_t>(at);
    case FieldType::kFloat64:
      return number_text<double>(at);
    case FieldType::kPad:
      break;
  }
  return {};
}

void print_row(const Layout& layout, const std::function<std::string(const Field&)>& text) {
  const char* separator = "";
  for (const Field& f : layout.fields) {
    if (f.type == FieldType::kPad) continue;
    std::cout << separator << text(f);
    separator = ",";
  }
  std::cout << '\n';
}

int list_tables(const TableStore& store) {
  std::cout << "table,rows,row size\n";
  for (const auto& [name, rows] : store.tables()) {
    std::cout << csv_cell(name) << ',' << rows.size() << ',' << rows.layout().row_size() << '\n';
  }
  return 0;
}

int list_rows(const TableStore& store, const std::string& table) {
  const Table& rows = store.table(table);
  print_row(rows.layout(), [](const Field& f) { return csv_cell(f.column); });
  Walk walk(rows, nullptr);
  while (const char* row = walk.next()) {
    print_row(rows.layout(), [&](const Field& f) { return cell(f, row); });
  }
  return 0;
}

int check(const TableStore& store) {
  const auto faults = faults_of(store);
  for (const std::string& fault : faults) std::cerr << fault << '\n';
  return faults.empty() ? 0 : 1;
}

int pack(const TableStore& store, const std::string& file) {
  const std::vector<unsigned char> bytes = pack_tables(store);
  std::ofstream out(file, std::ios::binary);
  out.write(reinterpret_cast<const char*>(bytes.data()),
            static_cast<std::streamsize>(bytes.size()));
  if (out.flush()) return 0;
  std::cerr << "twstore: " << file << " cannot be written\n";
  return 1;
}

int run(int argc, char** argv) {
  CLI::App app{"Builds, lists, checks and packs parameter stores."};
  app.require_subcommand(1);
  std::string store;
  std::string folder;
  std::string table;
  std::string file;

  CLI::App* build = app.add_subcommand("build", "Build a store from a folder of CSV files");
  build->add_option("STORE", store, "The file to write")->required();
  build->add_option("DIR", folder, "The folder: layouts.csv, tables.csv and what they name")
      ->required();
  CLI::App* list = app.add_subcommand("list", "List the tables of a store, or a table's rows");
  list->add_option("STORE", store, "The store")->required();
  list->add_option("TABLE", table, "The table whose rows to list");
  CLI::App* checked = app.add_subcommand("check", "Hold a store against what the library reads");
  checked->add_option("STORE", store, "The store")->required();
  CLI::App* packed =
      app.add_subcommand("pack", "Write a store's tables as one compact run of bytes");
  packed->add_option("STORE", store, "The store")->required();
  packed->add_option("FILE", file, "The file to write")->required();
  CLI11_PARSE(app, argc, argv);

  try {
    if (build->parsed()) {
      build_store(store, folder);
      return 0;
    }
    const TableStore opened(store.c_str());
    if (checked->parsed()) return check(opened);
    if (packed->parsed()) return pack(opened, file);
    return table.empty() ? list_tables(opened) : list_rows(opened, table);
  } catch (const SourceError& e) {
    std::cerr << "twstore: " << e.what() << '\n';
  } catch (const std::exception& e) {
    std::cerr << "twstore: " << store << ": " << e.what() << '\n';
  }
  return 1;
}

}  // namespace

int main(int argc, char** argv) {
  try {
    const int code = run(argc, argv);
    if (std::cout.flush()) return code;
    std::cerr << "twstore: the output cannot be written\n";
    return 1;
  } catch (const std::exception& e) {
    std::cerr << "twstore: " << e.what() << '\n';
    return 1;
  }
}
