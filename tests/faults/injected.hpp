// Allocations and reads that fail on request.  The program's own definitions of the C library's
// functions go before that library's, for the shared libraries too.
#pragma once

namespace tidewater::test {

enum class Fault {
  kAllocation,  // malloc, calloc, realloc and what stands on them give nothing
  kRead,        // fopen, open, fread, fseek, fstat, read fail
  kShortRead,   // fread and read give half of what was asked
};

// While it lives, call number `nth` of this thread (0 is the next) fails, and with `for_good` every
// later one too; a negative number only counts.
class Injected {
 public:
  Injected(Fault fault, int nth, bool for_good);
  ~Injected();
  Injected(const Injected&) = delete;
  Injected& operator=(const Injected&) = delete;

  int calls() const;     // that could have failed
  int failures() const;  // that did
};

// Blocks that are allocated and not freed, of the whole process.
long live_blocks();

}  // namespace tidewater::test
