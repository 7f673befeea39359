// Grids as objects: against PROJ on real grids and on files made from them, and files that lie.

#include "tidewater/grids.hpp"

#include <gtest/gtest.h>

#include <bit>
#include <cmath>
#include <filesystem>
#include <functional>
#include <limits>
#include <memory>
#include <optional>
#include <random>
#include <thread>

#include "support/data.hpp"
#include "support/grids.hpp"
#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/datum.h"
#include "tidewater/transformation.hpp"

#ifdef TIDEWATER_HAVE_TIFF
#include <tiffio.h>
#endif

using namespace tidewater;
using namespace tidewater::test;
namespace fs = std::filesystem;

namespace {

using tidewater::GeoidGrid;  // not the C structure of that name

constexpr double kDegree = kPi / 180;
[[maybe_unused]] constexpr double kTenthOfMillimetre = 1e-4 / 6378137 / kDegree;  // degrees

// What is refused says why.
template <class Action>
void expect_refused(const Action& action, const std::string& part) {
  try {
    action();
    ADD_FAILURE() << "taken, where " << part;
  } catch (const Error& error) {
    EXPECT_NE(std::string(error.what()).find(part), std::string::npos) << error.what();
  }
}

struct Box {
  double west, south, east, north;
};

std::vector<Point> points_in(const Box& box, std::size_t count) {
  std::mt19937 random(11);
  std::uniform_real_distribution<double> lon(box.west, box.east), lat(box.south, box.north);
  std::vector<Point> points(count);
  for (Point& p : points) p = {lon(random), lat(random), 12};
  return points;
}

Coordinates<double> view(std::vector<Point>* points) {
  return {&points->front().x, &points->front().y, &points->front().z, 3};
}
Coordinates<const double> view(const std::vector<Point>& points) {
  return {&points.front().x, &points.front().y, &points.front().z, 3};
}

[[maybe_unused]] double apart(double a, double b) { return std::fabs(std::remainder(a - b, 360)); }

#ifdef TIDEWATER_HAVE_PROJ
// Both ways within a tenth of a millimetre of the peer, wherever it has a figure; tells the worst
// difference in metres.
double expect_as_peer(const ShiftGrid& grid, const std::string& peer_grid, const Box& box,
                      std::size_t count = 3000) {
  const ProjPeer peer("+proj=hgridshift +grids=" + peer_grid);
  if (!peer.ok()) {
    ADD_FAILURE() << "PROJ does not read " << peer_grid;
    return 0;
  }
  const std::vector<Point> in = points_in(box, count);
  std::vector<Point> forward(count), inverse(count);
  grid.forward(count, view(in), view(&forward));
  std::vector<TWstatus> words(count);
  std::vector<int> passes(count);
  grid.inverse(count, view(in), view(&inverse), words.data(), passes.data());
  std::size_t compared = 0;
  double worst = 0;
  for (std::size_t i = 0; i < count; ++i) {
    const CoordinateTriple p = {in[i].x * kDegree, in[i].y * kDegree, 12};
    for (const bool back : {false, true}) {
      const CoordinateTriple theirs = back ? peer.inverse(p) : peer.forward(p);
      const Point& ours = back ? inverse[i] : forward[i];
      if (!std::isfinite(theirs.x)) continue;
      ++compared;
      const double d =
          std::max(apart(ours.x, theirs.x / kDegree), std::fabs(ours.y - theirs.y / kDegree));
      EXPECT_LT(d, kTenthOfMillimetre) << in[i].x << " " << in[i].y << (back ? " back" : "");
      worst = std::max(worst, d);
      if (back) {
        EXPECT_EQ(words[i], TW_SUCCESS);
        EXPECT_GE(passes[i], 1);
        EXPECT_LE(passes[i], 5);
      }
    }
  }
  EXPECT_GT(compared, count);
  return worst * kDegree * 6378137;
}
#endif

[[maybe_unused]] const struct {
  const char* name;
  Box box;
} kRealGrids[] = {{"ntf_r93.gsb", {-5.49, 41.01, 9.99, 51.99}},
                  {"BETA2007.gsb", {5.51, 47.01, 15.66, 55.29}},
                  {"CHENYX06.gsb", {5.56, 45.48, 11.04, 48.06}},
                  {"nzgd2kgrid0005.gsb", {166.01, -47.99, 179.99, -34.01}}};
const std::string kProjData = proj_data().string() + "/";

TEST(ShiftGrids, RealNationalGridsAgainstProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  for (const auto& [name, box] : kRealGrids) {
    if (!fs::exists(kProjData + name)) continue;
    SCOPED_TRACE(name);
    const double worst = expect_as_peer(ShiftGrid(name, {"/nowhere", kProjData}), name, box);
    RecordProperty(name, std::to_string(worst));
    EXPECT_LT(worst, 2e-5);  // metres; what the docstring says
  }
#endif
}

TEST(ShiftGrids, SubGridsAgainstProj) {
  TIDEWATER_NEED_SHARED_DATA();
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const std::string path = (shared_data() / "ntv2" / "canada.gsb").string();
  const ShiftGrid grid(path);
  EXPECT_GT(grid.bounds().size(), 0U);
  for (const GridBounds& b : grid.bounds()) {
    expect_as_peer(grid, path, {b.west + 0.01, b.south + 0.01, b.east - 0.01, b.north - 0.01});
  }
  EXPECT_NE(grid.describe().find("sub-grids"), std::string::npos) << grid.describe();
#endif
}

// A grid of our own with a child; longitudes positive west, as in the file.
SubGrid plane(const char* name, const char* parent, double south, double north, double east,
              double west, double inc, float add) {
  const auto value = [add](int r, int c) {
    return add + static_cast<float>(r) / 8 - static_cast<float>(c) / 4;
  };
  return {name,         parent,      south * 3600,
          north * 3600, east * 3600, west * 3600,
          inc * 3600,   value,       [value](int r, int c) { return -2 * value(r, c); }};
}

TEST(ShiftGrids, ShiftsHaveTheirSignsEastAndWest) {
  const ScratchFolder folder;
  // From 10 west to 20 east: across Greenwich.
  folder.write("g.gsb", GsbFile{{plane("A", "NONE", 40, 50, -20, 10, 1, 1),
                                 plane("B", "A", 44, 46, -4, -2, 0.5, 100)}}
                            .bytes());
  const ShiftGrid grid("g.gsb", {folder.directory()});
  EXPECT_EQ(grid.describe(), "NTv2 grid of 2 sub-grids, OLD to NEW");
  ASSERT_EQ(grid.bounds().size(), 1U);
  EXPECT_NEAR(grid.bounds()[0].west, -10, 1e-12);
  EXPECT_NEAR(grid.bounds()[0].east, 20, 1e-12);
  const auto expect = [&](double lon, double lat, double seconds, bool and_back = true) {
    for (const double turn : {-360.0, 0.0, 360.0, 720.0}) {
      const Point p = grid.forward(Point{lon + turn, lat, 7});
      EXPECT_NEAR((p.y - lat) * 3600, seconds, 1e-8) << lon << " " << lat;
      EXPECT_NEAR((p.x - lon - turn) * 3600, 2 * seconds, 1e-8) << lon << " " << lat;
      EXPECT_EQ(p.z, 7);
      if (!and_back) continue;
      const Point back = grid.inverse(p);
      EXPECT_NEAR(back.x, lon + turn, 1e-10);
      EXPECT_NEAR(back.y, lat, 1e-10);
    }
  };
  // Columns count from 20 east, westwards: 1 + row/8 - column/4, positive west in the longitude.
  expect(15.5, 42.25, 1 + 2.25 / 8 - 4.5 / 4);
  expect(-9.75, 49.5, 1 + 9.5 / 8 - 29.75 / 4);
  expect(20, 40, 1);
  expect(-10, 50, 1 + 10.0 / 8 - 30.0 / 4);
  expect(3.25, 44.75, 100 + 1.5 / 8 - 1.5 / 4);  // in the child
  // The shift jumps at the child's edge: two points go where this one goes.
  expect(2, 46, 100 + 4.0 / 8 - 4.0 / 4, false);  // on its corner
  TWstatus word = 0;
  const double nan = std::numeric_limits<double>::quiet_NaN();
  for (const auto& [x, y] : {std::pair{21.0, 45.0},
                             {-11.0, 45.0},
                             {0.0, 39.9},
                             {0.0, 50.1},
                             {nan, 45.0},
                             {0.0, nan},
                             {HUGE_VAL, 45.0},
                             {1e300, 1e300}}) {
    std::vector<Point> p = {{x, y, 3}};
    for (const bool back : {false, true}) {
      const Summary s = back ? grid.inverse(1, view(std::as_const(p)), view(&p), &word)
                             : grid.forward(1, view(std::as_const(p)), view(&p), &word);
      EXPECT_EQ(s.failed, 1U);
      EXPECT_EQ(s.word, TW_I_OUTSIDE_CNT);
      EXPECT_EQ(word, TW_I_OUTSIDE_CNT);
      EXPECT_TRUE(std::isnan(p[0].x) && std::isnan(p[0].y) && std::isnan(p[0].z));
    }
  }
}

TEST(ShiftGrids, PointsDoNotDisturbEachOther) {
  const ScratchFolder folder;
  folder.write("g.gsb", GsbFile{{plane("A", "NONE", 40, 50, 10, 20, 1, 1)}}.bytes());
  const ShiftGrid grid((folder.path() / "g.gsb").string());
  std::vector<Point> p = {{-15, 45, 1}, {15, 45, 2}, {-12, 41, 3}};
  const std::vector<Point> in = p;
  std::vector<TWstatus> words(3);
  const Summary s = grid.forward(3, view(std::as_const(p)), view(&p), words.data());  // in place
  EXPECT_EQ(s.failed, 1U);
  EXPECT_EQ(words, (std::vector<TWstatus>{TW_SUCCESS, TW_I_OUTSIDE_CNT, TW_SUCCESS}));
  EXPECT_EQ(p[2].x, grid.forward(in[2]).x);
  EXPECT_EQ(p[2].z, 3);
  EXPECT_EQ(grid.forward(0, view(in), view(&p)).failed, 0U);
  // The file may go: the grid is in memory.  Copies share it, also between threads.
  fs::remove(folder.path() / "g.gsb");
  const ShiftGrid copy = grid;
  std::vector<std::thread> threads;
  std::vector<double> results(4);
  for (double& result : results) {
    threads.emplace_back([&copy, &in, &result] {
      for (int k = 0; k < 1000; ++k) result = copy.inverse(in[0]).x;
    });
  }
  for (std::thread& t : threads) t.join();
  for (const double r : results) EXPECT_EQ(r, grid.inverse(in[0]).x);
}

TEST(ShiftGrids, NadconPairsAgainstTheArrayFunctions) {
  TIDEWATER_NEED_SHARED_DATA();
  const std::string folder = (shared_data() / "nadcon").string() + "/";
  NadconControl control = {};
  TWstatus status = 0;
  TWnadcon_c(folder.c_str(), &control, &status);
  ASSERT_EQ(status, TW_SUCCESS);
  for (const char* name : {"conus", "conus.las", "conus.los"}) {
    const ShiftGrid grid(name, {folder});
    for (const Point& p : points_in({-120, 28, -72, 47}, 300)) {
      const CoordinateTriple in = {p.x * kDegree, p.y * kDegree, 0};
      CoordinateTriple out = {};
      TWnadcon_f(1, &in, &control, &out, &status);
      const Point ours = grid.forward(p);
      EXPECT_NEAR(ours.x, out.x / kDegree, 1e-11);
      EXPECT_NEAR(ours.y, out.y / kDegree, 1e-11);
    }
  }
}

TEST(GeoidGrids, WorldGridAgainstProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  if (!fs::exists(kProjData + "egm96_15.gtx")) GTEST_SKIP() << "egm96_15.gtx is not installed";
  const GeoidGrid grid("egm96_15.gtx", {kProjData});
  const ProjPeer peer("+proj=vgridshift +grids=egm96_15.gtx +multiplier=1");
  std::vector<Point> in = points_in({-180, -90, 180, 90}, 5000);
  for (const double lon : {-180.0, 179.76, 179.9, 179.999, 180.0, -179.99, 0.0, 540.0}) {
    for (const double lat : {-90.0, -45.1, 0.0, 60.0, 90.0}) in.push_back({lon, lat, 5});
  }
  std::vector<Point> up(in.size()), down(in.size());
  EXPECT_TRUE(grid.forward(in.size(), view(in), view(&up)));
  EXPECT_TRUE(grid.inverse(in.size(), view(in), view(&down)));
  double worst = 0;
  for (std::size_t i = 0; i < in.size(); ++i) {
    const double n = peer.forward({std::remainder(in[i].x, 360) * kDegree, in[i].y * kDegree, 0}).z;
    worst = std::max(worst, std::fabs(up[i].z - in[i].z - n));
    EXPECT_NEAR(up[i].z, in[i].z + n, 1e-6) << in[i].x << " " << in[i].y;
    EXPECT_NEAR(down[i].z, in[i].z - n, 1e-6);
    EXPECT_EQ(up[i].x, in[i].x);
  }
  EXPECT_LT(worst, 1e-6);
  EXPECT_EQ(grid.describe(), "GTX grid of 721 rows and 1440 columns");
#endif
}

TEST(GeoidGrids, BiquadraticReturnsAParabola) {
  // Columns and rows of a degree; the node values are a form of the second order, which the nine
  // nodes give back exactly.
  const ScratchFolder folder;
  const auto value = [](double r, double c) {
    return 3 + 0.25 * r - 0.5 * c + 0.125 * r * r - 0.0625 * c * c;
  };
  folder.write("g.geo", GridFile{-20, 40, 24, 8,
                                 [&](int r, int c) { return static_cast<float>(value(r, c)); }}
                            .bytes());
  const std::string path = (folder.path() / "g.geo").string();
  const GeoidGrid grid(path, {}, GeoidGrid::Interpolation::biquadratic);
  const GeoidGrid linear(path);
  for (double r = 0; r <= 7; r += 0.125) {
    for (double c = 0; c <= 23; c += 0.125) {
      EXPECT_NEAR(grid.undulation(-20 + c, 40 + r), value(r, c), 1e-9) << r << " " << c;
    }
  }
  EXPECT_NEAR(linear.undulation(-19.5, 40), (value(0, 0) + value(0, 1)) / 2, 1e-9);
  EXPECT_TRUE(std::isnan(grid.undulation(-20.1, 42)));
}

TEST(GeoidGrids, RealGeoFilesAgainstTheArrayFunctions) {
  TIDEWATER_NEED_SHARED_DATA();
  const std::string folder = (shared_data() / "geoid").string() + "/";
  GeoidControl control = {};
  TWstatus status = 0;
  TWgeo90_c(folder.c_str(), &control, &status);
  ASSERT_EQ(status, TW_SUCCESS);
  const GeoidGrid grid("namer96.geo", {folder}, GeoidGrid::Interpolation::biquadratic);
  const GridBounds b = grid.bounds().front();
  for (const Point& p : points_in({b.west + 1, b.south + 1, b.east - 1, b.north - 1}, 500)) {
    double n = 0;
    TWget_geo90(p.x * kDegree, p.y * kDegree, 0, &control, &n, &status);
    ASSERT_EQ(status, TW_SUCCESS);
    EXPECT_NEAR(grid.undulation(p.x, p.y), n, 1e-4);  // those work in single precision
  }
}

std::string big(std::string bytes, std::size_t width) {
  for (std::size_t k = 0; k < bytes.size(); k += width) {
    std::reverse(bytes.begin() + static_cast<std::ptrdiff_t>(k),
                 bytes.begin() + static_cast<std::ptrdiff_t>(k + width));
  }
  return bytes;
}

std::string gtx(double south, double west, double dy, double dx, std::int32_t rows,
                std::int32_t columns, const std::vector<float>& values) {
  std::string doubles, counts, floats;
  for (const double v : {south, west, dy, dx}) append_f64(doubles, v);
  for (const std::int32_t n : {rows, columns}) append_i32(counts, n);
  for (const float v : values) append_f32(floats, v);
  return big(doubles, 8) + big(counts, 4) + big(floats, 4);
}

TEST(GeoidGrids, NodesWithoutData) {
  const ScratchFolder folder;
  folder.write("g.gtx", gtx(10, 350, 1, 1, 3, 3, {1, 2, 3, 4, -88.8888F, 6, 7, 8, 9}));
  folder.write("h.gtx", gtx(10, 350, 1, 1, 3, 3, {1, 2, 3, 4, 5, 6, 7, 8, 9}));
  const GeoidGrid whole("h.gtx", {folder.directory()}), holed("g.gtx", {folder.directory()});
  EXPECT_NEAR(whole.undulation(-9.5, 10.5), 3, 1e-12);
  EXPECT_NEAR(whole.undulation(350.5, 10.5), 3, 1e-12);
  EXPECT_TRUE(std::isnan(holed.undulation(-9.5, 10.5)));
  std::vector<Point> p = {{-9.5, 10.5, 1}};
  TWstatus word = 0;
  EXPECT_EQ(holed.forward(1, view(std::as_const(p)), view(&p), &word).word, TW_I_OUTSIDE_GEOID);
  EXPECT_EQ(word, TW_I_OUTSIDE_GEOID);
}

// The sentence with which a file is refused; empty where it is taken.
template <class Grid>
std::string refusal(const std::string& path) {
  try {
    const Grid grid(path);
    return {};
  } catch (const Error& e) {
    return e.what();
  }
}

class BadGrids : public ::testing::Test {
 protected:
  template <class Grid = ShiftGrid>
  void expect_refused(const std::string& name, const std::string& bytes, const std::string& part) {
    folder.write(name, bytes);
    const std::string path = (folder.path() / name).string();
    const std::string sentence = refusal<Grid>(path);
    EXPECT_NE(sentence.find(path), std::string::npos) << sentence;
    EXPECT_NE(sentence.find(part), std::string::npos) << sentence;
  }
  ScratchFolder folder;
};

TEST_F(BadGrids, NamesThatAreNotThere) {
  EXPECT_EQ(refusal<ShiftGrid>("/nowhere/x.gsb"), "There is no grid file /nowhere/x.gsb.");
  try {
    const ShiftGrid grid("x.gsb", {"/a", "/b"});
    FAIL();
  } catch (const Error& e) {
    EXPECT_STREQ(e.what(), "There is no grid file x.gsb in /a, /b.");
  }
  EXPECT_NE(refusal<ShiftGrid>(folder.directory()), "");  // a folder
  expect_refused("x.txt", "nothing", "of no form that is known");
  expect_refused<GeoidGrid>("x.gsb", GsbFile{{plane("A", "NONE", 40, 50, 10, 20, 1, 1)}}.bytes(),
                            "holds no undulations");
  expect_refused("x.gtx", gtx(0, 0, 1, 1, 2, 2, {1, 2, 3, 4}), "holds no datum shifts");
  folder.write("half.las", GridFile{-20, 40, 9, 8, [](int, int) { return 1.0F; }}.bytes());
  EXPECT_NE(refusal<ShiftGrid>((folder.path() / "half").string()).find("half.los"),
            std::string::npos);
}

TEST_F(BadGrids, CutAtEveryLength) {
  const std::string national =
      GsbFile{{plane("A", "NONE", 40, 42, 10, 12, 1, 1), plane("B", "A", 40, 41, 10, 11, 0.5, 2)}}
          .bytes();
  const std::string rows = GridFile{-20, 40, 30, 4, [](int, int) { return 1.0F; }}.bytes();
  const std::string geoid = gtx(10, 350, 1, 1, 3, 3, std::vector<float>(9));
  const std::size_t end_record = 16;
  for (std::size_t length = 0; length < national.size() - end_record; length += 4) {
    folder.write("g.gsb", national.substr(0, length));
    EXPECT_NE(refusal<ShiftGrid>((folder.path() / "g.gsb").string()), "") << length;
  }
  for (std::size_t length = 0; length < rows.size(); length += 3) {
    folder.write("g.las", rows.substr(0, length));
    folder.write("g.los", rows);
    folder.write("g.geo", rows.substr(0, length));
    EXPECT_NE(refusal<ShiftGrid>((folder.path() / "g.las").string()), "") << length;
    EXPECT_NE(refusal<GeoidGrid>((folder.path() / "g.geo").string()), "") << length;
  }
  for (std::size_t length = 0; length < geoid.size(); ++length) {
    folder.write("g.gtx", geoid.substr(0, length));
    EXPECT_NE(refusal<GeoidGrid>((folder.path() / "g.gtx").string()), "") << length;
  }
}

TEST_F(BadGrids, NationalHeadersThatCannotBe) {
  const auto file = [](auto change) {
    GsbFile f{{plane("A", "NONE", 40, 44, 10, 14, 1, 1), plane("B", "A", 41, 42, 11, 12, 0.5, 2),
               plane("C", "A", 42, 43, 12, 13, 0.5, 3)}};
    change(f);
    return f.bytes();
  };
  EXPECT_NO_THROW({
    folder.write("good.gsb", file([](GsbFile&) {}));
    ShiftGrid((folder.path() / "good.gsb").string());
  });
  expect_refused("x.gsb", file([](GsbFile& f) { f.num_orec = 12; }), "eleven records");
  expect_refused("x.gsb", file([](GsbFile& f) { f.num_srec = -1; }), "eleven records");
  expect_refused("x.gsb", file([](GsbFile& f) { f.num_orec = 11 << 24; }), "big-endian");
  expect_refused("x.gsb", file([](GsbFile& f) { f.num_file = 0; }), "sub-grids");
  expect_refused("x.gsb", file([](GsbFile& f) { f.num_file = 2147483647; }), "sub-grids");
  expect_refused("x.gsb", file([](GsbFile& f) { f.num_file = 4; }), "ends in");
  expect_refused("x.gsb", file([](GsbFile& f) { f.grids[1].count_error = 1; }), "count of");
  expect_refused("x.gsb", file([](GsbFile& f) { f.grids[1].parent = "Z"; }), "is not there");
  expect_refused("x.gsb", file([](GsbFile& f) { f.grids[2].name = "B"; }), "two sub-grids named B");
  expect_refused("x.gsb", file([](GsbFile& f) { f.grids[0].parent = "C"; }),
                 "each other's parents");
  expect_refused("x.gsb", file([](GsbFile& f) { f.grids[1].parent = "B"; }),
                 "each other's parents");
  expect_refused("x.gsb", file([](GsbFile& f) {
                   f.grids[2] = plane("C", "A", 41.5, 42.5, 11.5, 12.5, 0.5, 3);
                 }),
                 "overlap");
  // Doubles of the first sub-grid's header.
  const double nan = std::numeric_limits<double>::quiet_NaN();
  for (const std::size_t offset : {72u, 88u, 104u, 120u, 136u, 152u}) {
    for (const double v : {nan, HUGE_VAL, -HUGE_VAL, 0.0, -1e300, 1e300, 1e-300, -3600.0}) {
      if (v == 0 && offset == 104) continue;
      std::string bytes = file([](GsbFile&) {});
      std::string eight;
      append_f64(eight, v);
      bytes.replace(176 + offset, 8, eight);
      folder.write("x.gsb", bytes);
      EXPECT_NE(refusal<ShiftGrid>((folder.path() / "x.gsb").string()), "") << offset << " " << v;
    }
  }
}

TEST_F(BadGrids, DamagedFilesDoNoHarm) {
  // Any byte changed: taken or refused, and a figure asked for is none or finite.
  const std::string good =
      GsbFile{{plane("A", "NONE", 40, 42, 10, 12, 1, 1), plane("B", "A", 40, 41, 10, 11, 0.5, 2)}}
          .bytes();
  const std::string geoid = gtx(10, 350, 1, 1, 3, 3, std::vector<float>(9));
  std::mt19937 random(3);
  for (int k = 0; k < 300; ++k) {
    for (const bool shift : {true, false}) {
      std::string bytes = shift ? good : geoid;
      for (int n = 0; n < 3; ++n) bytes[random() % bytes.size()] = static_cast<char>(random());
      folder.write(shift ? "g.gsb" : "g.gtx", bytes);
      const std::string path = (folder.path() / (shift ? "g.gsb" : "g.gtx")).string();
      try {
        if (shift) {
          ShiftGrid(path).inverse(Point{-10.75, 40.75, 0});
        } else {
          GeoidGrid(path).undulation(-9, 11);
        }
      } catch (const Error&) {
      }
    }
  }
}

TEST_F(BadGrids, SizesThatNoFileHas) {
  expect_refused<GeoidGrid>("g.gtx", gtx(0, 0, 1e-7, 1e-7, 2147483647, 2147483647, {}),
                            "more nodes");
  expect_refused<GeoidGrid>("g.gtx", gtx(0, 0, 1, 1, -1, 5, {}), "fewer than two");
  expect_refused<GeoidGrid>("g.gtx", gtx(0, 0, 1, 1, 90, 5000, {}), "ends in");
  expect_refused<GeoidGrid>("g.gtx", gtx(0, 0, 1, 200, 2, 3, std::vector<float>(6)),
                            "make no grid");
  GridFile file{-20, 40, 23, 8, [](int, int) { return 1.0F; }};
  const std::string bytes = file.bytes();
  std::string most;
  append_i32(most, 2147483647);
  expect_refused<GeoidGrid>("g.geo", std::string(bytes).replace(64, 4, most), "ends in");
  file.nc = 22;
  expect_refused<GeoidGrid>("g.geo", file.bytes(), "header covers");
  expect_refused<GeoidGrid>("g.geo", std::string(bytes).replace(68, 4, most), "ends in");
}

// --- files as they come --------------------------------------------------------------------------

// A sub-grid's bounds and shifts in other units than seconds, as the file's header says.
TEST(ShiftGrids, UnitsOfNationalFiles) {
  const ScratchFolder folder;
  const auto bytes = [](const char* unit, double in_seconds) {
    SubGrid g = {"A",
                 "NONE",
                 40 * 3600 / in_seconds,
                 50 * 3600 / in_seconds,
                 -20 * 3600 / in_seconds,
                 10 * 3600 / in_seconds,
                 3600 / in_seconds,
                 [=](int r, int) { return static_cast<float>(r / in_seconds); },
                 [=](int, int c) { return static_cast<float>(-2 * c / in_seconds); }};
    std::string all = GsbFile{{g}}.bytes();
    std::string name(unit);
    name.resize(8, ' ');
    return all.replace(56, 8, name);
  };
  for (const auto& [unit, in_seconds] :
       {std::pair("SECONDS", 1.0), {"MINUTES", 60.0}, {"DEGREES", 3600.0}}) {
    SCOPED_TRACE(unit);
    folder.write("g.gsb", bytes(unit, in_seconds));
    const ShiftGrid grid("g.gsb", {folder.directory()});
    EXPECT_NEAR(grid.bounds()[0].west, -10, 1e-9);
    EXPECT_NEAR(grid.bounds()[0].north, 50, 1e-9);
    const Point p = grid.forward(Point{15, 43, 0});
    EXPECT_NEAR((p.y - 43) * 3600, 3, 1e-6);
    EXPECT_NEAR((p.x - 15) * 3600, 2 * 5, 1e-6);  // the fifth column from 20 east
  }
}

TEST(ShiftGrids, TellWhatTheyAre) {
  const ScratchFolder folder;
  GsbFile file{{plane("A", "NONE", 40, 50, -20, 10, 1, 1)}};
  folder.write("g.gsb", file.bytes());
  const ShiftGrid grid("g.gsb", {folder.directory()});
  EXPECT_EQ(grid.path(), (folder.path() / "g.gsb").string());
  EXPECT_EQ(grid.source(), "OLD");
  EXPECT_EQ(grid.target(), "NEW");
  EXPECT_EQ(grid.describe(), "NTv2 grid of 11 rows and 31 columns, OLD to NEW");
  // One system alone says nothing.
  file.to = "        ";
  folder.write("h.gsb", file.bytes());
  EXPECT_EQ(ShiftGrid("h.gsb", {folder.directory()}).describe(),
            "NTv2 grid of 11 rows and 31 columns");
  // Capitals of another system's file names.
  folder.write("H.GSB", file.bytes());
  EXPECT_EQ(ShiftGrid("H.GSB", {folder.directory()}).describe(),
            "NTv2 grid of 11 rows and 31 columns");
  folder.write("B.GTX", gtx(10, 350, 1, 1, 3, 3, {1, 2, 3, 4, 5, 6, 7, 8, 9}));
  const GeoidGrid geoid("B.GTX", {folder.directory()});
  EXPECT_NEAR(geoid.undulation(-9, 11), 5, 1e-12);
  EXPECT_EQ(geoid.path(), (folder.path() / "B.GTX").string());
  EXPECT_EQ(geoid.describe(), "GTX grid of 3 rows and 3 columns");
  // A path is a path, whatever folders there are.
  EXPECT_EQ(ShiftGrid((folder.path() / "g.gsb").string(), {"/nowhere"}).source(), "OLD");
}

// The node marked by a shift of more than 180 seconds is none, in either file.
TEST(ShiftGrids, NadconNodesWithoutData) {
  const ScratchFolder folder;
  const auto write = [&](const char* name, float odd) {
    folder.write(name, GridFile{-20, 40, 25, 8,
                                [odd](int r, int c) {
                                  return r == 3 && c == 4 ? odd : 1.0F + static_cast<float>(c) / 8;
                                }}
                           .bytes());
  };
  const auto shifts = [&] { return ShiftGrid("g", {folder.directory()}); };
  for (const float odd : {999.0F, -999.0F, 180.5F}) {
    write("g.las", odd);
    write("g.los", 2);
    EXPECT_TRUE(std::isnan(shifts().forward(Point{-15.5, 43.5, 0}).x));
    EXPECT_FALSE(std::isnan(shifts().forward(Point{-13.5, 43.5, 0}).x));
    write("g.las", 2);
    write("g.los", odd);
    EXPECT_TRUE(std::isnan(shifts().forward(Point{-16.5, 42.5, 0}).y));
  }
  // From beyond an edge that has no data there is no way back.
  folder.write(
      "g.las",
      GridFile{-20, 40, 25, 8, [](int, int c) { return c < 2 ? 999.0F : 900.0F / 3600; }}.bytes());
  write("g.los", 2);
  EXPECT_TRUE(std::isnan(shifts().inverse(Point{-20.3, 43.5, 0}).x));
  EXPECT_TRUE(std::isnan(shifts().inverse(Point{-19.5, 43.5, 0}).x));
  EXPECT_FALSE(std::isnan(shifts().inverse(Point{-17.5, 43.5, 0}).x));
  write("g.las", 180);
  write("g.los", 180);
  const Point p = shifts().forward(Point{-16, 43, 0});  // the node itself
  EXPECT_NEAR(p.y, 43 + 180.0 / 3600, 1e-9);
  EXPECT_NEAR(p.x, -16 - 180.0 / 3600, 1e-9);  // positive west in the file
}

// The way back from just beyond an edge, where the shift leads in; and from where it does not.
TEST(ShiftGrids, BackFromBeyondTheEdge) {
  const ScratchFolder folder;
  // A shift of half a degree to the north and to the east; nodes a degree apart.
  SubGrid g = {"A",
               "NONE",
               40 * 3600,
               44 * 3600,
               -14 * 3600,
               -10 * 3600,
               3600,
               [](int, int) { return 1800.0F; },
               [](int, int) { return -1800.0F; }};
  folder.write("g.gsb", GsbFile{{g}}.bytes());
  const ShiftGrid grid("g.gsb", {folder.directory()});
  const auto back = [&](double x, double y) {
    TWstatus word = 77;
    double z = 5;
    const Coordinates<double> at = {&x, &y, &z};
    int passes = 0;
    const Summary summary = grid.inverse(1, at, at, &word, &passes);
    EXPECT_EQ(summary.failed, word == TW_SUCCESS ? 0u : 1u);
    EXPECT_LE(passes, 3);
    return std::tuple(x, y, word);
  };
  // From inside; from beyond the northern and the eastern edge, out of inside.
  EXPECT_EQ(std::get<2>(back(12, 42)), TW_SUCCESS);
  const auto [x, y, word] = back(14.25, 44.25);
  EXPECT_EQ(word, TW_SUCCESS);
  EXPECT_NEAR(x, 13.75, 1e-12);
  EXPECT_NEAR(y, 43.75, 1e-12);
  // Inside, but out of outside: there no shift leads from.
  EXPECT_EQ(std::get<2>(back(10.25, 42)), TW_I_OUTSIDE_CNT);
  EXPECT_EQ(std::get<2>(back(12, 40.25)), TW_I_OUTSIDE_CNT);
  // Beyond the edge by more than a shift leads, and by more than a cell.
  EXPECT_EQ(std::get<2>(back(14.75, 42)), TW_I_OUTSIDE_CNT);
  EXPECT_EQ(std::get<2>(back(16.5, 42)), TW_I_OUTSIDE_CNT);
  EXPECT_EQ(std::get<2>(back(12, 46)), TW_I_OUTSIDE_CNT);
}

// A shift that grows as fast as the way to it never comes to rest.
TEST(ShiftGrids, WaysBackThatDoNotConverge) {
  const ScratchFolder folder;
  // From node to node the shift falls by three spacings: the points of a cell are turned over.
  SubGrid g = {"A",
               "NONE",
               40 * 3600,
               50 * 3600,
               -20 * 3600,
               -10 * 3600,
               3600,
               [](int r, int) { return static_cast<float>((r % 2 == 0 ? 1 : -1) * 4000); },
               [](int, int) { return 0.0F; }};
  folder.write("g.gsb", GsbFile{{g}}.bytes());
  const ShiftGrid grid("g.gsb", {folder.directory()});
  double x = 15, y = 45.25;
  TWstatus word = TW_SUCCESS;
  int passes = 0;
  const Coordinates<double> at = {&x, &y};
  EXPECT_EQ(grid.inverse(1, at, at, &word, &passes).word, TW_NOT_CONVERGED);
  EXPECT_EQ(word, TW_NOT_CONVERGED);
  EXPECT_EQ(passes, 20);
  EXPECT_TRUE(std::isnan(x) && std::isnan(y));
  // The first failure's word is the summary's; the heights may be missing.
  double xs[2] = {15, 0}, ys[2] = {45.25, 0};
  const Summary both = grid.inverse(2, {xs, ys}, {xs, ys});
  EXPECT_EQ(both.failed, 2u);
  EXPECT_EQ(both.word, TW_NOT_CONVERGED);
}

TEST(GeoidGrids, BiquadraticWantsThreeRowsAndColumns) {
  const ScratchFolder folder;
  for (const auto& [rows, columns] : {std::pair(2, 24), {24, 2}}) {
    folder.write("g.gtx", gtx(10, 350, 0.5, 0.5, rows, columns,
                              std::vector<float>(static_cast<std::size_t>(rows * columns), 3)));
    const std::string path = (folder.path() / "g.gtx").string();
    EXPECT_EQ(GeoidGrid(path).undulation(350.25, 10.25), 3);
    expect_refused([&] { GeoidGrid(path, {}, GeoidGrid::Interpolation::biquadratic); },
                   "fewer than the three rows and columns of biquadratic");
  }
}

TEST(GeoidGrids, HeightsThatAreNotGivenAreZero) {
  const ScratchFolder folder;
  folder.write("h.gtx", gtx(10, 350, 1, 1, 2, 2, {4, 4, 4, 4}));
  const GeoidGrid grid("h.gtx", {folder.directory()});
  const double x = 350.5, y = 10.5;
  double ox = 0, oy = 0, oz = 0;
  EXPECT_TRUE(grid.forward(1, {&x, &y}, {&ox, &oy, &oz}));
  EXPECT_EQ(oz, 4);
  EXPECT_TRUE(grid.inverse(1, {&x, &y}, {&ox, &oy}));
  EXPECT_EQ(ox, 350.5);
}

TEST_F(BadGrids, HeadersAndFilesThatDoNotFit) {
  const GridFile las{-20, 40, 25, 8, [](int, int) { return 1.0F; }};
  folder.write("g.las", las.bytes());
  for (const int which : {0, 1, 2}) {
    GridFile los = las;
    if (which == 0) los.nc = 26;
    if (which == 1) los.nr = 9;
    if (which == 2) los.ymin = 41;
    folder.write("g.los", los.bytes());
    const std::string why = refusal<ShiftGrid>((folder.path() / "g.los").string());
    EXPECT_NE(why.find("has a .las and a .los file of different headers"), std::string::npos)
        << why;
  }
  GridFile narrow = las;
  narrow.nc = 1;
  expect_refused<GeoidGrid>("x.geo", narrow.bytes(), "fewer than two rows or columns");
  narrow.nc = 25;
  narrow.nr = 1;
  expect_refused<GeoidGrid>("x.geo", narrow.bytes(), "fewer than two rows or columns");
  // A pair of NADCON's holds no undulations; names that are none, or too short for an ending.
  EXPECT_NE(refusal<GeoidGrid>((folder.path() / "g.las").string()).find("holds no undulations"),
            std::string::npos);
  EXPECT_NE(refusal<ShiftGrid>("").find("There is no grid file"), std::string::npos);
  EXPECT_NE(refusal<ShiftGrid>("x").find("There is no grid file x."), std::string::npos);
}

TEST_F(BadGrids, FilesThatCannotBeRead) {
  // A file of more than two gigabytes, with a hole instead of them.
  folder.write("big.gsb", "NUM_OREC");
  std::error_code error;
  fs::resize_file(folder.path() / "big.gsb", std::uintmax_t{1} << 31, error);
  if (!error) {
    EXPECT_NE(refusal<ShiftGrid>((folder.path() / "big.gsb").string()).find("is larger than 2 GB"),
              std::string::npos);
  }
  // The kernel's own, of which the file system tells more bytes than there are.
  const std::string path = "/sys/devices/system/cpu/online";
  if (!fs::is_regular_file(path)) GTEST_SKIP() << path << " is not there";
  EXPECT_EQ(refusal<ShiftGrid>(path), "The grid file " + path + " cannot be read.");
}

Transformation by_operation(const char* source, const char* target, const char* operation,
                            const fs::path& folder) {
  TransformationOptions options;
  options.operation = operation;
  options.grid_folders = {folder.string()};
  return Transformation(System(source), System(target), options);
}

#ifdef TIDEWATER_HAVE_TIFF

// A band of a GeoTIFF: nodes from the north-west, by rows southwards.
struct Band {
  std::string description, unit, positive;
  std::function<float(int row, int column)> value;  // rows from the south
  double scale = 1, offset = 0;
};

struct TiffImage {
  double west, south, dx, dy;
  int columns, rows;
  std::vector<Band> bands;
  std::string type = "HORIZONTAL_OFFSET", name = {}, parent = {};
  bool tiled = false, separate = false, areas = false, overview = false, from_south = false;
  int compression = COMPRESSION_NONE, bits = 32, format = SAMPLEFORMAT_IEEEFP;
  std::string no_data = {};
  std::vector<double> matrix = {};        // instead of scale and tie point
  bool placed = true;                     // false: with neither
  std::optional<std::string> metadata{};  // instead of the bands' own; empty: without any
};

constexpr std::uint32_t kScaleTag = 33550, kTieTag = 33922, kKeysTag = 34735, kMetadataTag = 42112,
                        kNoDataTag = 42113, kMatrixTag = 34264;

void add_geo_tags(TIFF* tiff) {
  static char names[6][12] = {"scale", "tie", "keys", "metadata", "nodata", "matrix"};
  static const TIFFFieldInfo fields[] = {
      {kScaleTag, -1, -1, TIFF_DOUBLE, FIELD_CUSTOM, 1, 1, names[0]},
      {kTieTag, -1, -1, TIFF_DOUBLE, FIELD_CUSTOM, 1, 1, names[1]},
      {kKeysTag, -1, -1, TIFF_SHORT, FIELD_CUSTOM, 1, 1, names[2]},
      {kMetadataTag, -1, -1, TIFF_ASCII, FIELD_CUSTOM, 1, 0, names[3]},
      {kNoDataTag, -1, -1, TIFF_ASCII, FIELD_CUSTOM, 1, 0, names[4]},
      {kMatrixTag, -1, -1, TIFF_DOUBLE, FIELD_CUSTOM, 1, 1, names[5]}};
  TIFFMergeFieldInfo(tiff, fields, 6);
}

void append_sample(std::string* bytes, float value, const TiffImage& image) {
  const auto put = [bytes](auto v) { bytes->append(reinterpret_cast<const char*>(&v), sizeof v); };
  if (image.format == SAMPLEFORMAT_INT) {
    image.bits == 16 ? put(static_cast<std::int16_t>(value))
                     : put(static_cast<std::int32_t>(value));
  } else if (image.format == SAMPLEFORMAT_UINT) {
    image.bits == 16 ? put(static_cast<std::uint16_t>(value))
                     : put(static_cast<std::uint32_t>(value));
  } else {
    image.bits == 32 ? put(value) : put(static_cast<double>(value));
  }
}

void write_tiff(const std::string& path, const std::vector<TiffImage>& images,
                const char* mode = "w") {
  TIFF* const tiff = TIFFOpen(path.c_str(), mode);
  ASSERT_NE(tiff, nullptr);
  for (const TiffImage& image : images) {
    add_geo_tags(tiff);
    const auto samples = static_cast<int>(image.bands.size());
    TIFFSetField(tiff, TIFFTAG_IMAGEWIDTH, image.columns);
    TIFFSetField(tiff, TIFFTAG_IMAGELENGTH, image.rows);
    TIFFSetField(tiff, TIFFTAG_SAMPLESPERPIXEL, samples);
    TIFFSetField(tiff, TIFFTAG_BITSPERSAMPLE, image.bits);
    TIFFSetField(tiff, TIFFTAG_SAMPLEFORMAT, image.format);
    TIFFSetField(tiff, TIFFTAG_PHOTOMETRIC, PHOTOMETRIC_MINISBLACK);
    TIFFSetField(tiff, TIFFTAG_PLANARCONFIG,
                 image.separate ? PLANARCONFIG_SEPARATE : PLANARCONFIG_CONTIG);
    TIFFSetField(tiff, TIFFTAG_COMPRESSION, image.compression);
    const std::vector<std::uint16_t> extra(static_cast<std::size_t>(samples - 1), 0);
    if (samples > 1) TIFFSetField(tiff, TIFFTAG_EXTRASAMPLES, samples - 1, extra.data());
    if (image.overview) TIFFSetField(tiff, TIFFTAG_SUBFILETYPE, FILETYPE_REDUCEDIMAGE);
    const double scale[3] = {image.dx, image.from_south ? -image.dy : image.dy, 0};
    const double half = image.areas ? 0.5 : 0;
    const double top = image.from_south ? image.south - half * image.dy
                                        : image.south + (image.rows - 1 + half) * image.dy;
    const double tie[6] = {0, 0, 0, image.west - half * image.dx, top, 0};
    if (!image.matrix.empty()) {
      TIFFSetField(tiff, kMatrixTag, image.matrix.size(), image.matrix.data());
    } else if (image.placed) {
      TIFFSetField(tiff, kScaleTag, 3, scale);
      TIFFSetField(tiff, kTieTag, 6, tie);
    }
    const auto raster = static_cast<std::uint16_t>(image.areas ? 1 : 2);
    const std::uint16_t keys[] = {1, 1, 0, 3, 1024, 0, 1, 2, 1025, 0, 1, raster, 2048, 0, 1, 4326};
    TIFFSetField(tiff, kKeysTag, 16, keys);
    std::string xml = "<GDALMetadata>\n<Item name=\"TYPE\">" + image.type + "</Item>\n";
    if (!image.name.empty()) xml += "<Item name=\"grid_name\">" + image.name + "</Item>\n";
    if (!image.parent.empty()) {
      xml += "<Item name=\"parent_grid_name\">" + image.parent + "</Item>\n";
    }
    for (int k = 0; k < samples; ++k) {
      const Band& band = image.bands[static_cast<std::size_t>(k)];
      const auto add = [&](const char* name, const char* role, const std::string& text) {
        if (text.empty()) return;
        xml += std::string("<Item name=\"") + name + "\" sample=\"" + std::to_string(k) + "\"" +
               (role ? std::string(" role=\"") + role + "\"" : "") + ">" + text + "</Item>\n";
      };
      add("DESCRIPTION", "description", band.description);
      add("UNITTYPE", "unittype", band.unit);
      add("positive_value", nullptr, band.positive);
      if (band.scale != 1) add("SCALE", "scale", std::to_string(band.scale));
      if (band.offset != 0) add("OFFSET", "offset", std::to_string(band.offset));
    }
    xml = image.metadata.value_or(xml + "</GDALMetadata>");
    if (!xml.empty()) TIFFSetField(tiff, kMetadataTag, xml.c_str());
    if (!image.no_data.empty()) TIFFSetField(tiff, kNoDataTag, image.no_data.c_str());
    constexpr int kTile = 32;
    const int piece = image.tiled ? kTile : 1;
    if (image.tiled) {
      TIFFSetField(tiff, TIFFTAG_TILEWIDTH, kTile);
      TIFFSetField(tiff, TIFFTAG_TILELENGTH, kTile);
    } else {
      TIFFSetField(tiff, TIFFTAG_ROWSPERSTRIP, 7);
    }
    const int across = image.tiled ? kTile : image.columns;
    for (int plane = 0; plane < (image.separate ? samples : 1); ++plane) {
      for (int y = 0; y < image.rows; y += piece) {
        for (int x = 0; x < image.columns; x += across) {
          std::string bytes;
          for (int r = y; r < y + piece; ++r) {
            for (int c = x; c < x + across; ++c) {
              const int row =
                  std::clamp(image.from_south ? r : image.rows - 1 - r, 0, image.rows - 1);
              const int column = std::min(c, image.columns - 1);
              for (int k = image.separate ? plane : 0; k < (image.separate ? plane + 1 : samples);
                   ++k) {
                append_sample(&bytes, image.bands[static_cast<std::size_t>(k)].value(row, column),
                              image);
              }
            }
          }
          // Of bits that no grid has there are fewer bytes than libtiff takes.
          const tmsize_t taken = image.tiled ? TIFFTileSize(tiff) : TIFFScanlineSize(tiff);
          bytes.resize(std::max(bytes.size(), static_cast<std::size_t>(taken)));
          const auto sample = static_cast<std::uint16_t>(plane);
          if (image.tiled) {
            TIFFWriteTile(tiff, bytes.data(), static_cast<std::uint32_t>(x),
                          static_cast<std::uint32_t>(y), 0, sample);
          } else {
            TIFFWriteScanline(tiff, bytes.data(), static_cast<std::uint32_t>(y), sample);
          }
        }
      }
    }
    TIFFWriteDirectory(tiff);
  }
  TIFFClose(tiff);
}

// The single sub-grid of a .gsb file as a GeoTIFF.
TiffImage as_tiff(const std::string& national) {
  const auto all = std::make_shared<std::string>(file_bytes(national));
  const auto at = [&](std::size_t offset) { return f64_at(*all, 176 + offset) / 3600; };
  TiffImage image{-at(120), at(72), at(152), at(136), 0, 0, {}};
  image.columns = static_cast<int>((at(120) - at(104)) / at(152) + 1.5);
  image.rows = static_cast<int>((at(88) - at(72)) / at(136) + 1.5);
  const auto value = [all, columns = image.columns](int row, int column, std::size_t which) {
    const auto node = static_cast<std::size_t>(row * columns + columns - 1 - column);
    return f32_at(*all, 352 + node * 16 + which * 4);
  };
  image.bands = {
      {"latitude_offset", "arc-second", "", [value](int r, int c) { return value(r, c, 0); }},
      {"longitude_offset", "arc-second", "east",
       [value](int r, int c) { return -value(r, c, 1); }}};
  return image;
}

TEST(TiffGrids, RealShiftsInEveryLayout) {
  const ScratchFolder folder;
  const std::string path = (folder.path() / "g.tif").string();
  for (const auto& [name, box] : kRealGrids) {
    if (!fs::exists(kProjData + name) || std::string(name) == "CHENYX06.gsb") continue;
    SCOPED_TRACE(name);
    const ShiftGrid national(kProjData + name);
    const std::vector<Point> in = points_in(box, 500);
    for (int layout = 0; layout < 16; ++layout) {
      SCOPED_TRACE(layout);
      TiffImage image = as_tiff(kProjData + name);
      image.tiled = (layout & 1) != 0;
      image.separate = (layout & 2) != 0;
      image.areas = (layout & 4) != 0;
      image.from_south = (layout & 8) != 0;
      image.compression = layout % 3 == 0 ? COMPRESSION_NONE : COMPRESSION_ADOBE_DEFLATE;
      image.bits = layout == 5 ? 64 : 32;
      write_tiff(path, {image});
      const ShiftGrid grid(path);
      for (const Point& p : in) {
        EXPECT_NEAR(grid.forward(p).x, national.forward(p).x, 1e-12);
        EXPECT_NEAR(grid.forward(p).y, national.forward(p).y, 1e-12);
      }
#ifdef TIDEWATER_HAVE_PROJ
      if (layout % 5 == 0 && !image.from_south) expect_as_peer(grid, path, box, 300);
#endif
    }
  }
}

Band flat_band(const char* description, float value, const char* unit = "arc-second",
               const char* positive = "") {
  return {description, unit, positive, [value](int, int) { return value; }};
}

TEST(TiffGrids, BandsUnitsAndSubGrids) {
  const ScratchFolder folder;
  const std::string path = (folder.path() / "g.tif").string();
  const auto shift_at = [&](double lon, double lat) {
    const Point p = ShiftGrid(path).forward(Point{lon, lat, 0});
    return std::pair((p.x - lon) * 3600, (p.y - lat) * 3600);
  };
  const TiffImage plain{
      10, 50, 1, 1, 4, 4, {flat_band("latitude_offset", 3), flat_band("longitude_offset", 5)}};
  const auto expect = [&](const std::vector<TiffImage>& images, double lon, double lat,
                          double x = 11.5, double y = 51.5) {
    write_tiff(path, images);
    const auto [east, north] = shift_at(x, y);
    EXPECT_NEAR(east, lon, 1e-8);
    EXPECT_NEAR(north, lat, 1e-8);
  };
  expect({plain}, 5, 3);
  TiffImage image = plain;
  image.bands = {flat_band("longitude_offset", 5, "arc-second", "west"),
                 flat_band("longitude_offset_accuracy", 9), flat_band("latitude_offset", 3)};
  expect({image}, -5, 3);  // in another order, positive west, with a third between them
  image.bands = {flat_band("", 3, ""), flat_band("", 5, "")};
  expect({image}, 5, 3);  // without descriptions: latitude first
  image.bands = {flat_band("latitude_offset", 0.5, "degree"),
                 flat_band("longitude_offset", 0.25, "degree")};
  expect({image}, 900, 1800);
  image = plain;
  image.format = SAMPLEFORMAT_INT;
  for (const int bits : {16, 32}) {
    image.bits = bits;
    image.bands = {flat_band("latitude_offset", -300), flat_band("longitude_offset", 200)};
    for (Band& b : image.bands) b.scale = 0.25;
    image.bands[1].offset = 1.5;
    expect({image}, 51.5, -75);
  }
  // A child by name, one by its extent, and an overview, which is passed over.
  TiffImage child{11,
                  51,
                  0.5,
                  0.5,
                  3,
                  3,
                  {flat_band("latitude_offset", 30), flat_band("longitude_offset", 50)}};
  TiffImage parent = plain;
  expect({parent, child}, 50, 30);
  parent.name = "P";
  child.name = "C";
  child.parent = "P";
  expect({parent, child}, 50, 30);
  expect({parent, child}, 5, 3, 12.5, 52.5);
  child.overview = true;
  expect({parent, child}, 5, 3);
  // Nodes without data.
  image = plain;
  image.no_data = "5";
  write_tiff(path, {image});
  EXPECT_TRUE(std::isnan(shift_at(11.5, 51.5).first));
}

// Where the nodes lie by a matrix, as some programs write it; samples of whole numbers without a
// sign; files of the other order of bytes and of the form for large ones.
TEST(TiffGrids, OtherFormsOfTheSame) {
  const ScratchFolder folder;
  const std::string path = (folder.path() / "g.tif").string();
  const TiffImage plain{
      10, 50, 1, 1, 4, 4, {flat_band("latitude_offset", 3), flat_band("longitude_offset", 5)}};
  const auto expect = [&](const TiffImage& image, double lon, double lat, const char* mode = "w") {
    write_tiff(path, {image}, mode);
    const ShiftGrid grid(path);
    EXPECT_NEAR(grid.bounds()[0].west, 10, 1e-9);
    EXPECT_NEAR(grid.bounds()[0].north, 53, 1e-9);
    const Point p = grid.forward(Point{11.5, 51.5, 0});
    EXPECT_NEAR((p.x - 11.5) * 3600, lon, 1e-8);
    EXPECT_NEAR((p.y - 51.5) * 3600, lat, 1e-8);
  };
  expect(plain, 5, 3, "wb");
  expect(plain, 5, 3, "w8");
  TiffImage image = plain;
  image.matrix = {1, 0, 0, 10, 0, -1, 0, 53, 0, 0, 0, 0, 0, 0, 0, 1};
  expect(image, 5, 3);
  image = plain;
  image.format = SAMPLEFORMAT_UINT;
  for (const int bits : {16, 32}) {
    image.bits = bits;
    expect(image, 5, 3);
    // An offset alone, which the scale does not tell of.
    image.bands[0].offset = 0.5;
    expect(image, 5, 3.5);
    image.bands[0].offset = 0;
  }
  image = plain;
  for (Band& band : image.bands) band.unit = "radian";
  image.bands[0].value = [](int, int) { return 0x1p-12F; };
  image.bands[1].value = [](int, int) { return -0x1p-13F; };
  expect(image, -0x1p-13 / kDegree * 3600, 0x1p-12 / kDegree * 3600);
  for (Band& band : image.bands) band.unit = "arc-seconds per year";
  expect(image, -0x1p-13, 0x1p-12);
}

TEST(TiffGrids, UndulationsWithAndWithoutWords) {
  const ScratchFolder folder;
  const std::string path = (folder.path() / "g.tif").string();
  TiffImage image{10, 50, 1, 1, 4, 4, {flat_band("geoid_undulation", 30, "metre")}};
  for (const char* unit : {"metre", "meter", "m", ""}) {
    image.bands[0].unit = unit;
    write_tiff(path, {image});
    EXPECT_NEAR(GeoidGrid(path).undulation(11.5, 51.5), 30, 1e-12) << unit;
  }
  for (const char* description : {"", "vertical_offset"}) {
    image.bands[0].description = description;
    write_tiff(path, {image});
    EXPECT_NEAR(GeoidGrid(path).undulation(11.5, 51.5), 30, 1e-12) << description;
  }
  // Without any metadata, and with such as no program writes.
  for (const char* metadata :
       {"", "<GDALMetadata><Item ", "<GDALMetadata><Item name=\"DESCRIPTION\"",
        "<GDALMetadata><Item name=\"DESCRIPTION\" sample=\"0>geoid_undulation</Item>",
        "<Item name=\"description\" sample=\"10\">nothing</Item>",
        "<Item name=\"description\" sample=\"/\">nothing</Item>",
        "<Item name=\"description\" sample=\":\">nothing</Item>",
        "<Item name=\"description\" sample=\"0\">geoid_undulation</Item>"}) {
    image.metadata = metadata;
    write_tiff(path, {image});
    EXPECT_NEAR(GeoidGrid(path).undulation(11.5, 51.5), 30, 1e-12) << metadata;
  }
  image.metadata.reset();
  const auto refused = [&](const char* part) {
    write_tiff(path, {image});
    const std::string why = refusal<GeoidGrid>(path);
    EXPECT_NE(why.find(part), std::string::npos) << why;
  };
  image.bands[0].description = "something else";
  refused("has no band of undulations");
  image.bands = {flat_band("", 30, "metre"), flat_band("", 31, "metre")};
  refused("has no band of undulations");
  image.bands = {flat_band("geoid_undulation", 30, "foot")};
  refused("has figures in the unit foot, not in metres");
}

// Sub-grids that name no parents lie in the smallest that holds them, whatever their order.
TEST(TiffGrids, SubGridsByTheirExtents) {
  const ScratchFolder folder;
  const std::string path = (folder.path() / "g.tif").string();
  const auto image = [](double west, double south, double step, int nodes, float shift) {
    return TiffImage{west,
                     south,
                     step,
                     step,
                     nodes,
                     nodes,
                     {flat_band("latitude_offset", shift), flat_band("longitude_offset", 0)}};
  };
  const TiffImage whole = image(10, 50, 1, 11, 1);         // 10 to 20, 50 to 60
  const TiffImage child = image(12, 52, 0.5, 9, 2);        // 12 to 16, 52 to 56
  const TiffImage grandchild = image(13, 53, 0.25, 9, 3);  // 13 to 15, 53 to 55
  const TiffImage north = image(12, 61, 0.5, 5, 4);        // beyond the north, the south, the east
  const TiffImage south = image(12, 45, 0.5, 5, 5);
  const TiffImage east = image(21, 52, 0.5, 5, 6);
  for (const auto& order : {std::vector{whole, child, grandchild, north, south, east},
                            std::vector{whole, grandchild, child, east, south, north},
                            std::vector{whole, south, grandchild, north, east, child}}) {
    write_tiff(path, order);
    const ShiftGrid grid(path);
    EXPECT_EQ(grid.bounds().size(), 4u);
    for (const auto& [lon, lat, seconds] : {std::tuple(11.0, 51.0, 1),
                                            {12.2, 52.2, 2},
                                            {14.0, 54.0, 3},
                                            {15.5, 54.0, 2},
                                            {13.0, 62.0, 4},
                                            {13.0, 46.0, 5},
                                            {22.0, 53.0, 6}}) {
      EXPECT_NEAR((grid.forward(Point{lon, lat, 0}).y - lat) * 3600, seconds, 1e-8)
          << lon << " " << lat;
    }
  }
  // Twice the same place
  write_tiff(path, {whole, child, child});
  EXPECT_NE(refusal<ShiftGrid>(path).find("overlap"), std::string::npos);
  // The first may have a parent by name that is not there.
  TiffImage orphan = whole;
  orphan.parent = "P";
  write_tiff(path, {orphan});
  EXPECT_NE(refusal<ShiftGrid>(path).find("is not there"), std::string::npos);
}

TEST(TiffGrids, GeoidAgainstItsGtx) {
  const std::string path = kProjData + "egm96_15.gtx";
  if (!fs::exists(path)) GTEST_SKIP() << "egm96_15.gtx is not installed";
  const std::string bytes = file_bytes(path);
  const auto value = [&bytes](int row, int column) {
    const auto at =
        40 + 4 * (static_cast<std::size_t>(row) * 1440 + static_cast<std::size_t>(column));
    std::uint32_t bits = 0;
    for (std::size_t k = 0; k < 4; ++k)
      bits = bits << 8 | static_cast<unsigned char>(bytes[at + k]);
    return std::bit_cast<float>(bits);
  };
  const ScratchFolder folder;
  const std::string tif = (folder.path() / "g.tif").string();
  TiffImage image{-180, -90, 0.25, 0.25, 1440, 721, {{"geoid_undulation", "metre", "", value}}};
  image.type = "VERTICAL_OFFSET_GEOGRAPHIC_TO_VERTICAL";
  image.tiled = true;
  image.compression = COMPRESSION_ADOBE_DEFLATE;
  write_tiff(tif, {image});
  const GeoidGrid ours(tif), theirs(path);
  for (const Point& p : points_in({-180, -90, 180, 90}, 2000)) {
    EXPECT_NEAR(ours.undulation(p.x, p.y), theirs.undulation(p.x, p.y), 1e-10);
  }
#ifdef TIDEWATER_HAVE_PROJ
  const ProjPeer peer("+proj=vgridshift +multiplier=1 +grids=" + tif);
  ASSERT_TRUE(peer.ok());
  for (const Point& p : points_in({-180, -90, 180, 90}, 500)) {
    EXPECT_NEAR(ours.undulation(p.x, p.y), peer.forward({p.x * kDegree, p.y * kDegree, 0}).z, 1e-6);
  }
#endif
}

TEST_F(BadGrids, TiffsThatCannotBe) {
  const std::string path = (folder.path() / "x.tif").string();
  const TiffImage plain{
      10, 50, 1, 1, 4, 4, {flat_band("latitude_offset", 3), flat_band("longitude_offset", 5)}};
  const auto expect = [&](const std::vector<TiffImage>& images, const std::string& part) {
    write_tiff(path, images);
    const std::string sentence = refusal<ShiftGrid>(path);
    EXPECT_NE(sentence.find(part), std::string::npos) << sentence;
  };
  TiffImage image = plain;
  image.bands[0].description = "northing_offset";
  expect({image}, "no bands of datum shifts");
  image = plain;
  image.bands[0].unit = "metre";
  expect({image}, "in the unit metre");
  image.bands[0].unit = "degree";
  expect({image}, "bands of different units");
  image = plain;
  image.dx = std::numeric_limits<double>::quiet_NaN();
  expect({image}, "make no grid");
  image.dx = 1e300;
  expect({image}, "make no grid");
  image = plain;
  image.overview = true;
  expect({image}, "no image at full size");
  image = plain;
  image.placed = false;
  expect({image}, "does not tell where its nodes lie");
  for (const int turned : {1, 4}) {
    image.matrix = {1, 0, 0, 10, 0, -1, 0, 53, 0, 0, 0, 0, 0, 0, 0, 1};
    image.matrix[static_cast<std::size_t>(turned)] = 0.1;
    expect({image}, "does not tell where its nodes lie");
  }
  image.matrix = {1, 0, 0, 10};
  expect({image}, "does not tell where its nodes lie");
  image = plain;
  image.format = SAMPLEFORMAT_UINT;
  image.bits = 8;
  expect({image}, "no floats or integers of a usual size");
  image.format = SAMPLEFORMAT_INT;
  image.bits = 64;
  expect({image}, "no floats or integers of a usual size");
  image.format = SAMPLEFORMAT_IEEEFP;
  image.bits = 16;
  expect({image}, "no floats or integers of a usual size");
  image = plain;
  while (image.bands.size() < 17) image.bands.push_back(flat_band("", 1));
  expect({image}, "bands past counting");
  image = plain;
  image.bands = {flat_band("latitude_offset", 3)};
  expect({image}, "no bands of datum shifts");
  image.bands = {flat_band("", 3)};
  expect({image}, "no bands of datum shifts");
  image.bands = {flat_band("", 3), flat_band("geoid_undulation", 3)};
  expect({image}, "no bands of datum shifts");
  image = plain;
  image.overview = true;
  expect(std::vector<TiffImage>(1001, image), "images past counting");
  TiffImage child{10.5, 50.5, 0.5, 0.5, 3, 3, plain.bands};
  TiffImage other = child;
  other.west = 11;
  expect({plain, child, other}, "overlap");
  child.name = "A";
  child.parent = "B";
  other = child;
  other.name = "B";
  other.parent = "A";
  expect({plain, child, other}, "each other's parents");
  child.parent = "nobody";
  expect({plain, child}, "is not there");
  write_tiff(path, {plain});
  EXPECT_NE(refusal<GeoidGrid>(path).find("no band of undulations"), std::string::npos);
}

// Tiles larger than any memory, or of no size, as a damaged header has them.
TEST_F(BadGrids, TiffsWhoseTilesCannotBe) {
  const std::string path = (folder.path() / "x.tif").string();
  TiffImage image{
      10, 50, 1, 1, 40, 40, {flat_band("latitude_offset", 3), flat_band("longitude_offset", 5)}};
  image.tiled = true;
  write_tiff(path, {image});
  const std::string good = file_bytes(path);
  EXPECT_EQ(refusal<ShiftGrid>(path), "");
  // The entries of the tiles' width and height in the directory: tag, type, count, value.
  const auto with = [&](int width, int height) {
    std::string bytes = good;
    for (const auto& [tag, value] : {std::pair(322, width), {323, height}}) {
      const std::string entry = {
          static_cast<char>(tag & 0xff), static_cast<char>(tag >> 8), 3, 0, 1, 0, 0, 0};
      const std::size_t at = bytes.find(entry);
      EXPECT_NE(at, std::string::npos);
      bytes[at + 8] = static_cast<char>(value & 0xff);
      bytes[at + 9] = static_cast<char>(value >> 8);
    }
    return bytes;
  };
  expect_refused("y.tif", with(0x7ff0, 0x7ff0), "tiles or rows of a size that cannot be");
  for (const auto& [width, height] : {std::pair(0, 32), {32, 0}, {0, 0}}) {
    folder.write("y.tif", with(width, height));
    EXPECT_NE(refusal<ShiftGrid>((folder.path() / "y.tif").string()), "") << width << " " << height;
  }
}

TEST_F(BadGrids, DamagedTiffsDoNoHarm) {
  const std::string path = (folder.path() / "x.tif").string();
  TiffImage image{
      10, 50, 1, 1, 40, 40, {flat_band("latitude_offset", 3), flat_band("longitude_offset", 5)}};
  for (const bool tiled : {false, true}) {
    image.tiled = tiled;
    image.compression = tiled ? COMPRESSION_ADOBE_DEFLATE : COMPRESSION_NONE;
    write_tiff(path, {image});
    const std::string good = file_bytes(path);
    const auto try_it = [&](const std::string& bytes) {
      folder.write("x.tif", bytes);
      try {
        const Point p = ShiftGrid(path).inverse(Point{11.5, 51.5, 0});
        static_cast<void>(p);
      } catch (const Error&) {
      }
    };
    for (std::size_t length = 0; length < good.size(); length += 41) try_it(good.substr(0, length));
    std::mt19937 random(5);
    for (int k = 0; k < 300; ++k) {
      std::string bytes = good;
      // For the most part where the directory is.
      for (int n = 0; n < 2; ++n) {
        const std::size_t at =
            k % 3 == 0 ? random() % bytes.size()
                       : bytes.size() - 1 - random() % std::min<std::size_t>(900, bytes.size());
        bytes[at] = static_cast<char>(random());
      }
      try_it(bytes);
    }
  }
}

// --- grids in the registry's operations ----------------------------------------------------------

// Translations about those of the whole country, over France as the institute's grid lies.
TiffImage translations() {
  const auto band = [](const char* name, double mean, double along, double across) {
    return Band{name, "metre", "", [=](int row, int column) {
                  return static_cast<float>(mean + along * std::sin(0.3 * column) +
                                            across * std::cos(0.2 * row));
                }};
  };
  TiffImage image{-5.5, 41, 0.5, 0.5, 32, 23, {}};
  image.type = "GEOCENTRIC_TRANSLATION";
  image.bands = {band("x_translation", -168, 1.5, 0.7), band("y_translation", -60, -0.8, 1.1),
                 band("z_translation", 320, 0.4, -0.9)};
  return image;
}

TEST(GridOperations, GeocentricTranslationsGoThereAndBack) {
  const ScratchFolder folder;
  const std::string path = (folder.path() / "fr_ign_gr3df97a.tif").string();
  write_tiff(path, {translations()});
  const Transformation map = by_operation("EPSG:4807", "EPSG:4171", "EPSG:9327", folder.path());
  EXPECT_NE(map.describe().find("EPSG:9327"), std::string::npos);
  const Transformation plain = by_operation("EPSG:4275", "EPSG:4171", "EPSG:9327", folder.path());
  for (const Point& p : points_in({-5, 42, 9, 51}, 300)) {
    const Point there = plain.forward({p.x, p.y, 0});
    const Point back = plain.inverse(there);
    // Systems without heights lose some tens of metres of it on the way, which is worth 1 mm.
    EXPECT_LT(apart(back.x, p.x), 1.5e-8);
    EXPECT_NEAR(back.y, p.y, 1.5e-8);
    // The same from the meridian of Paris, whose degrees are the system's own.
    const Point paris = map.forward({p.x - 2.33722917, p.y, 0});
    EXPECT_LT(apart(paris.x, there.x), 1e-9);
    EXPECT_NEAR(paris.y, there.y, 1e-9);
  }
  TWstatus word = TW_SUCCESS;
  double x = 20, y = 45;
  const Summary outside =
      plain.forward(1, Coordinates<const double>{&x, &y}, Coordinates<double>{&x, &y}, {&word, 1});
  EXPECT_EQ(outside.failed, 1u);
  EXPECT_EQ(word, TW_I_OUTSIDE_CNT);
  EXPECT_TRUE(std::isnan(x));
#ifdef TIDEWATER_HAVE_PROJ
  const std::string pipeline =
      "+proj=pipeline +step +proj=unitconvert +xy_in=deg +xy_out=rad +step +proj=push +v_3 +step "
      "+proj=cart +ellps=clrk80ign +step +proj=xyzgridshift +grids=" +
      path +
      " +grid_ref=output_crs +ellps=GRS80 +step +inv +proj=cart +ellps=GRS80 +step +proj=pop +v_3 "
      "+step +proj=unitconvert +xy_in=rad +xy_out=deg";
  PJ_CONTEXT* const context = proj_context_create();
  PJ* const peer = proj_create(context, pipeline.c_str());
  ASSERT_NE(peer, nullptr);
  double worst = 0;
  for (const Point& p : points_in({-5, 42, 9, 51}, 300)) {
    const Point there = plain.forward({p.x, p.y, 0});
    const PJ_COORD expected = proj_trans(peer, PJ_FWD, proj_coord(p.x, p.y, 0, 0));
    worst = std::max({worst, apart(there.x, expected.xy.x), std::fabs(there.y - expected.xy.y)});
    const PJ_COORD back = proj_trans(peer, PJ_INV, proj_coord(there.x, there.y, 0, 0));
    const Point ours = plain.inverse(there);
    worst = std::max({worst, apart(ours.x, back.xy.x), std::fabs(ours.y - back.xy.y)});
  }
  proj_destroy(peer);
  proj_context_destroy(context);
  std::printf("geocentric translations beside the peer: within %.2g m\n", worst * 111e3);
  EXPECT_LT(worst, kTenthOfMillimetre);
#endif
  // Without the grid the refusal names it; a file of another kind is refused.
  fs::remove(path);
  expect_refused([&] { by_operation("EPSG:4275", "EPSG:4171", "EPSG:9327", folder.path()); },
                 "gr3df97a");
  TiffImage shifts{-5.5,
                   41,
                   0.5,
                   0.5,
                   32,
                   23,
                   {flat_band("latitude_offset", 3), flat_band("longitude_offset", 5)}};
  write_tiff(path, {shifts});
  expect_refused([&] { by_operation("EPSG:4275", "EPSG:4171", "EPSG:9327", folder.path()); },
                 "no bands of geocentric translations");
}

// Every point of the array its own word, with heights above the ellipsoid and without; a grid that
// never comes to rest.
TEST(GridOperations, GeocentricTranslationsOfAnyHeight) {
  const ScratchFolder folder;
  const std::string path = (folder.path() / "fr_ign_gr3df97a.tif").string();
  write_tiff(path, {translations()});
  const Transformation flat = by_operation("EPSG:4275", "EPSG:4171", "EPSG:9327", folder.path());
  const Transformation high = by_operation("EPSG:4275", "EPSG:4965", "EPSG:9327", folder.path());
  for (const Point& p : points_in({-5, 42, 9, 51}, 50)) {
    const Point above = high.forward({p.x, p.y, 1000});
    const Point ground = flat.forward({p.x, p.y, 1000});
    EXPECT_EQ(ground.z, 1000);
    EXPECT_GT(std::fabs(above.z - 1000), 1);  // two ellipsoids
    EXPECT_LT(apart(above.x, ground.x), 1e-6);
    EXPECT_NEAR(above.y, ground.y, 1e-6);
    const Point back = high.inverse(above);
    // Geocentric coordinates come back within two micrometres.
    EXPECT_LT(apart(back.x, p.x), 1e-12);
    EXPECT_NEAR(back.y, p.y, 3e-11);
    EXPECT_NEAR(back.z, 1000, 1e-6);
  }
  const auto word_of = [](const Transformation& map, double x, double y, bool back) {
    TWstatus word = TW_SUCCESS;
    const Coordinates<double> at = {&x, &y};
    back ? map.inverse(1, at, at, {&word, 1}) : map.forward(1, at, at, {&word, 1});
    EXPECT_EQ(std::isnan(x), word != TW_SUCCESS);
    return word;
  };
  EXPECT_EQ(word_of(flat, 20, 45, false), TW_I_OUTSIDE_CNT);
  EXPECT_EQ(word_of(flat, 20, 45, true), TW_I_OUTSIDE_CNT);
  TiffImage wild = translations();
  wild.bands[1].value = [](int row, int column) { return (row + column) % 2 == 0 ? 9e5F : -9e5F; };
  write_tiff(path, {wild});
  const Transformation lost = by_operation("EPSG:4275", "EPSG:4171", "EPSG:9327", folder.path());
  EXPECT_EQ(word_of(lost, 2.3, 47.3, false), TW_NOT_CONVERGED);
  EXPECT_EQ(word_of(lost, 2.3, 47.3, true), TW_SUCCESS);
  // A national grid by that name holds no translations; each of the three bands must be there.
  folder.write("fr_ign_gr3df97a.tif", GsbFile{{plane("A", "NONE", 40, 50, -20, 10, 1, 1)}}.bytes());
  expect_refused([&] { by_operation("EPSG:4275", "EPSG:4171", "EPSG:9327", folder.path()); },
                 "of NTv2's form holds no translations");
  for (std::size_t k = 0; k < 3; ++k) {
    TiffImage lacking = translations();
    lacking.bands[k].description = "w_translation";
    write_tiff(path, {lacking});
    expect_refused([&] { by_operation("EPSG:4275", "EPSG:4171", "EPSG:9327", folder.path()); },
                   "no bands of geocentric translations");
  }
}

// The form in which the grid of NTv1 is handed out today.
TEST(GridOperations, FirstNationalTransformationOfCanada) {
  const ScratchFolder folder;
  const std::string path = (folder.path() / "ca_nrc_ntv1_can.tif").string();
  const auto plane = [](float at, float east, float north) {
    return [=](int row, int column) {
      return at + east * static_cast<float>(column) + north * static_cast<float>(row);
    };
  };
  TiffImage image{-142, 40, 1, 1, 95, 45, {}};
  image.bands = {{"latitude_offset", "arc-second", "", plane(0.5F, 0.015625F, -0.03125F)},
                 {"longitude_offset", "arc-second", "east", plane(-2, 0.0625F, 0.125F)}};
  write_tiff(path, {image});
  const Transformation map = by_operation("EPSG:4267", "EPSG:4269", "EPSG:1312", folder.path());
  for (const Point& p : points_in({-140, 45, -55, 80}, 200)) {
    const Point there = map.forward(p);
    const double column = p.x + 142, row = p.y - 40;
    EXPECT_NEAR(there.x, p.x + (-2 + 0.0625 * column + 0.125 * row) / 3600, 1e-12);
    EXPECT_NEAR(there.y, p.y + (0.5 + 0.015625 * column - 0.03125 * row) / 3600, 1e-12);
    const Point back = map.inverse(there);
    EXPECT_NEAR(back.x, p.x, 1e-10);
    EXPECT_NEAR(back.y, p.y, 1e-10);
  }
}

#endif

// A grid of the caller's between the datums of two systems, there and turned round, alone and
// before an operation of the registry; a sentence where it is none.
TEST(GridOperations, GridsOfTheCallers) {
  const ScratchFolder folder;
  folder.write("own.gsb", GsbFile{{plane("A", "NONE", 40, 55, -20, 10, 1, 1)}}.bytes());
  const ShiftGrid grid("own.gsb", {folder.directory()});
  const auto map = [&](const char* source, const char* target, const std::string& operation) {
    TransformationOptions options;
    options.operation = operation;
    options.grid_folders = {folder.directory()};
    return Transformation(System(source), System(target), options);
  };
  const Transformation there = map("EPSG:4277", "EPSG:4258", "grid:own.gsb");
  const Transformation back = map("EPSG:4258", "EPSG:4277", "-grid:own.gsb");
  const Transformation by_path =
      map("EPSG:4277", "EPSG:4258", "grid:" + (folder.path() / "own.gsb").string());
  // Its longitudes are from Greenwich, whatever meridian the system has.
  const Transformation paris = map("EPSG:4807", "EPSG:4258", "grid:own.gsb");
  const Transformation joined = map("EPSG:4277", "EPSG:4326", "grid:own.gsb EPSG:1149");
  EXPECT_TRUE(std::isnan(there.accuracy()));
  // What they tell of themselves makes them again.
  EXPECT_EQ(there.operation(), "grid:own.gsb");
  EXPECT_EQ(back.operation(), "-grid:own.gsb");
  EXPECT_EQ(joined.operation(), "grid:own.gsb EPSG:1149");
  EXPECT_NE(there.describe().find("NTv2 grid of 16 rows and 31 columns, OLD to NEW " +
                                  (folder.path() / "own.gsb").string()),
            std::string::npos)
      << there.describe();
  EXPECT_NE(back.describe().find("inverse of NTv2 grid"), std::string::npos) << back.describe();
  EXPECT_NE(joined.describe().find("EPSG:1149"), std::string::npos) << joined.describe();
  for (const Point& p : points_in({-8, 41, 18, 54}, 50)) {
    const Point expected = grid.forward(p);
    for (const Transformation* one : {&there, &by_path, &joined}) {
      EXPECT_NEAR(one->forward(p).x, expected.x, 1e-12);
      EXPECT_NEAR(one->forward(p).y, expected.y, 1e-12);
    }
    EXPECT_NEAR(back.forward(expected).x, p.x, 1e-10);
    EXPECT_NEAR(back.inverse(p).y, expected.y, 1e-12);
    const Point from_paris = paris.forward({p.x - 2.33722917, p.y, 0});
    EXPECT_NEAR(from_paris.x, expected.x, 1e-12);
    EXPECT_NEAR(from_paris.y, expected.y, 1e-12);
  }
  EXPECT_THROW(map("EPSG:4277", "EPSG:4258", "grid:none.gsb"), Error);
}

// The grid of France on the old maps of its zones, alone and behind the rotation to Greenwich that
// the registry puts before it; the easting and northing are PROJ's.
TEST(GridOperations, TheGridOfFranceFromParis) {
  if (!fs::exists(kProjData + "ntf_r93.gsb")) GTEST_SKIP() << "ntf_r93.gsb is not installed";
  for (const char* operation : {"grid:ntf_r93.gsb", "EPSG:1763 grid:ntf_r93.gsb", ""}) {
    const Transformation map =
        by_operation("EPSG:27572", "EPSG:2154", operation, fs::path(kProjData));
    const Point there = map.forward({600000, 2200000});
    EXPECT_NEAR(there.x, 649398.87, 0.005) << operation;
    EXPECT_NEAR(there.y, 6633524.19, 0.005) << operation;
    const Point back = map.inverse(there);
    EXPECT_NEAR(back.x, 600000, 1e-4) << operation;
    EXPECT_NEAR(back.y, 2200000, 1e-4) << operation;
  }
}

// What is missing is told by the registry's name, and by PROJ's where that has the grid at all.
TEST(GridOperations, CandidatesTellTheFilesThatTheyNeed) {
  bool seen[3] = {};
  for (const Candidate& candidate :
       Transformation::candidates(System("EPSG:4267"), System("EPSG:4269"))) {
    if (candidate.steps == "EPSG:9111") {
      seen[0] = true;
      EXPECT_EQ(candidate.missing, "the grid SK27-83.gsb");
    } else if (candidate.steps == "EPSG:1462") {
      seen[1] = true;
      EXPECT_EQ(candidate.missing, "the grid GS2783v1.QUE");
    } else if (candidate.steps == "EPSG:8555") {
      seen[2] = true;
      EXPECT_EQ(candidate.missing, "the method NADCON5 (2D)");
    }
  }
  for (const bool one : seen) EXPECT_TRUE(one);
}

// A .gtx file: a header of four doubles and two counts, then the rows from the south, big-endian.
std::string gtx(double west, double south, double step, int rows, int columns,
                const std::function<float(int row, int column)>& value) {
  std::string bytes;
  const auto put = [&](auto bits) {
    for (int shift = 8 * static_cast<int>(sizeof bits) - 8; shift >= 0; shift -= 8) {
      bytes += static_cast<char>(bits >> shift & 0xff);
    }
  };
  for (const double v : {south, west, step, step}) put(std::bit_cast<std::uint64_t>(v));
  put(static_cast<std::uint32_t>(rows));
  put(static_cast<std::uint32_t>(columns));
  for (int r = 0; r < rows; ++r) {
    for (int c = 0; c < columns; ++c) put(std::bit_cast<std::uint32_t>(value(r, c)));
  }
  return bytes;
}

// NZVD2016 to the heights of Auckland 1946: what the grid has is added on the way there.
TEST(GridOperations, OffsetsBetweenVerticalDatums) {
  const ScratchFolder folder;
  const auto plane = [](int row, int column) {
    return 0.25F + 0.03125F * static_cast<float>(column) - 0.0625F * static_cast<float>(row);
  };
  folder.write("auckht1946-nzvd2016.gtx", gtx(173, -38, 0.25, 17, 17, plane));
  const auto expected = [](const Point& p) {
    return 0.25 + 0.03125 * (p.x - 173) / 0.25 - 0.0625 * (p.y + 38) / 0.25;
  };
  const auto map = [&](const char* source, const char* target, const char* operation = "") {
    TransformationOptions options;
    options.operation = operation;
    options.grid_folders = {folder.path().string()};
    return Transformation(System(source), System(target), options);
  };
  const Transformation there = map("EPSG:4167+7839", "EPSG:4167+5759");
  EXPECT_NE(there.describe().find("EPSG:9312"), std::string::npos) << there.describe();
  EXPECT_NEAR(there.accuracy(), 0.02, 1e-12);
  const Transformation back = map("EPSG:4167+5759", "EPSG:4167+7839");
  const Transformation named = map("EPSG:4167+7839", "EPSG:4167+5759", "EPSG:9312");
  const Transformation own =
      map("EPSG:4167+7839", "EPSG:4167+5759", "offset:auckht1946-nzvd2016.gtx");
  for (const Point& p : points_in({173.5, -37.5, 176.5, -34.5}, 100)) {
    const Point to = there.forward(p);
    EXPECT_NEAR(to.x, p.x, 1e-13);
    EXPECT_NEAR(to.z, p.z + expected(p), 1e-9);
    EXPECT_NEAR(there.inverse(to).z, p.z, 1e-12);
    EXPECT_NEAR(back.forward(to).z, p.z, 1e-12);
    EXPECT_EQ(named.forward(p).z, to.z);
    EXPECT_EQ(own.forward(p).z, to.z);
  }
  EXPECT_TRUE(std::isnan(own.accuracy()));
  EXPECT_EQ(own.operation(), "offset:auckht1946-nzvd2016.gtx");
  EXPECT_TRUE(std::isnan(there.forward({160, -36, 5}).z));
  // Positions on another datum would be read a hundred metres off; the way over the ellipsoid wants
  // a grid that is not there.
  expect_refused([&] { const Transformation wrong = map("EPSG:4272+7839", "EPSG:4272+5759"); },
                 "nzgeoid2016");
#ifdef TIDEWATER_HAVE_PROJ
  const std::string definition = "+proj=vgridshift +multiplier=1 +grids=" +
                                 (folder.path() / "auckht1946-nzvd2016.gtx").string();
  PJ_CONTEXT* const context = proj_context_create();
  PJ* const peer = proj_create(context, definition.c_str());
  ASSERT_NE(peer, nullptr);
  for (const Point& p : points_in({173.5, -37.5, 176.5, -34.5}, 100)) {
    const PJ_COORD to = proj_trans(peer, PJ_FWD, proj_coord(p.x * kDegree, p.y * kDegree, p.z, 0));
    EXPECT_NEAR(there.forward(p).z, to.xyz.z, 1e-6);
  }
  proj_destroy(peer);
  proj_context_destroy(context);
#endif
}

}  // namespace
