#include "store_cache.hpp"

#include <algorithm>
#include <chrono>
#include <mutex>
#include <vector>

#include "store_file.hpp"

namespace tabdll {

namespace {

struct Entry {
  FileIdentity identity;
  std::shared_ptr<const TableStore> store;
};

// A program has one store, or a few.
constexpr std::size_t kKept = 4;

// A file's times go by the kernel's tick, ten milliseconds at most: a file that was written when it
// was read may have been written again within the same tick, and is read again.
constexpr std::int64_t kSettled = 100'000'000;

std::int64_t now() {
  return std::chrono::duration_cast<std::chrono::nanoseconds>(
             std::chrono::system_clock::now().time_since_epoch())
      .count();
}

class Cache {
 public:
  std::shared_ptr<const TableStore> open(const char* path) {
    const FileIdentity identity = identify_file(path);
    // Held while a file is read, so that many threads that open it at once read it once.
    const std::lock_guard lock(mutex_);
    const auto known = std::find_if(entries_.begin(), entries_.end(),
                                    [&](const Entry& e) { return e.identity == identity; });
    if (known != entries_.end()) {
      std::rotate(entries_.begin(), known, known + 1);  // the latest stands first
      return entries_.front().store;
    }
    return read(path);
  }

 private:
  std::shared_ptr<const TableStore> read(const char* path) {
    const std::int64_t begun = now();
    FileImage image = read_file(path);
    auto store = std::make_shared<const TableStore>(std::move(image.bytes));
    if (std::max(image.identity.modified, image.identity.changed) < begun - kSettled) {
      if (entries_.size() == kKept) entries_.pop_back();
      entries_.insert(entries_.begin(), {image.identity, store});
    }
    return store;
  }

  std::mutex mutex_;
  std::vector<Entry> entries_;
};

}  // namespace

std::shared_ptr<const TableStore> open_store(const char* path) {
  // Never destroyed: threads may still look something up while the process ends.
  static Cache& cache = *new Cache;
  return cache.open(path);
}

}  // namespace tabdll
