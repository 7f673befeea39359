// Grid files: finding them, and the forms NTv2, NADCON, .geo and .gtx.

#include <algorithm>
#include <array>
#include <bit>
#include <cmath>
#include <cstdio>
#include <filesystem>
#include <limits>
#include <memory>
#include <new>
#include <numbers>
#include <stdexcept>
#include <unordered_map>
#include <utility>

#include "grids_content.hpp"
#include "tidewater/error.hpp"

namespace tidewater::detail {

namespace {

namespace fs = std::filesystem;

constexpr double kDegree = std::numbers::pi / 180;
constexpr double kArcSecond = kDegree / 3600;
constexpr float kNoValue = std::numeric_limits<float>::quiet_NaN();

// The bytes of a file, read with a check of each place.
class Bytes {
 public:
  Bytes(const std::string& path, std::vector<unsigned char> bytes)
      : path_(path), bytes_(std::move(bytes)) {}

  std::int64_t size() const { return static_cast<std::int64_t>(bytes_.size()); }
  std::span<const unsigned char> all() const { return bytes_; }
  bool begins_with(std::string_view text) const {
    return bytes_.size() >= text.size() &&
           std::equal(text.begin(), text.end(), bytes_.begin(),
                      [](char c, unsigned char b) { return static_cast<unsigned char>(c) == b; });
  }

  // Refuses a file that has not so many bytes from offset on.
  const unsigned char* at(std::int64_t offset, std::int64_t count, const char* what) const {
    if (offset < 0 || count < 0 || offset > size() || count > size() - offset) {
      refuse(path_, "ends in " + std::string(what));
    }
    return bytes_.data() + offset;
  }

 private:
  const std::string& path_;
  std::vector<unsigned char> bytes_;
};

std::uint32_t u32(const unsigned char* p) {
  return static_cast<std::uint32_t>(p[0]) | static_cast<std::uint32_t>(p[1]) << 8 |
         static_cast<std::uint32_t>(p[2]) << 16 | static_cast<std::uint32_t>(p[3]) << 24;
}
std::uint32_t u32_big(const unsigned char* p) {
  return static_cast<std::uint32_t>(p[3]) | static_cast<std::uint32_t>(p[2]) << 8 |
         static_cast<std::uint32_t>(p[1]) << 16 | static_cast<std::uint32_t>(p[0]) << 24;
}
std::int32_t i32(const unsigned char* p) { return static_cast<std::int32_t>(u32(p)); }
float f32(const unsigned char* p) { return std::bit_cast<float>(u32(p)); }
double f64(const unsigned char* p) {
  return std::bit_cast<double>(static_cast<std::uint64_t>(u32(p)) |
                               static_cast<std::uint64_t>(u32(p + 4)) << 32);
}
double f64_big(const unsigned char* p) {
  return std::bit_cast<double>(static_cast<std::uint64_t>(u32_big(p)) << 32 |
                               static_cast<std::uint64_t>(u32_big(p + 4)));
}

std::string text_at(const unsigned char* p, std::size_t length) {
  std::string text(reinterpret_cast<const char*>(p), length);
  text.resize(std::min(text.find('\0'), text.size()));
  text.erase(text.find_last_not_of(' ') + 1);
  return text;
}

// Intervals of a spacing between two bounds; refuses what is no whole number of them.
std::int64_t intervals(const std::string& path, double from, double to, double spacing) {
  constexpr double kMost = 1 << 26;
  const double exact = (to - from) / spacing;
  if (!(spacing > 0) || !(exact >= 1) || !(exact <= kMost) ||
      std::fabs(exact - std::round(exact)) > 1e-2) {
    refuse(path, "has bounds and spacings that make no grid");
  }
  return std::llround(exact);
}

// NTv2: records of 16 bytes, a key and a value of 8 each; 11 for the file, 11 for each sub-grid,
// then its nodes from the south-east, longitudes positive west.
void read_national(const Bytes& file, GridContent* content) {
  constexpr std::int64_t kHeader = 176;
  constexpr std::int32_t kMostSubGrids = 10000;
  const std::string& path = content->path;
  content->form = "NTv2";
  const unsigned char* const head = file.at(0, kHeader, "its header");
  if (u32_big(head + 8) == 11) refuse(path, "is an NTv2 grid in big-endian order");
  if (i32(head + 8) != 11 || i32(head + 24) != 11) {
    refuse(path, "has headers of another length than NTv2's eleven records");
  }
  const std::int32_t count = i32(head + 40);
  if (count < 1 || count > kMostSubGrids) {
    refuse(path, "tells of " + std::to_string(count) + " sub-grids");
  }
  const std::string unit = text_at(head + 56, 8);
  const double to_radians = unit == "MINUTES"   ? kDegree / 60
                            : unit == "DEGREES" ? kDegree
                                                : kArcSecond;
  content->source = text_at(head + 88, 8);
  content->target = text_at(head + 104, 8);
  std::int64_t offset = kHeader;
  for (std::int32_t i = 0; i < count; ++i) {
    const unsigned char* const p = file.at(offset, kHeader, "the header of a sub-grid");
    offset += kHeader;
    Lattice& g = content->lattices.emplace_back();
    g.name = text_at(p + 8, 8);
    g.parent = text_at(p + 24, 8);
    const double south = f64(p + 72), north = f64(p + 88);
    const double east = -f64(p + 104), west = -f64(p + 120);
    g.south = south * to_radians;
    g.west = west * to_radians;
    g.dy = f64(p + 136) * to_radians;
    g.dx = f64(p + 152) * to_radians;
    g.unit = to_radians;
    const std::int64_t rows = intervals(path, south, north, f64(p + 136)) + 1;
    const std::int64_t columns = intervals(path, west, east, f64(p + 152)) + 1;
    const std::int64_t nodes = i32(p + 168);
    if (rows * columns != nodes) {
      refuse(path, "has a sub-grid " + g.name +
                       " whose rows and columns do not make its count of " + std::to_string(nodes) +
                       " nodes");
    }
    set_size(path, columns, rows, 2, (file.size() - offset) / 16, &g);
    const unsigned char* node = file.at(offset, nodes * 16, "the nodes of a sub-grid");
    for (std::int64_t row = 0; row < rows; ++row) {
      for (std::int64_t column = columns - 1; column >= 0; --column, node += 16) {
        float* const value = &g.values[static_cast<std::size_t>(2 * (row * columns + column))];
        value[0] = -f32(node + 4);
        value[1] = f32(node);
      }
    }
    offset += nodes * 16;
  }
}

// The header and the nodes of a .las, .los or .geo file: records of a label and a row's floats,
// the first of them the header.
struct RowFile {
  std::int64_t columns, rows;
  std::array<float, 4> lattice;  // west, spacing, south, spacing; degrees
  std::int64_t record;

  RowFile(const std::string& path, const Bytes& file) {
    const unsigned char* const head = file.at(0, 96, "its header");
    columns = i32(head + 64);
    rows = i32(head + 68);
    for (std::size_t k = 0; k < 4; ++k) lattice[k] = f32(head + 76 + 4 * k);
    if (columns < 2 || rows < 2) refuse(path, "has fewer than two rows or columns");
    record = (columns + 1) * 4;
    if (record < 96) refuse(path, "has so few columns that its header covers its first rows");
    if (rows > file.size() / record - 1) refuse(path, "ends in its rows");
  }

  void shape(const std::string& path, int bands, Lattice* g) const {
    g->west = static_cast<double>(lattice[0]) * kDegree;
    g->dx = static_cast<double>(lattice[1]) * kDegree;
    g->south = static_cast<double>(lattice[2]) * kDegree;
    g->dy = static_cast<double>(lattice[3]) * kDegree;
    set_size(path, columns, rows, bands, columns * rows, g);
  }

  float value(const Bytes& file, std::int64_t row, std::int64_t column) const {
    return f32(file.all().data() + (row + 1) * record + (column + 1) * 4);
  }
};

void read_nadcon(const Bytes& las, const Bytes& los, GridContent* content) {
  constexpr float kMarker = 180;  // what is larger marks a node without data
  const std::string& path = content->path;
  content->form = "NADCON";
  const RowFile latitudes(path, las);
  const RowFile longitudes(path, los);
  if (latitudes.columns != longitudes.columns || latitudes.rows != longitudes.rows ||
      latitudes.lattice != longitudes.lattice) {
    refuse(path, "has a .las and a .los file of different headers");
  }
  Lattice& g = content->lattices.emplace_back();
  g.parent = "NONE";
  g.unit = kArcSecond;
  latitudes.shape(path, 2, &g);
  for (std::int64_t row = 0; row < g.rows; ++row) {
    for (std::int64_t column = 0; column < g.columns; ++column) {
      const float lon = longitudes.value(los, row, column);
      const float lat = latitudes.value(las, row, column);
      const bool none = std::fabs(lon) > kMarker || std::fabs(lat) > kMarker;
      float* const value = &g.values[static_cast<std::size_t>(2 * (row * g.columns + column))];
      value[0] = none ? kNoValue : -lon;  // positive west in the file
      value[1] = none ? kNoValue : lat;
    }
  }
}

void read_geo(const Bytes& file, GridContent* content) {
  content->form = ".geo";
  const RowFile rows(content->path, file);
  Lattice& g = content->lattices.emplace_back();
  g.parent = "NONE";
  rows.shape(content->path, 1, &g);
  for (std::int64_t row = 0; row < g.rows; ++row) {
    for (std::int64_t column = 0; column < g.columns; ++column) {
      g.values[static_cast<std::size_t>(row * g.columns + column)] = rows.value(file, row, column);
    }
  }
}

void read_gtx(const Bytes& file, GridContent* content) {
  constexpr std::int64_t kHeader = 40;
  content->form = "GTX";
  const unsigned char* const head = file.at(0, kHeader, "its header");
  Lattice& g = content->lattices.emplace_back();
  g.parent = "NONE";
  g.south = f64_big(head) * kDegree;
  g.west = f64_big(head + 8) * kDegree;
  g.dy = f64_big(head + 16) * kDegree;
  g.dx = f64_big(head + 24) * kDegree;
  const auto rows = static_cast<std::int32_t>(u32_big(head + 32));
  const auto columns = static_cast<std::int32_t>(u32_big(head + 36));
  set_size(content->path, columns, rows, 1, (file.size() - kHeader) / 4, &g);
  const unsigned char* const first =
      file.at(kHeader, std::int64_t{rows} * columns * 4, "its nodes");
  for (std::size_t k = 0; k < g.values.size(); ++k) {
    const auto value = std::bit_cast<float>(u32_big(first + 4 * k));
    // The form's mark of a node without data, and what no undulation can be.
    g.values[k] = value == -88.8888F || std::fabs(value) > 1000 ? kNoValue : value;
  }
}

// A lattice all round the Earth gets its first column once more behind the last, so that there is
// no seam.
void close_round(int bands, Lattice* g) {
  constexpr double kTurn = 2 * std::numbers::pi;
  if (std::fabs(static_cast<double>(g->columns) * g->dx - kTurn) > 1e-3 * g->dx) return;
  std::vector<float> closed;
  closed.reserve(g->values.size() + static_cast<std::size_t>(g->rows * bands));
  const auto row_values = static_cast<std::ptrdiff_t>(g->columns * bands);
  for (std::int64_t row = 0; row < g->rows; ++row) {
    const auto first = g->values.begin() + static_cast<std::ptrdiff_t>(row) * row_values;
    closed.insert(closed.end(), first, first + row_values);
    closed.insert(closed.end(), first, first + bands);
  }
  g->values = std::move(closed);
  ++g->columns;
  g->round = true;
}

// The deepest of the lattices before and behind that holds another wholly, by extent alone.
std::int32_t smallest_around(const std::vector<Lattice>& all, std::size_t of) {
  const auto contains = [](const Lattice& a, const Lattice& b) {
    const double x = 1e-3 * b.dx, y = 1e-3 * b.dy;
    return b.west >= a.west - x && b.west + b.width() <= a.west + a.width() + x &&
           b.south >= a.south - y && b.south + b.height() <= a.south + a.height() + y &&
           a.width() * a.height() > b.width() * b.height() * (1 + 1e-9);
  };
  std::int32_t best = -1;
  for (std::size_t i = 0; i < all.size(); ++i) {
    if (i == of || !contains(all[i], all[of])) continue;
    if (best < 0 || contains(all[static_cast<std::size_t>(best)], all[i])) {
      best = static_cast<std::int32_t>(i);
    }
  }
  return best;
}

// Two of the same parent may share an edge, not an area.
void refuse_overlaps(const GridContent& content, std::vector<std::int32_t> siblings) {
  const auto lattice = [&](std::int32_t i) -> const Lattice& {
    return content.lattices[static_cast<std::size_t>(i)];
  };
  std::sort(siblings.begin(), siblings.end(),
            [&](std::int32_t a, std::int32_t b) { return lattice(a).west < lattice(b).west; });
  for (std::size_t a = 0; a < siblings.size(); ++a) {
    const Lattice& g = lattice(siblings[a]);
    for (std::size_t b = a + 1; b < siblings.size(); ++b) {
      const Lattice& h = lattice(siblings[b]);
      if (h.west >= g.west + g.width() - 1e-3 * g.dx) break;
      if (h.south < g.south + g.height() - 1e-3 * g.dy &&
          g.south < h.south + h.height() - 1e-3 * h.dy) {
        refuse(content.path, "has sub-grids " + g.name + " and " + h.name + " that overlap");
      }
    }
  }
}

// Makes the tree of the sub-grids by the names that they give their parents, or by their extents
// where they give none.
void plant(GridContent* content) {
  std::unordered_map<std::string, std::int32_t> by_name;
  const std::size_t count = content->lattices.size();
  for (std::size_t i = 0; count > 1 && i < count; ++i) {
    const std::string& name = content->lattices[i].name;
    if (!name.empty() && !by_name.emplace(name, static_cast<std::int32_t>(i)).second) {
      refuse(content->path, "has two sub-grids named " + name);
    }
  }
  for (std::size_t i = 0; i < count; ++i) {
    const std::string& parent = content->lattices[i].parent;
    std::int32_t above = -1;
    if (parent.empty()) {
      above = smallest_around(content->lattices, i);
    } else if (parent != "NONE") {
      const auto found = by_name.find(parent);
      if (found == by_name.end()) {
        refuse(content->path, "has a sub-grid " + content->lattices[i].name + " whose parent " +
                                  parent + " is not there");
      }
      above = found->second;
    }
    (above < 0 ? content->roots : content->lattices[static_cast<std::size_t>(above)].children)
        .push_back(static_cast<std::int32_t>(i));
  }
  // What cannot be reached from the roots runs in a circle.
  std::vector<std::int32_t> reached = content->roots;
  for (std::size_t k = 0; k < reached.size(); ++k) {
    const auto& children = content->lattices[static_cast<std::size_t>(reached[k])].children;
    reached.insert(reached.end(), children.begin(), children.end());
  }
  if (reached.size() != count) refuse(content->path, "has sub-grids that are each other's parents");
  refuse_overlaps(*content, content->roots);
  for (const Lattice& g : content->lattices) refuse_overlaps(*content, g.children);
}

bool is_file(const std::string& path) {
  std::error_code ignored;
  return fs::is_regular_file(path, ignored);
}

Bytes read_file(const std::string& path) {
  constexpr std::uintmax_t kMostBytes = (std::uintmax_t{1} << 31) - 1;
  std::error_code error;
  const std::uintmax_t size = fs::file_size(path, error);
  if (error) throw Error("The grid file " + path + " cannot be read.");
  if (size > kMostBytes) refuse(path, "is larger than 2 GB");
  std::vector<unsigned char> bytes(static_cast<std::size_t>(size));
  // Not by a stream, which would bring the standard library's locales into the browser's package.
  const std::unique_ptr<std::FILE, int (*)(std::FILE*)> file(std::fopen(path.c_str(), "rb"),
                                                             &std::fclose);
  if (!file || std::fread(bytes.data(), 1, bytes.size(), file.get()) != bytes.size()) {
    throw Error("The grid file " + path + " cannot be read.");
  }
  return {path, std::move(bytes)};
}

bool ends_with(const std::string& text, std::string_view end) {
  return text.size() >= end.size() &&
         std::equal(end.begin(), end.end(), text.end() - static_cast<std::ptrdiff_t>(end.size()),
                    [](char a, char b) {
                      return a == (b >= 'A' && b <= 'Z' ? static_cast<char>(b + 32) : b);
                    });
}

// A file, or a pair of .las and .los by the name that they share.
bool is_grid(const std::string& path) { return is_file(path) || is_file(path + ".las"); }

std::string find_grid(const std::string& name, const std::vector<std::string>& folders) {
  const bool as_it_is = folders.empty() || fs::path(name).has_parent_path();
  if (as_it_is) {
    if (is_grid(name)) return name;
    throw Error("There is no grid file " + name + ".");
  }
  std::string looked;
  for (const std::string& folder : folders) {
    std::string path = (fs::path(folder) / name).string();
    if (is_grid(path)) return path;
    looked += (looked.empty() ? "" : ", ") + folder;
  }
  throw Error("There is no grid file " + name + " in " + looked + ".");
}

}  // namespace

void refuse(const std::string& path, const std::string& why) {
  throw Error("The grid file " + path + " " + why + ".");
}

void set_size(const std::string& path, std::int64_t columns, std::int64_t rows, int bands,
              std::int64_t most_nodes, Lattice* g) {
  constexpr double kQuarter = std::numbers::pi / 2;
  constexpr std::int64_t kMostNodes = std::int64_t{1} << 28;
  if (columns < 2 || rows < 2) refuse(path, "has fewer than two rows or columns");
  if (columns > kMostNodes / rows) refuse(path, "tells of more nodes than any grid has");
  if (columns * rows > most_nodes) refuse(path, "ends in its nodes");
  g->columns = columns;
  g->rows = rows;
  // The negated forms refuse not-a-numbers as well.
  if (!(g->dx > 1e-10) || !(g->dy > 1e-10) || !(std::fabs(g->west) <= 8 * kQuarter) ||
      !(g->width() <= 4 * kQuarter * (1 + 1e-6)) || !(g->south >= -kQuarter - g->dy) ||
      !(g->south + g->height() <= kQuarter + g->dy)) {
    refuse(path, "has bounds and spacings that make no grid");
  }
  g->values.resize(static_cast<std::size_t>(columns * rows * bands));
}

GridContent read_grid(const std::string& name, const std::vector<std::string>& folders,
                      GridKind kind) try {
  GridContent content;
  content.path = find_grid(name, folders);
  content.kind = kind;
  const std::string& path = content.path;
  const auto must_be = [&](GridKind expected, const char* form) {
    if (kind != expected) {
      refuse(path, std::string(form) + (kind == GridKind::geoid   ? " holds no undulations"
                                        : kind == GridKind::shift ? " holds no datum shifts"
                                                                  : " holds no translations"));
    }
  };
  const bool las = ends_with(path, ".las"), los = ends_with(path, ".los");
  if (las || los || !is_file(path)) {
    must_be(GridKind::shift, "of NADCON's form");
    const std::string base = las || los ? path.substr(0, path.size() - 4) : path;
    for (const char* extension : {".las", ".los"}) {
      if (!is_file(base + extension))
        throw Error("There is no grid file " + base + extension + ".");
    }
    read_nadcon(read_file(base + ".las"), read_file(base + ".los"), &content);
  } else {
    const Bytes file = read_file(path);
    if (file.begins_with("II*") || file.begins_with("II+") ||
        file.begins_with(std::string_view("MM\0", 3))) {
      content.form = "GeoTIFF";
      read_tiff(file.all(), &content);
    } else if (file.begins_with("NUM_OREC") || ends_with(path, ".gsb")) {
      must_be(GridKind::shift, "of NTv2's form");
      read_national(file, &content);
    } else if (ends_with(path, ".gtx")) {
      must_be(GridKind::geoid, "of the form GTX");
      read_gtx(file, &content);
    } else if (ends_with(path, ".geo")) {
      must_be(GridKind::geoid, "of the form .geo");
      read_geo(file, &content);
    } else {
      refuse(path, "is of no form that is known: NTv2, NADCON, GTX, .geo or GeoTIFF");
    }
  }
  for (Lattice& g : content.lattices) close_round(bands_of(kind), &g);
  plant(&content);
  return content;
} catch (const std::length_error&) {
  throw Error("The grid file " + name + " claims more nodes than memory holds.");
} catch (const std::bad_alloc&) {
  throw Error("There is not enough memory for the grid file " + name + ".");
}

}  // namespace tidewater::detail
