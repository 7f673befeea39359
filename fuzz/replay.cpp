// Takes files, and the files of folders, through a fuzz target without a fuzzer: each name is
// written before, so that the last one is the file that ended the program or took too long.

#include <unistd.h>

#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

int main(int argc, char** argv) {
  namespace fs = std::filesystem;
  constexpr unsigned kSeconds = 60;  // for one file, under sanitizers on a busy machine
  std::vector<std::string> files;
  for (int i = 1; i < argc; ++i) {
    if (!fs::is_directory(argv[i])) {
      files.emplace_back(argv[i]);
      continue;
    }
    for (const auto& entry : fs::directory_iterator(argv[i])) files.push_back(entry.path());
  }
  std::sort(files.begin(), files.end());
  for (const std::string& name : files) {
    std::fprintf(stderr, "%s\n", name.c_str());
    std::ifstream file(name, std::ios::binary);
    if (!file) {
      std::fprintf(stderr, "cannot be read\n");
      return 1;
    }
    const std::vector<char> bytes{std::istreambuf_iterator<char>(file), {}};
    alarm(kSeconds);
    LLVMFuzzerTestOneInput(reinterpret_cast<const std::uint8_t*>(bytes.data()), bytes.size());
    alarm(0);
  }
  std::fprintf(stderr, "%zu files\n", files.size());
  return files.empty() ? 1 : 0;
}
