// Runs work in a process of its own that has little memory, so that a large
// allocation fails.  The address sanitizer reserves more than that for itself.
#pragma once

#include <gtest/gtest.h>

#if defined(__unix__) && !defined(__SANITIZE_ADDRESS__)
#include <sys/resource.h>

#include <cstdlib>

namespace tidewater::test {

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

#define TIDEWATER_NEED_MEMORY_LIMIT() static_cast<void>(0)
#else
namespace tidewater::test {
template <class Work>
void expect_with_little_memory(Work) {}
}  // namespace tidewater::test

#define TIDEWATER_NEED_MEMORY_LIMIT() GTEST_SKIP() << "memory cannot be limited in this build"
#endif
