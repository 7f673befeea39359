// Runs work in a process of its own that has little memory, so that a large
// allocation fails.  The address sanitizer reserves more than that for itself.
#pragma once

#include <gtest/gtest.h>

#if defined(__unix__) && !defined(__SANITIZE_ADDRESS__)
#include <sys/resource.h>

#include <cstdlib>

namespace tidewater::test {

// An emulated processor takes a limit of the memory and holds none, nor can the program start anew.
inline bool emulated() {
  rlimit before = {}, held = {};
  getrlimit(RLIMIT_AS, &before);
  const rlimit asked = {1u << 30, before.rlim_max};
  setrlimit(RLIMIT_AS, &asked);
  getrlimit(RLIMIT_AS, &held);
  setrlimit(RLIMIT_AS, &before);
  return held.rlim_cur != asked.rlim_cur;
}

template <class Work>
[[noreturn]] void exit_with_little_memory(Work work) {
  constexpr rlim_t size = 600u << 20;
  const rlimit limit = {size, size};
  std::_Exit(setrlimit(RLIMIT_AS, &limit) == 0 && work() ? 0 : 1);
}

// Expects work() to give true.
template <class Work>
void expect_with_little_memory(Work work) {
  EXPECT_EXIT(exit_with_little_memory(work), testing::ExitedWithCode(0), "");
}

}  // namespace tidewater::test

#define TIDEWATER_NEED_MEMORY_LIMIT() \
  if (tidewater::test::emulated()) GTEST_SKIP() << "an emulator does not limit the memory"
#else
namespace tidewater::test {
inline bool emulated() { return false; }

template <class Work>
void expect_with_little_memory(Work) {}
}  // namespace tidewater::test

#define TIDEWATER_NEED_MEMORY_LIMIT() GTEST_SKIP() << "memory cannot be limited in this build"
#endif

#define TIDEWATER_NEED_NEW_PROCESS() \
  if (tidewater::test::emulated()) GTEST_SKIP() << "an emulated program cannot start anew"
