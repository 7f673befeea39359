// Files of shift and geoid grids: the list area.par and the records of grids, decoded byte by byte.
#pragma once

#include <array>
#include <bit>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <memory>

namespace tidewater::detail {

struct CloseFile {
  void operator()(std::FILE* file) const { std::fclose(file); }
};
using FileHandle = std::unique_ptr<std::FILE, CloseFile>;

// The longest directory that a control block holds.
inline constexpr std::size_t kMostDirectory = 259;

// A path that was put together of directory, name and extension; nothing is added between them.
class GridPath {
 public:
  GridPath(const char* directory, const char* name, const char* extension);
  const char* text() const { return text_; }

 private:
  char text_[kMostDirectory + 264 + 8];
};

// True for a directory that fits a control block.
bool directory_fits(const char* directory);

// Opens a binary file without a buffer: a window reads few, whole pieces. Null where it cannot be.
FileHandle open_grid(const char* path);

// Opens area.par of a directory. Null where it cannot be opened or read, or the directory is longer
// than a control block holds.
FileHandle open_grid_list(const char* directory);

// The next line of a list, at most size - 1 characters of it, without its newline; false at the
// end. What a longer line holds beyond that is the next line.
bool next_line(std::FILE* list, char* line, int size);

// Copies the first run of characters that are not white space; false where text has none, and token
// stays as it was. The token's buffer is as large as the text's.
bool first_token(const char* text, char* token);

// Copies text that fits, with its terminator; a caller may pass a block its own directory.
void copy_text(const char* from, char* to);

// File positions are 64 bits wide. False where the file cannot be positioned.
bool seek_to(std::FILE* file, std::int64_t offset);

// Bytes in the file, or -1; moves the file position.
std::int64_t length_of(std::FILE* file);

// False where the file ends before so many bytes.  It is only looked at for many: a damaged header
// must not ask for memory that no file fills.
bool may_hold(std::FILE* file, std::int64_t end);

// True when all bytes could be read; what a shorter file has is in bytes then.
bool read_exactly(std::FILE* file, void* bytes, std::size_t count);

// Room for so many bytes, which a file may have told; null where there is none, also where a
// pointer cannot count them.
std::unique_ptr<unsigned char[]> make_buffer(std::int64_t size);

// A file read whole, for the time of one array call.
class FileImage {
 public:
  // Counts a window that was loaded from the file, and reads the file whole once its windows have
  // cost about as much as that: it takes twice the time of the better way at most.  The budget of
  // the call's images is charged.  Where memory is short the file goes on serving.
  void count_load(std::FILE* file, std::int64_t* budget);

  bool whole() const { return bytes_ != nullptr; }

  // The bytes from offset on; null where the file is not in memory or ends before all of them.
  const unsigned char* at(std::int64_t offset, std::int64_t count) const {
    if (!bytes_ || offset < 0 || offset > size_ || count > size_ - offset) return nullptr;
    return bytes_.get() + offset;
  }

 private:
  std::unique_ptr<unsigned char[]> bytes_;
  std::int64_t size_ = 0;
  std::int64_t loads_ = 0;
};

// Bytes of images that one array call may hold.
inline constexpr std::int64_t kImageBudget = std::int64_t{1} << 26;

// The files of a list of grids, kFiles each, for the time of one array call: those of the grid last
// asked for are open, and those in frequent use in memory.
template <std::size_t kFiles>
class CallFiles {
 public:
  using Paths = std::array<GridPath, kFiles>;

  // Opens a grid's files unless they are the open ones; false where one cannot be.
  bool open(std::int32_t grid, const Paths& paths) {
    if (grid == grid_) return true;
    grid_ = -1;
    for (std::size_t k = 0; k < kFiles; ++k) {
      files_[k] = open_grid(paths[k].text());
      if (!files_[k]) return false;
    }
    grid_ = grid;
    return true;
  }

  // A file of the open grid.
  std::FILE* file(std::size_t k) const { return files_[k].get(); }

  const FileImage& image(std::int32_t grid, std::size_t k) const {
    return images_[static_cast<std::size_t>(grid)][k];
  }

  // Counts a window that was loaded from the open grid.
  void count_load() {
    for (std::size_t k = 0; k < kFiles; ++k) {
      images_[static_cast<std::size_t>(grid_)][k].count_load(file(k), &budget_);
    }
  }

 private:
  static constexpr std::size_t kMostGrids = 50;  // of a control block

  std::int32_t grid_ = -1;
  std::array<FileHandle, kFiles> files_;
  std::array<std::array<FileImage, kFiles>, kMostGrids> images_;
  std::int64_t budget_ = kImageBudget;
};

// Files are little-endian on every machine.
inline std::uint32_t decode_u32(const unsigned char* p) {
  return static_cast<std::uint32_t>(p[0]) | static_cast<std::uint32_t>(p[1]) << 8 |
         static_cast<std::uint32_t>(p[2]) << 16 | static_cast<std::uint32_t>(p[3]) << 24;
}
inline std::int32_t decode_i32(const unsigned char* p) {
  return static_cast<std::int32_t>(decode_u32(p));
}
inline float decode_f32(const unsigned char* p) { return std::bit_cast<float>(decode_u32(p)); }
inline double decode_f64(const unsigned char* p) {
  return std::bit_cast<double>(static_cast<std::uint64_t>(decode_u32(p)) |
                               static_cast<std::uint64_t>(decode_u32(p + 4)) << 32);
}

// Header of .las, .los and .geo files; angles in degrees.
struct GridHeader {
  std::int32_t nc, nr, nz;
  float xmin, dx, ymin, dy, angle;

  // A not-a-number equals nothing, itself included.
  bool operator==(const GridHeader&) const = default;
};

// False where the file cannot be opened or is shorter than a header.
bool read_header(const char* directory, const char* name, const char* extension,
                 GridHeader* header);

// Bytes of a record: a label and nc values, 32 bits each.
constexpr std::int64_t record_bytes(std::int32_t nc) { return (std::int64_t{nc} + 1) * 4; }

// A number cut to an integer towards zero. Out of a damaged file it may be anything: what lies
// beyond 32 bits is held there, a not-a-number gives 0.
inline std::int64_t cut(double value) {
  constexpr double kMost = 2147483648.0;
  if (std::fabs(value) <= kMost) return static_cast<std::int64_t>(value);
  if (std::isnan(value)) return 0;
  return static_cast<std::int64_t>(std::copysign(kMost, value));
}

}  // namespace tidewater::detail
