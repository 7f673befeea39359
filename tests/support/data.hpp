// Where tests find real grids and coefficients, and a folder of their own for made-up ones.
#pragma once

#include <gtest/gtest.h>

#include <filesystem>
#include <string>

namespace tidewater::test {

// The folder of real data: $TIDEWATER_DATA, or shared/data beside the project.  Empty where absent.
std::filesystem::path shared_data();

// The folder of real NTv2 grids that the distribution's PROJ data package installs; empty where
// absent.
std::filesystem::path proj_data();

// A folder that is made for one test and removed with it.
class ScratchFolder {
 public:
  ScratchFolder();
  ~ScratchFolder();
  ScratchFolder(const ScratchFolder&) = delete;
  ScratchFolder& operator=(const ScratchFolder&) = delete;

  const std::filesystem::path& path() const { return path_; }
  // The path with its separator behind it, as the grid functions want a directory.
  std::string directory() const { return path_.string() + "/"; }
  void write(const std::string& name, const std::string& bytes) const;

 private:
  std::filesystem::path path_;
};

}  // namespace tidewater::test

// Leaves a test with a clear word where the real data are not there.
#ifdef _WIN32
#define TIDEWATER_NOT_ON_WINDOWS(reason) GTEST_SKIP() << "Windows: " reason
#else
#define TIDEWATER_NOT_ON_WINDOWS(reason) static_cast<void>(0)
#endif

#define TIDEWATER_NEED_SHARED_DATA()          \
  if (tidewater::test::shared_data().empty()) \
  GTEST_SKIP() << "real data not found: set TIDEWATER_DATA to the folder of them"
