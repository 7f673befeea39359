// Stores that are made for one test from the tree's own sources, changed.
#pragma once

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>

#include "support/data.hpp"

namespace tidewater::test {

// The tree's sources, in a folder of their own.
class StoreSources {
 public:
  StoreSources() {
    std::filesystem::copy(std::filesystem::path(TIDEWATER_SOURCE) / "data", path_of(""),
                          std::filesystem::copy_options::recursive);
  }

  void append(const std::string& file, const std::string& line) const {
    std::ofstream(path_of(file), std::ios::app) << line << "\n";
  }
  // All of a text by another.
  void replace(const std::string& file, const std::string& text, const std::string& by) const {
    std::ostringstream all;
    all << std::ifstream(path_of(file)).rdbuf();
    std::string bytes = all.str();
    for (std::size_t at = 0; (at = bytes.find(text, at)) != std::string::npos; at += by.size()) {
      bytes.replace(at, text.size(), by);
    }
    std::ofstream(path_of(file)) << bytes;
  }
  void write(const std::string& file, const std::string& bytes) const {
    std::ofstream(path_of(file)) << bytes;
  }

  // Builds the store; its path, empty where the builder refuses the sources.
  std::string build() const {
    const std::string store = (folder_.path() / "made.store").string();
    const std::string command = std::string(TWSTORE_COMMAND) + " build '" + store + "' '" +
                                path_of("").string() + "' >/dev/null";
    return std::system(command.c_str()) == 0 ? store : "";
  }

 private:
  std::filesystem::path path_of(const std::string& file) const {
    return folder_.path() / "sources" / file;
  }
  ScratchFolder folder_;
};

}  // namespace tidewater::test
