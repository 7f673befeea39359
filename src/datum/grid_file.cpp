// Files of shift and geoid grids: the list area.par and the records of grids.

#include "datum/grid_file.hpp"

#include <algorithm>
#include <cstring>
#include <string_view>
#include <utility>

#ifndef _WIN32
#include <sys/types.h>
#endif

#include "foundation/new_array.hpp"

namespace tidewater::detail {

namespace {

constexpr std::size_t kHeaderBytes = 96;

bool is_space(char c) { return c == ' ' || (c >= '\t' && c <= '\r'); }

}  // namespace

GridPath::GridPath(const char* directory, const char* name, const char* extension) {
  // The lengths are those of the buffers in a control block, which the caller may have filled.
  char* end = text_;
  for (const std::string_view part :
       {std::string_view(directory, strnlen(directory, kMostDirectory)),
        std::string_view(name, strnlen(name, 263)), std::string_view(extension)}) {
    end = std::copy(part.begin(), part.end(), end);
  }
  *end = '\0';
}

bool directory_fits(const char* directory) { return std::strlen(directory) <= kMostDirectory; }

FileHandle open_grid(const char* path) {
  FileHandle file(std::fopen(path, "rb"));
  if (file) std::setvbuf(file.get(), nullptr, _IONBF, 0);
  return file;
}

FileHandle open_grid_list(const char* directory) {
  if (!directory_fits(directory)) return nullptr;
  FileHandle list(std::fopen(GridPath(directory, "area.par", "").text(), "r"));
  if (!list) return nullptr;
  // A folder of that name opens on some systems and refuses to be read.
  const int first = std::fgetc(list.get());
  if (first == EOF) {
    if (std::ferror(list.get())) return nullptr;
  } else {
    std::ungetc(first, list.get());
  }
  return list;
}

bool next_line(std::FILE* list, char* line, int size) {
  if (!std::fgets(line, size, list)) return false;
  line[std::strcspn(line, "\n")] = '\0';
  return true;
}

bool first_token(const char* text, char* token) {
  while (is_space(*text)) ++text;
  if (*text == '\0') return false;
  while (*text != '\0' && !is_space(*text)) *token++ = *text++;
  *token = '\0';
  return true;
}

void copy_text(const char* from, char* to) { std::memmove(to, from, std::strlen(from) + 1); }

bool seek_to(std::FILE* file, std::int64_t offset) {
#ifdef _WIN32
  return _fseeki64(file, offset, SEEK_SET) == 0;
#else
  return fseeko(file, static_cast<off_t>(offset), SEEK_SET) == 0;
#endif
}

std::int64_t length_of(std::FILE* file) {
#ifdef _WIN32
  return _fseeki64(file, 0, SEEK_END) == 0 ? _ftelli64(file) : -1;
#else
  return fseeko(file, 0, SEEK_END) == 0 ? std::int64_t{ftello(file)} : -1;
#endif
}

bool may_hold(std::FILE* file, std::int64_t end) {
  constexpr std::int64_t kSmall = 1 << 24;
  return end <= kSmall || end <= length_of(file);
}

bool read_exactly(std::FILE* file, void* bytes, std::size_t count) {
  return std::fread(bytes, 1, count, file) == count;
}

std::unique_ptr<unsigned char[]> make_buffer(std::int64_t size) {
  return size < 0 ? nullptr : new_array<unsigned char>(static_cast<std::uint64_t>(size));
}

void FileImage::count_load(std::FILE* file, std::int64_t* budget) {
  // A load costs a few reads, the time in which so many bytes are copied.
  constexpr std::int64_t kLoadBytes = 1 << 15;
  constexpr std::int64_t kLeastLoads = 4;
  ++loads_;
  // The length is asked for now and then, not at every load of a file that is too large.
  if (bytes_ || loads_ < kLeastLoads || !std::has_single_bit(static_cast<std::uint64_t>(loads_))) {
    return;
  }
  const std::int64_t size = length_of(file);
  if (size <= 0 || size > *budget || size > loads_ * kLoadBytes) return;
  std::unique_ptr<unsigned char[]> bytes = make_buffer(size);
  if (!bytes || !seek_to(file, 0) ||
      !read_exactly(file, bytes.get(), static_cast<std::size_t>(size)))
    return;
  bytes_ = std::move(bytes);
  size_ = size;
  *budget -= size;
}

bool read_header(const char* directory, const char* name, const char* extension,
                 GridHeader* header) {
  const FileHandle file = open_grid(GridPath(directory, name, extension).text());
  unsigned char bytes[kHeaderBytes];
  if (!file || !read_exactly(file.get(), bytes, sizeof bytes)) return false;
  *header = {.nc = decode_i32(bytes + 64),
             .nr = decode_i32(bytes + 68),
             .nz = decode_i32(bytes + 72),
             .xmin = decode_f32(bytes + 76),
             .dx = decode_f32(bytes + 80),
             .ymin = decode_f32(bytes + 84),
             .dy = decode_f32(bytes + 88),
             .angle = decode_f32(bytes + 92)};
  return true;
}

}  // namespace tidewater::detail
