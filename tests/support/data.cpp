#include "support/data.hpp"

#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <random>

namespace fs = std::filesystem;

namespace tidewater::test {

#ifdef _WIN32
// By contract a national grid stays open when another is opened: the tests open more than 512.
[[maybe_unused]] static const int most_files = _setmaxstdio(2048);
#endif

fs::path shared_data() {
  const char* named = std::getenv("TIDEWATER_DATA");
  const fs::path folder = named ? named : TIDEWATER_SHARED_DATA;
  return fs::is_directory(folder) ? folder : fs::path();
}

fs::path proj_data() {
  const fs::path folder = "/usr/share/proj";
  return fs::is_directory(folder) ? folder : fs::path();
}

ScratchFolder::ScratchFolder() {
  std::random_device any;
  do {
    path_ = fs::temp_directory_path() / ("tidewater-" + std::to_string(any()));
  } while (!fs::create_directory(path_));
}

ScratchFolder::~ScratchFolder() {
  std::error_code ignored;
  fs::remove_all(path_, ignored);
}

void ScratchFolder::write(const std::string& name, const std::string& bytes) const {
  std::ofstream(path_ / name, std::ios::binary) << bytes;
}

}  // namespace tidewater::test
