// A store's file on disk: read whole, and told from what it was before.
#pragma once

#include <cstdint>
#include <vector>

namespace tabdll {

// What tells one state of a file from another without reading it.  Times are nanoseconds since
// 1970.
struct FileIdentity {
  std::uint64_t device;
  std::uint64_t node;
  std::int64_t size;
  std::int64_t modified;  // the bytes
  std::int64_t changed;   // anything of the file, and no program can set it back

  bool operator==(const FileIdentity&) const = default;
};

struct FileImage {
  FileIdentity identity;
  std::vector<unsigned char> bytes;
};

// Both throw a StoreError for what cannot be read or is no regular file: a directory, a pipe that
// would keep its reader waiting, a device that has no end.
FileIdentity identify_file(const char* path);
FileImage read_file(const char* path);

}  // namespace tabdll
