#include "faults/injected.hpp"

#include <dlfcn.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <cstdarg>
#include <cstdio>
#include <cstdlib>

namespace {

using tidewater::test::Fault;

struct Plan {
  bool armed = false;
  Fault fault = Fault::kAllocation;
  int nth = 0;
  bool for_good = false;
  int calls = 0;
  int failures = 0;
};

// Of the test's thread alone, and without a constructor: it is read by the first malloc.
thread_local Plan plan;
std::atomic<long> blocks{0};

bool fails(Fault fault) {
  if (!plan.armed || plan.fault != fault) return false;
  const int call = plan.calls++;
  const bool now = plan.nth >= 0 && (plan.for_good ? call >= plan.nth : call == plan.nth);
  if (now) ++plan.failures;
  return now;
}

template <class Function>
Function* next(const char* name) {
  return reinterpret_cast<Function*>(dlsym(RTLD_NEXT, name));
}

}  // namespace

// Seen by the shared libraries.
#pragma GCC visibility push(default)
extern "C" {

void* __libc_malloc(size_t size);
void* __libc_calloc(size_t count, size_t size);
void* __libc_realloc(void* block, size_t size);
void __libc_free(void* block);

void* malloc(size_t size) {
  if (fails(Fault::kAllocation)) {
    errno = ENOMEM;
    return nullptr;
  }
  void* block = __libc_malloc(size);
  if (block) ++blocks;
  return block;
}

void* calloc(size_t count, size_t size) {
  if (fails(Fault::kAllocation)) {
    errno = ENOMEM;
    return nullptr;
  }
  void* block = __libc_calloc(count, size);
  if (block) ++blocks;
  return block;
}

void* realloc(void* old, size_t size) {
  if (fails(Fault::kAllocation)) {
    errno = ENOMEM;
    return nullptr;
  }
  void* block = __libc_realloc(old, size);
  if (!old && block) ++blocks;
  return block;
}

void free(void* block) {
  if (block) --blocks;
  __libc_free(block);
}

FILE* fopen(const char* path, const char* mode) {
  static auto* const real = next<FILE*(const char*, const char*)>("fopen");
  if (fails(Fault::kRead)) {
    errno = EIO;
    return nullptr;
  }
  return real(path, mode);
}

FILE* fopen64(const char* path, const char* mode) {
  static auto* const real = next<FILE*(const char*, const char*)>("fopen64");
  if (fails(Fault::kRead)) {
    errno = EIO;
    return nullptr;
  }
  return real(path, mode);
}

int open(const char* path, int flags, ...) {
  static auto* const real = next<int(const char*, int, ...)>("open");
  va_list rest;
  va_start(rest, flags);
  const int mode = va_arg(rest, int);
  va_end(rest);
  if (fails(Fault::kRead)) {
    errno = EIO;
    return -1;
  }
  return real(path, flags, mode);
}

size_t fread(void* bytes, size_t size, size_t count, FILE* file) {
  static auto* const real = next<size_t(void*, size_t, size_t, FILE*)>("fread");
  if (fails(Fault::kRead)) {
    errno = EIO;
    return 0;
  }
  if (fails(Fault::kShortRead)) return real(bytes, size, count / 2, file);
  return real(bytes, size, count, file);
}

int fseeko(FILE* file, off_t offset, int whence) {
  static auto* const real = next<int(FILE*, off_t, int)>("fseeko");
  if (fails(Fault::kRead)) {
    errno = EIO;
    return -1;
  }
  return real(file, offset, whence);
}

ssize_t read(int file, void* bytes, size_t size) {
  static auto* const real = next<ssize_t(int, void*, size_t)>("read");
  if (fails(Fault::kRead)) {
    errno = EIO;
    return -1;
  }
  if (size > 1 && fails(Fault::kShortRead)) return real(file, bytes, size / 2);
  return real(file, bytes, size);
}

int fstat(int file, struct stat* status) noexcept {
  static auto* const real = next<int(int, struct stat*)>("fstat");
  if (fails(Fault::kRead)) {
    errno = EIO;
    return -1;
  }
  return real(file, status);
}

}  // extern "C"
#pragma GCC visibility pop

namespace tidewater::test {

Injected::Injected(Fault fault, int nth, bool for_good) {
  plan = {true, fault, nth, for_good, 0, 0};
}

Injected::~Injected() { plan.armed = false; }

int Injected::calls() const { return plan.calls; }

int Injected::failures() const { return plan.failures; }

long live_blocks() { return blocks; }

}  // namespace tidewater::test
