// A failed allocation, by a limit on the memory of a process of its own.
#pragma once

#include <gtest/gtest.h>
#include <sys/resource.h>

#include <cstdlib>

namespace tidewater::test {

// Runs a check with little memory left and ends the process: with 0 where the check holds. For
// EXPECT_EXIT().
template <class Check>
[[noreturn]] void exit_with_little_memory(Check check) {
  constexpr rlim_t kLittle = 600u << 20;
  const rlimit limit = {kLittle, kLittle};
  if (setrlimit(RLIMIT_AS, &limit) != 0) std::_Exit(2);
  std::_Exit(check() ? 0 : 1);
}

}  // namespace tidewater::test

// The address sanitizer takes far more address space than any limit leaves.
#ifdef __SANITIZE_ADDRESS__
#define TIDEWATER_NEED_MEMORY_LIMIT() GTEST_SKIP() << "no memory limit under the sanitizer"
#else
#define TIDEWATER_NEED_MEMORY_LIMIT() static_cast<void>(0)
#endif
