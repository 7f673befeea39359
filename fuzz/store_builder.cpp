// Text as a folder of sources: lines "=== NAME" begin the files.  The builder refuses with a
// sentence or builds a store that opens.

#include <unistd.h>

#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>
#include <string_view>

#include "builder.hpp"
#include "csv.hpp"
#include "table_store.hpp"

namespace {

namespace fs = std::filesystem;

constexpr const char* kNames[] = {"layouts.csv", "tables.csv", "a.csv", "b.csv"};

// A folder of this process alone.
class Folder {
 public:
  Folder() : path_(fs::temp_directory_path() / ("tidewater-fuzz-" + std::to_string(::getpid()))) {
    fs::create_directories(path_);
  }
  ~Folder() {
    std::error_code ignored;
    fs::remove_all(path_, ignored);
  }
  Folder(const Folder&) = delete;
  Folder& operator=(const Folder&) = delete;

  const fs::path& path() const { return path_; }

 private:
  fs::path path_;
};

// The part of the text behind the line "=== NAME", up to the next such line.
std::string_view part(std::string_view text, const std::string& name) {
  const std::string head = "=== " + name + "\n";
  const std::size_t at = text.find(head);
  if (at == std::string_view::npos) return {};
  const std::string_view rest = text.substr(at + head.size());
  return rest.substr(0, rest.find("=== "));
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static const Folder folder;
  const std::string_view text(reinterpret_cast<const char*>(data), size);
  for (const char* name : kNames) {
    std::ofstream(folder.path() / name, std::ios::binary) << part(text, name);
  }
  const fs::path store = folder.path() / "built.store";
  fs::remove(store);
  try {
    tabdll::build_store(store, folder.path());
  } catch (const tabdll::SourceError&) {
    if (fs::exists(store)) std::abort();
    return 0;
  }
  // What stands in it may still be refused, as a degree without its coefficients; that it can be
  // read may not.
  try {
    const tabdll::TableStore opened(store.string().c_str());
  } catch (const tabdll::StoreError& e) {
    if (std::string_view(e.what()).find(": degree ") == std::string_view::npos) std::abort();
  }
  return 0;
}
