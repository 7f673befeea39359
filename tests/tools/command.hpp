// Runs a command of this build, as a user would, and keeps what it says.
#pragma once

#include <sys/wait.h>

#include <cstdio>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

#include "support/data.hpp"

namespace tidewater::test {

struct Outcome {
  std::string out;
  std::string err;
  int status = -1;
};

inline std::string contents(const std::filesystem::path& file) {
  std::ostringstream text;
  text << std::ifstream(file, std::ios::binary).rdbuf();
  return text.str();
}

// Runs a line of shell in which "tidewater" and "twstore" are those of this build.
inline Outcome shell(const std::string& line, const std::string& input = "") {
  const ScratchFolder scratch;
  scratch.write("in", input);
  scratch.write("script", "PATH=" TIDEWATER_COMMANDS ":$PATH\n" + line + "\n");
  const std::string folder = scratch.path().string();
  const std::string command =
      "bash " + folder + "/script <" + folder + "/in >" + folder + "/out 2>" + folder + "/err";
  const int status = std::system(command.c_str());
  return {contents(scratch.path() / "out"), contents(scratch.path() / "err"),
          WIFEXITED(status) ? WEXITSTATUS(status) : -1};
}

// The lines of a text, and the numbers that a line begins with.
inline std::vector<std::string> lines(const std::string& text) {
  std::vector<std::string> all;
  std::istringstream stream(text);
  for (std::string line; std::getline(stream, line);) all.push_back(line);
  return all;
}

inline std::vector<double> numbers(const std::string& line) {
  std::vector<double> all;
  std::istringstream stream(line);
  for (double value = 0; stream >> value;) all.push_back(value);
  return all;
}

// Bytes of every value, the same on each call.
inline std::string garbage_text(int count) {
  std::string text;
  unsigned state = 1;
  for (int i = 0; i < count; ++i) {
    state = state * 1664525u + 1013904223u;
    text += static_cast<char>(state >> 24);
  }
  return text;
}

}  // namespace tidewater::test
