#include "store_file.hpp"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>

#include "database.hpp"

namespace tabdll {

namespace {

// Longer than any store that serves its purpose; ours has two hundred thousand bytes.
constexpr std::int64_t kLongestFile = std::int64_t{64} << 20;

class Descriptor {
 public:
  explicit Descriptor(int number) : number_(number) {}
  ~Descriptor() { ::close(number_); }
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;
  int number() const { return number_; }

 private:
  int number_;
};

[[noreturn]] void fail() { throw StoreError(std::strerror(errno)); }

std::int64_t nanoseconds(const timespec& time) {
  return std::int64_t{time.tv_sec} * 1'000'000'000 + time.tv_nsec;
}

FileIdentity identity_of(const struct stat& status) {
  if (!S_ISREG(status.st_mode)) throw StoreError("not a regular file");
#ifdef __APPLE__
  const timespec& modified = status.st_mtimespec;
  const timespec& changed = status.st_ctimespec;
#else
  const timespec& modified = status.st_mtim;
  const timespec& changed = status.st_ctim;
#endif
  return {static_cast<std::uint64_t>(status.st_dev), static_cast<std::uint64_t>(status.st_ino),
          std::int64_t{status.st_size}, nanoseconds(modified), nanoseconds(changed)};
}

FileIdentity identity_of(const Descriptor& file) {
  struct stat status;
  if (::fstat(file.number(), &status) != 0) fail();
  return identity_of(status);
}

}  // namespace

FileIdentity identify_file(const char* path) {
  struct stat status;
  if (::stat(path, &status) != 0) fail();
  return identity_of(status);
}

FileImage read_file(const char* path) {
  // A pipe in the file's place must not keep the call waiting.
  const int number = ::open(path, O_RDONLY | O_CLOEXEC | O_NONBLOCK | O_NOCTTY);
  if (number < 0) fail();
  const Descriptor file(number);
  FileImage image{identity_of(file), {}};
  if (image.identity.size > kLongestFile) throw StoreError("longer than a store may be");
  image.bytes.resize(static_cast<std::size_t>(image.identity.size));
  for (std::size_t done = 0; done < image.bytes.size();) {
    const ssize_t n = ::read(number, image.bytes.data() + done, image.bytes.size() - done);
    if (n < 0 && errno == EINTR) continue;
    if (n < 0) fail();
    if (n == 0) break;
    done += static_cast<std::size_t>(n);
  }
  // Another file that takes this one's name while it is read changes nothing of its bytes.
  const FileIdentity after = identity_of(file);
  if (after.size != image.identity.size || after.modified != image.identity.modified) {
    throw StoreError("changed while it was read");
  }
  return image;
}

}  // namespace tabdll
