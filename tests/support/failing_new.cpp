#include "support/failing_new.hpp"

#include <new>

namespace {

constexpr int kNever = -1;
int fail_from = kNever;
int asked_for = 0;

}  // namespace

// The library's own calls come here too: the program's definition goes before the runtime's.
void* operator new[](std::size_t size, const std::nothrow_t&) noexcept {
  if (fail_from != kNever && asked_for++ >= fail_from) return nullptr;
  try {
    return ::operator new[](size);
  } catch (const std::bad_alloc&) {
    return nullptr;
  }
}

namespace tidewater::test {

FailingNew::FailingNew(int from) {
  fail_from = from;
  asked_for = 0;
}

FailingNew::~FailingNew() { fail_from = kNever; }

int FailingNew::asked() const { return asked_for; }

}  // namespace tidewater::test
