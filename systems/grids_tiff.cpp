// Grids as GeoTIFF files: an image a lattice, bands told by their descriptions.

#include "grids_content.hpp"
#include "tidewater/error.hpp"

#ifdef TIDEWATER_HAVE_TIFF

#include <tiffio.h>

#include <algorithm>
#include <cmath>
#include <cstring>
#include <limits>
#include <map>
#include <memory>
#include <numbers>

namespace tidewater::detail {

namespace {

constexpr double kDegree = std::numbers::pi / 180;
constexpr float kNoValue = std::numeric_limits<float>::quiet_NaN();

enum Tag : std::uint32_t {
  kPixelScale = 33550,
  kTiePoint = 33922,
  kTransformation = 34264,
  kGeoKeys = 34735,
  kMetadata = 42112,
  kNoData = 42113
};

// The file in memory, as libtiff reads it.
struct Source {
  std::span<const unsigned char> bytes;
  std::uint64_t position = 0;
};

tmsize_t read_source(thandle_t handle, void* to, tmsize_t count) {
  auto* const s = static_cast<Source*>(handle);
  const std::uint64_t size = s->bytes.size();
  const std::uint64_t left = s->position < size ? size - s->position : 0;
  const auto n = std::min(left, static_cast<std::uint64_t>(std::max<tmsize_t>(count, 0)));
  if (n > 0) std::memcpy(to, s->bytes.data() + s->position, static_cast<std::size_t>(n));
  s->position += n;
  return static_cast<tmsize_t>(n);
}
tmsize_t write_source(thandle_t, void*, tmsize_t) { return 0; }
toff_t seek_source(thandle_t handle, toff_t offset, int whence) {
  auto* const s = static_cast<Source*>(handle);
  s->position = whence == SEEK_SET   ? offset
                : whence == SEEK_CUR ? s->position + offset
                                     : s->bytes.size() + offset;
  return s->position;
}
int close_source(thandle_t) { return 0; }
toff_t size_source(thandle_t handle) { return static_cast<Source*>(handle)->bytes.size(); }
int silent(TIFF*, void*, const char*, const char*, va_list) { return 1; }

struct CloseTiff {
  void operator()(TIFF* tiff) const { TIFFClose(tiff); }
};
using Tiff = std::unique_ptr<TIFF, CloseTiff>;

Tiff open_tiff(Source* source) {
  const std::unique_ptr<TIFFOpenOptions, void (*)(TIFFOpenOptions*)> options(TIFFOpenOptionsAlloc(),
                                                                             TIFFOpenOptionsFree);
  if (!options) return nullptr;
  TIFFOpenOptionsSetErrorHandlerExtR(options.get(), silent, nullptr);
  TIFFOpenOptionsSetMaxSingleMemAlloc(options.get(), tmsize_t{1} << 28);
  TIFFOpenOptionsSetWarningHandlerExtR(options.get(), silent, nullptr);
  return Tiff(TIFFClientOpenExt("grid", "rm", source, read_source, write_source, seek_source,
                                close_source, size_source, nullptr, nullptr, options.get()));
}

// The values of a tag that libtiff does not know by itself; empty where it has another type.
template <class T>
std::span<const T> values_of(TIFF* tiff, std::uint32_t tag, TIFFDataType type) {
  const TIFFField* const field = TIFFFindField(tiff, tag, TIFF_ANY);
  if (!field || TIFFFieldDataType(field) != type || !TIFFFieldPassCount(field)) return {};
  const void* data = nullptr;
  if (TIFFFieldReadCount(field) == TIFF_VARIABLE2) {
    std::uint32_t count = 0;
    if (!TIFFGetField(tiff, tag, &count, &data) || !data) return {};
    return {static_cast<const T*>(data), count};
  }
  std::uint16_t count = 0;
  if (!TIFFGetField(tiff, tag, &count, &data) || !data) return {};
  return {static_cast<const T*>(data), count};
}

// Other users of libtiff in the process may have told it of the tag, with no count beside it.
std::string text_of(TIFF* tiff, std::uint32_t tag) {
  const TIFFField* const field = TIFFFindField(tiff, tag, TIFF_ANY);
  if (field && TIFFFieldDataType(field) == TIFF_ASCII && !TIFFFieldPassCount(field)) {
    const char* text = nullptr;
    return TIFFGetField(tiff, tag, &text) && text ? text : "";
  }
  const auto text = values_of<char>(tiff, tag, TIFF_ASCII);
  return {text.begin(), std::find(text.begin(), text.end(), '\0')};
}

// The items of the metadata, a small XML text: <Item name="..." sample="0" role="...">text</Item>.
// Items of the whole image are under sample -1.
using Metadata = std::map<std::pair<int, std::string>, std::string>;

Metadata parse_metadata(const std::string& xml) {
  Metadata items;
  std::size_t at = 0;
  while ((at = xml.find("<Item ", at)) != std::string::npos) {
    const std::size_t close = xml.find('>', at);
    const std::size_t end = close == std::string::npos ? close : xml.find("</Item>", close);
    if (end == std::string::npos) break;
    const std::string head = xml.substr(at, close - at);
    const auto attribute = [&head](const std::string& name) -> std::string {
      const std::size_t from = head.find(" " + name + "=\"");
      if (from == std::string::npos) return {};
      const std::size_t first = from + name.size() + 3;
      const std::size_t last = head.find('"', first);
      return last == std::string::npos ? std::string() : head.substr(first, last - first);
    };
    const std::string sample = attribute("sample");
    const int band = sample.size() == 1 && sample[0] >= '0' && sample[0] <= '9' ? sample[0] - '0'
                     : sample.empty()                                           ? -1
                                                                                : -2;
    const std::string role = attribute("role");
    items[{band, role.empty() ? attribute("name") : role}] = xml.substr(close + 1, end - close - 1);
    at = end;
  }
  return items;
}

std::string item(const Metadata& metadata, int band, const std::string& name) {
  const auto found = metadata.find({band, name});
  return found == metadata.end() ? std::string() : found->second;
}

double number(const std::string& text, double otherwise) {
  char* end = nullptr;
  const double value = std::strtod(text.c_str(), &end);
  return end == text.c_str() ? otherwise : value;
}

// How the samples of an image are laid out.
struct Image {
  std::uint32_t width = 0, height = 0;
  std::uint16_t samples = 1, bits = 0, format = SAMPLEFORMAT_UINT, planar = PLANARCONFIG_CONTIG;
  bool tiled = false;
  std::uint32_t tile_width = 0, tile_height = 0;

  std::size_t sample_bytes() const { return bits / 8U; }
};

float decode_sample(const unsigned char* p, const Image& image) {
  const auto as = [p]<class T>(T value) {
    std::memcpy(&value, p, sizeof value);
    return static_cast<float>(value);
  };
  switch (image.format) {
    case SAMPLEFORMAT_IEEEFP:
      return image.bits == 32 ? as(0.0F) : as(0.0);
    case SAMPLEFORMAT_INT:
      return image.bits == 16 ? as(std::int16_t{}) : as(std::int32_t{});
    default:
      return image.bits == 16 ? as(std::uint16_t{}) : as(std::uint32_t{});
  }
}

Image read_layout(TIFF* tiff, const std::string& path) {
  Image image;
  TIFFGetField(tiff, TIFFTAG_IMAGEWIDTH, &image.width);
  TIFFGetField(tiff, TIFFTAG_IMAGELENGTH, &image.height);
  TIFFGetFieldDefaulted(tiff, TIFFTAG_SAMPLESPERPIXEL, &image.samples);
  TIFFGetFieldDefaulted(tiff, TIFFTAG_BITSPERSAMPLE, &image.bits);
  TIFFGetFieldDefaulted(tiff, TIFFTAG_SAMPLEFORMAT, &image.format);
  TIFFGetFieldDefaulted(tiff, TIFFTAG_PLANARCONFIG, &image.planar);
  image.tiled = TIFFIsTiled(tiff) != 0;
  const bool real = image.format == SAMPLEFORMAT_IEEEFP;
  const bool whole = image.format == SAMPLEFORMAT_INT || image.format == SAMPLEFORMAT_UINT;
  if (!((real && (image.bits == 32 || image.bits == 64)) ||
        (whole && (image.bits == 16 || image.bits == 32)))) {
    refuse(path, "has samples that are no floats or integers of a usual size");
  }
  if (image.samples < 1 || image.samples > 16) refuse(path, "has bands past counting");
  if (image.tiled) {
    TIFFGetField(tiff, TIFFTAG_TILEWIDTH, &image.tile_width);
    TIFFGetField(tiff, TIFFTAG_TILELENGTH, &image.tile_height);
    if (image.tile_width == 0 || image.tile_height == 0) refuse(path, "has tiles of no size");
  }
  return image;
}

// Calls put(row, column, value) for every sample of a band; rows as the file has them.
template <class Put>
void read_band(TIFF* tiff, const Image& image, int band, const std::string& path, Put put) {
  constexpr tmsize_t kMostBuffer = tmsize_t{1} << 28;
  const bool together = image.planar == PLANARCONFIG_CONTIG;
  const std::size_t step = image.sample_bytes() * (together ? image.samples : 1U);
  const std::size_t first = together ? static_cast<std::size_t>(band) * image.sample_bytes() : 0;
  const auto plane = static_cast<std::uint16_t>(together ? 0 : band);
  const std::uint32_t piece_width = image.tiled ? image.tile_width : image.width;
  const std::uint32_t piece_height = image.tiled ? image.tile_height : 1;
  const tmsize_t size = image.tiled ? TIFFTileSize(tiff) : TIFFScanlineSize(tiff);
  if (size <= 0 || size > kMostBuffer ||
      static_cast<std::size_t>(size) / step / piece_width < piece_height) {
    refuse(path, "has tiles or rows of a size that cannot be");
  }
  std::vector<unsigned char> buffer(static_cast<std::size_t>(size));
  for (std::uint64_t top = 0; top < image.height; top += piece_height) {
    for (std::uint64_t left = 0; left < image.width; left += piece_width) {
      const auto row = static_cast<std::uint32_t>(top), column = static_cast<std::uint32_t>(left);
      const bool read = image.tiled
                            ? TIFFReadTile(tiff, buffer.data(), column, row, 0, plane) >= size
                            : TIFFReadScanline(tiff, buffer.data(), row, plane) == 1;
      if (!read) refuse(path, "is damaged or ends in its nodes");
      const std::uint32_t rows = std::min(piece_height, image.height - row);
      const std::uint32_t columns = std::min(piece_width, image.width - column);
      for (std::uint32_t r = 0; r < rows; ++r) {
        for (std::uint32_t c = 0; c < columns; ++c) {
          const std::size_t at = (std::size_t{r} * piece_width + c) * step + first;
          put(row + r, column + c, decode_sample(buffer.data() + at, image));
        }
      }
    }
  }
}

// Where the image's samples lie; true where its rows run from the south.
bool place(TIFF* tiff, const Image& image, const std::string& path, Lattice* g) {
  double west = 0, north = 0, dx = 0, dy = 0;  // of the first sample; dy positive southwards
  const auto scale = values_of<double>(tiff, kPixelScale, TIFF_DOUBLE);
  const auto tie = values_of<double>(tiff, kTiePoint, TIFF_DOUBLE);
  const auto matrix = values_of<double>(tiff, kTransformation, TIFF_DOUBLE);
  if (scale.size() >= 2 && tie.size() >= 6) {
    dx = scale[0];
    dy = scale[1];
    west = tie[3] - tie[0] * dx;
    north = tie[4] + tie[1] * dy;
  } else if (matrix.size() == 16 && matrix[1] == 0 && matrix[4] == 0) {
    dx = matrix[0];
    dy = -matrix[5];
    west = matrix[3];
    north = matrix[7];
  } else {
    refuse(path, "does not tell where its nodes lie");
  }
  // Of areas, as which images are taken without a word, the samples are in the middle.
  bool areas = true;
  const auto keys = values_of<std::uint16_t>(tiff, kGeoKeys, TIFF_SHORT);
  for (std::size_t k = 4; k + 3 < keys.size(); k += 4) {
    if (keys[k] == 1025 && keys[k + 1] == 0) areas = keys[k + 3] != 2;
  }
  if (areas) {
    west += dx / 2;
    north -= dy / 2;
  }
  const bool from_south = dy < 0;
  const double south = from_south ? north : north - (image.height - 1.0) * dy;
  g->west = west * kDegree;
  g->south = south * kDegree;
  g->dx = dx * kDegree;
  g->dy = std::fabs(dy) * kDegree;
  return from_south;
}

// Radians or metres in a unit as bands name it.
double unit_of(const std::string& name, GridKind kind, const std::string& path) {
  if (kind != GridKind::shift) {
    if (name.empty() || name == "metre" || name == "meter" || name == "m") return 1;
    refuse(path, "has figures in the unit " + name + ", not in metres");
  }
  if (name.empty() || name == "arc-second" || name == "arc-seconds per year") return kDegree / 3600;
  if (name == "degree") return kDegree;
  if (name == "radian") return 1;
  refuse(path, "has shifts in the unit " + name + ", not in arc-seconds, degrees or radians");
}

void read_image(TIFF* tiff, std::int64_t file_size, bool first, GridContent* content) {
  const std::string& path = content->path;
  const Image image = read_layout(tiff, path);
  const Metadata metadata = parse_metadata(text_of(tiff, kMetadata));
  const std::string no_data_text = text_of(tiff, kNoData);
  const auto no_data =
      static_cast<float>(number(no_data_text, std::numeric_limits<double>::quiet_NaN()));
  const auto band_of = [&](const char* description) {
    for (int band = 0; band < image.samples; ++band) {
      if (item(metadata, band, "description") == description) return band;
    }
    return -1;
  };
  int bands[3] = {-1, -1, -1};  // as the lattice has them
  const int band_count = bands_of(content->kind);
  if (content->kind == GridKind::geocentric) {
    bands[0] = band_of("x_translation");
    bands[1] = band_of("y_translation");
    bands[2] = band_of("z_translation");
    if (bands[0] < 0 || bands[1] < 0 || bands[2] < 0) {
      refuse(path, "has no bands of geocentric translations");
    }
  } else if (content->kind == GridKind::shift) {
    bands[0] = band_of("longitude_offset");
    bands[1] = band_of("latitude_offset");
    const bool described = !item(metadata, 0, "description").empty();
    if (!described && image.samples >= 2 && band_of("geoid_undulation") < 0) {
      bands[0] = 1;
      bands[1] = 0;
    }
    if (bands[0] < 0 || bands[1] < 0) refuse(path, "has no bands of datum shifts");
  } else {
    bands[0] = band_of("geoid_undulation");
    const std::string description = item(metadata, 0, "description");
    if (bands[0] < 0 && image.samples == 1 &&
        (description.empty() || description == "vertical_offset")) {
      bands[0] = 0;
    }
    if (bands[0] < 0) refuse(path, "has no band of undulations");
  }

  Lattice& g = content->lattices.emplace_back();
  g.name = item(metadata, -1, "grid_name");
  g.parent = item(metadata, -1, "parent_grid_name");
  if (first && g.parent.empty()) g.parent = "NONE";
  g.unit = unit_of(item(metadata, bands[0], "unittype"), content->kind, path);
  const bool from_south = place(tiff, image, path, &g);
  // No compression makes more than so many bytes of one; a damaged header must not ask for more.
  constexpr std::int64_t kMostExpansion = 1100;
  const auto node_bytes = static_cast<std::int64_t>(image.sample_bytes()) * band_count;
  set_size(path, image.width, image.height, band_count, file_size * kMostExpansion / node_bytes,
           &g);
  for (int k = 0; k < band_count; ++k) {
    const int band = bands[k];
    if (unit_of(item(metadata, band, "unittype"), content->kind, path) != g.unit) {
      refuse(path, "has bands of different units");
    }
    double scale = number(item(metadata, band, "scale"), 1);
    double offset = number(item(metadata, band, "offset"), 0);
    const bool west = content->kind == GridKind::shift && k == 0 &&
                      item(metadata, band, "positive_value") == "west";
    if (west) {
      scale = -scale;
      offset = -offset;
    }
    const bool plain = scale == 1 && offset == 0;
    read_band(tiff, image, band, path, [&](std::uint32_t row, std::uint32_t column, float value) {
      const std::int64_t r = from_south ? row : std::int64_t{image.height} - 1 - row;
      const auto at = static_cast<std::size_t>((r * g.columns + column) * band_count + k);
      if (value == no_data) {
        g.values[at] = kNoValue;
      } else {
        g.values[at] =
            plain ? value : static_cast<float>(static_cast<double>(value) * scale + offset);
      }
    });
  }
}

}  // namespace

void read_tiff(std::span<const unsigned char> file, GridContent* content) {
  constexpr int kMostImages = 1000;
  Source source{file};
  const Tiff tiff = open_tiff(&source);
  if (!tiff) refuse(content->path, "is damaged: its TIFF header cannot be read");
  int images = 0;
  do {
    if (++images > kMostImages) refuse(content->path, "has images past counting");
    std::uint32_t kind = 0;
    TIFFGetField(tiff.get(), TIFFTAG_SUBFILETYPE, &kind);
    if ((kind & (FILETYPE_REDUCEDIMAGE | FILETYPE_MASK)) != 0) continue;  // an overview
    read_image(tiff.get(), static_cast<std::int64_t>(file.size()), images == 1, content);
  } while (TIFFReadDirectory(tiff.get()) == 1);
  if (content->lattices.empty()) refuse(content->path, "has no image at full size");
}

}  // namespace tidewater::detail

#else

namespace tidewater::detail {

void read_tiff(std::span<const unsigned char>, GridContent* content) {
  refuse(content->path, "is a GeoTIFF, which this library was built without");
}

}  // namespace tidewater::detail

#endif
