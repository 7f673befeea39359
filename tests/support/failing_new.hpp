// Makes allocations of the library fail on request.
#pragma once

namespace tidewater::test {

// While one of these lives, the allocation of that number (0: the next one) by new (std::nothrow)
// T[] gives null, and every later one too.
class FailingNew {
 public:
  explicit FailingNew(int from = 0);
  ~FailingNew();
  FailingNew(const FailingNew&) = delete;
  FailingNew& operator=(const FailingNew&) = delete;

  // How many were asked for since.
  int asked() const;
};

}  // namespace tidewater::test
