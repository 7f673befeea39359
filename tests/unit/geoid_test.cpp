#include <gtest/gtest.h>

#include <array>
#include <cstring>
#include <random>

#include "support/data.hpp"
#include "support/grids.hpp"
#include "support/little_memory.hpp"
#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/datum.h"

using namespace tidewater::test;
namespace fs = std::filesystem;

namespace {

CoordinateTriple at(double lon, double lat, double height = 5) {
  return {degrees(lon), degrees(lat), height};
}

// Every node tells its place.
float place(int row, int col) { return static_cast<float>(1000 * row + col); }

// A field that the interpolation gives back: of the second order in each direction.
double curved(double row, double col) {
  return 2 + row / 2 - col / 4 + row * row / 16 + col * col / 32 - row * col / 64;
}
float curved_node(int row, int col) { return static_cast<float>(curved(row, col)); }

// The same everywhere.
auto level(float value) {
  return [value](int, int) { return value; };
}

void write_grid(const ScratchFolder& folder, const std::string& name, const GridFile& file) {
  folder.write(name + ".geo", file.bytes());
}

struct Opened {
  TWstatus status = 0;
  GeoidControl control = {};
};

Opened open(const ScratchFolder& folder) {
  Opened opened;
  TWgeo90_c(folder.directory().c_str(), &opened.control, &opened.status);
  return opened;
}

// The list of a geoid directory: names from column 15 on.
Opened open(const ScratchFolder& folder, const std::vector<std::string>& names) {
  std::string list;
  for (const std::string& name : names) list += "0 2 4 6 8 10 12" + name + "\n";
  folder.write("area.par", list);
  return open(folder);
}

struct Undulation {
  double n = kUntouched;
  TWstatus status = 0;

  Undulation(const GeoidControl& control, double lon, double lat) {
    TWget_geo90(degrees(lon), degrees(lat), kNaN, &control, &n, &status);
  }
};

// What TWgeo90_local() leaves behind.
struct Loaded {
  GeoidWindow window;
  std::array<float, 22 * 22> data;
  std::int32_t index = -7;
  TWstatus status = 0;

  Loaded(const GeoidControl& control, double x, double y) {
    std::memset(&window, 0, sizeof window);
    window.xmin = 4711;
    window.nc = -5;
    data.fill(-1);
    TWgeo90_local(x, y, kNaN, &control, &window, data.data(), &index, &status);
  }

  // The window holds nodes from (row, col) of a grid of places whose corner is (xmin, ymin).
  void expect_nodes(double xmin, double ymin, int row, int col, int nr = 22, int nc = 22) const {
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_EQ(window.nc, nc);
    EXPECT_EQ(window.nr, nr);
    EXPECT_EQ(window.xmin, xmin + col);
    EXPECT_EQ(window.ymin, ymin + row);
    EXPECT_EQ(window.xmax, xmin + col + nc - 1);
    EXPECT_EQ(window.ymax, ymin + row + nr - 1);
    EXPECT_EQ(window.dx, 1);
    EXPECT_EQ(window.dy, 1);
    for (int r = 0; r < 22; ++r) {
      for (int c = 0; c < 22; ++c) {
        // The rows keep their stride; what a clipped window does not use stays.
        const float expected = r < nr && c < nc ? place(row + r, col + c) : -1;
        EXPECT_EQ(data[static_cast<std::size_t>(22 * r + c)], expected) << r << " " << c;
      }
    }
  }
  void expect_window_untouched() const {
    EXPECT_EQ(window.xmin, 4711);
    EXPECT_EQ(window.nc, -5);
    expect_data_untouched();
  }
  void expect_data_untouched() const {
    for (const float v : data) EXPECT_EQ(v, -1);
  }
};

// The window belongs to the process: each test begins with one where no test's grid lies.
class Geoid : public ::testing::Test {
 protected:
  Geoid() {
    const ScratchFolder far_away;
    write_grid(far_away, "far", {-355, -85, 24, 24, level(0)});
    EXPECT_EQ(Undulation(open(far_away, {"far"}).control, -340, -75).status, TW_SUCCESS);
  }

  ScratchFolder folder;
};

TEST_F(Geoid, HeadersFillTheBlock) {
  TIDEWATER_NOT_ON_WINDOWS("no file name has an asterisk");
  write_grid(folder, "first", {-100.1F, 20, 60, 50, place, 0.1F, 0.5F});
  write_grid(folder, "second", {-50, -20, 25, 27, place, 2, 3});
  folder.write("area.par",
               "* a comment\n\n \t \n*\nsome free text  first  and more\n"
               "xxxxxxxxxxxxxxx   second\n               *first\n");
  write_grid(folder, "*first", {-10, -20, 25, 27, place});
  const Opened opened = open(folder);
  EXPECT_EQ(opened.status, TW_SUCCESS);
  const GeoidControl& control = opened.control;
  EXPECT_EQ(control.directory, folder.directory());
  ASSERT_EQ(control.grid_count, 3);
  const GeoidGrid& first = control.grids[0];
  EXPECT_STREQ(first.name, "first");
  EXPECT_EQ(first.nc, 60);
  EXPECT_EQ(first.nr, 50);
  EXPECT_EQ(first.xmin, -100.1F);
  // worked out in double from the floats, and rounded once
  EXPECT_EQ(first.xmax, static_cast<float>(59 * 0.100000001490116119 - 100.09999847412109));
  EXPECT_EQ(first.ymin, 20);
  EXPECT_EQ(first.ymax, 44.5);
  EXPECT_EQ(first.dx, 0.1F);
  EXPECT_EQ(first.dy, 0.5F);
  EXPECT_STREQ(control.grids[1].name, "second");
  EXPECT_EQ(control.grids[1].xmax, -2);
  EXPECT_STREQ(control.grids[2].name, "*first");  // an asterisk further on is a name
}

TEST_F(Geoid, RealGridsAtTheirNodesAndBetween) {
  TIDEWATER_NEED_SHARED_DATA();
  Opened opened;
  TWgeo90_c((shared_data() / "geoid/").string().c_str(), &opened.control, &opened.status);
  ASSERT_EQ(opened.status, TW_SUCCESS);
  ASSERT_EQ(opened.control.grid_count, 2);
  EXPECT_STREQ(opened.control.grids[0].name, "namer96");
  EXPECT_STREQ(opened.control.grids[1].name, "europe96");
  std::mt19937 random(96);
  for (const char* name : {"namer96", "europe96"}) {
    const std::string bytes = file_bytes(shared_data() / "geoid" / (std::string(name) + ".geo"));
    const int nc = i32_at(bytes, 64), nr = i32_at(bytes, 68);
    const double xmin = f32_at(bytes, 76), dx = f32_at(bytes, 80);
    const double ymin = f32_at(bytes, 84), dy = f32_at(bytes, 88);
    const auto node = [&](int row, int col) -> double {
      return f32_at(bytes, static_cast<std::size_t>(4 * ((row + 1) * (nc + 1) + 1 + col)));
    };
    std::uniform_int_distribution<int> row(1, nr - 2), col(1, nc - 2);
    std::uniform_real_distribution<double> off(-0.49, 0.49);
    for (int i = 0; i < 500; ++i) {
      const int r = row(random), c = col(random);
      Undulation n(opened.control, xmin + c * dx, ymin + r * dy);
      EXPECT_EQ(n.status, TW_SUCCESS);
      EXPECT_NEAR(n.n, node(r, c), 1e-4);  // slopes of 1 m a node, places to 1e-5 of a node
      // Lagrange's form on the three nearest nodes each way.
      const double p = off(random), q = off(random);
      const std::array<double, 3> wx = {p * (p - 1) / 2, 1 - p * p, p * (p + 1) / 2};
      const std::array<double, 3> wy = {q * (q - 1) / 2, 1 - q * q, q * (q + 1) / 2};
      double expected = 0;
      for (int j = 0; j < 3; ++j) {
        for (int k = 0; k < 3; ++k) {
          expected += wy[static_cast<std::size_t>(j)] * wx[static_cast<std::size_t>(k)] *
                      node(r + j - 1, c + k - 1);
        }
      }
      n = Undulation(opened.control, xmin + (c + p) * dx, ymin + (r + q) * dy);
      EXPECT_EQ(n.status, TW_SUCCESS);
      EXPECT_NEAR(n.n, expected, 1e-4);  // single precision of some 50 m
    }
  }
}

TEST_F(Geoid, RealGridsAgainstProj) {
  TIDEWATER_NEED_SHARED_DATA();
#ifdef TIDEWATER_HAVE_PROJ
  if (!fs::exists(proj_data() / "egm96_15.gtx")) GTEST_SKIP() << "egm96_15.gtx is not installed";
  const ProjPeer peer("+proj=vgridshift +grids=egm96_15.gtx +multiplier=1");
  ASSERT_TRUE(peer.ok());
  Opened opened;
  TWgeo90_c((shared_data() / "geoid/").string().c_str(), &opened.control, &opened.status);
  for (int i = 0; i < 200; ++i) {
    // nodes of the peer's grid and of ours
    CoordinateTriple p = at(-128 + 0.25 * (i * 37 % 250), 22 + 0.25 * (i * 53 % 120), 0);
    const double expected = peer.forward(p).z;
    TWstatus status = 0;
    TWgeo90_f(1, &p, &opened.control, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_NEAR(p.z, expected, 1e-4);
    // In the middle of a cell the peer is linear: an eighth of the second differences apart.
    p = at(-128.125 + 0.25 * (i * 37 % 250), 22.125 + 0.25 * (i * 53 % 120), 0);
    const double linear = peer.forward(p).z;
    TWgeo90_f(1, &p, &opened.control, &p, &status);
    EXPECT_NEAR(p.z, linear, 0.3);
  }
#else
  TIDEWATER_NEED_PROJ();
#endif
}

TEST_F(Geoid, HeightsThereAndBack) {
  write_grid(folder, "g", {-100, 20, 60, 50, curved_node});
  const Opened opened = open(folder, {"g"});
  Points points = {at(-70.25, 45.5, 100), at(-10, 45, 200), at(-71.75, 44.25, -300)};
  const Points in = points;
  Points out = untouched(3);
  TWstatus status = 0;
  TWgeo90_f(3, points.data(), &opened.control, out.data(), &status);
  EXPECT_EQ(status, TW_I_OUTSIDE_GEOID);
  // single precision of figures up to 60
  expect_near(out[0], in[0].x, in[0].y, 100 + curved(25.5, 29.75), 1e-4);
  expect_near(out[1], in[1].x, in[1].y, 200, 0);
  expect_near(out[2], in[2].x, in[2].y, -300 + curved(24.25, 28.25), 1e-4);
  EXPECT_EQ(out[0].x, in[0].x);
  EXPECT_EQ(out[0].y, in[0].y);
  TWgeo90_i(3, out.data(), &opened.control, out.data(), &status);
  EXPECT_EQ(status, TW_I_OUTSIDE_GEOID);
  for (std::size_t i = 0; i < 3; ++i) EXPECT_NEAR(out[i].z, in[i].z, 1e-12);
  TWgeo90_i(1, points.data(), &opened.control, points.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NEAR(points[0].z, 100 - curved(25.5, 29.75), 1e-4);
  for (const int32_t count : {0, -1}) {
    CoordinateTriple p = kUntouchedPoint;
    TWgeo90_f(count, in.data(), &opened.control, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    TWgeo90_i(count, in.data(), &opened.control, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_untouched(p);
  }
}

TEST_F(Geoid, ThreeNearestNodes) {
  // One node stands out by 1; its weight shows which nodes are used.
  write_grid(folder, "g",
             {-100, 20, 60, 50, [](int r, int c) { return r == 25 && c == 30 ? 1.F : 0; }});
  const Opened opened = open(folder, {"g"});
  const auto weight = [](double t) {  // at distance t from the node
    const double d = std::fabs(t);
    return d < 0.5 ? 1 - d * d : d < 1.5 ? (1 - d) * (2 - d) / 2 : 0;
  };
  for (const double p : {-1.625, -1.375, -0.625, -0.375, 0.0, 0.375, 0.625, 1.375, 1.625}) {
    for (const double q : {-1.625, -0.625, -0.375, 0.0, 0.375, 1.375}) {
      const Undulation n(opened.control, -70 + p, 45 + q);
      EXPECT_NEAR(n.n, weight(p) * weight(q), 1e-6) << p << " " << q;
    }
  }
}

TEST_F(Geoid, HalfwayTheNextNodeIsTaken) {
  // Exactly between nodes 30 and 31 (in figures without rounding) u is 0.5, which is not below it:
  // nodes 30, 31 and 32 serve.
  write_grid(folder, "g", {-64, 0, 60, 50, [](int, int c) { return c == 29 ? 1.F : 0; }});
  const Opened opened = open(folder, {"g"});
  double lon = -33.5 / 57.29577951308232;
  while (lon * 57.29577951308232 < -33.5) lon = std::nextafter(lon, 0);
  double n = kUntouched;
  TWstatus status = 0;
  TWget_geo90(lon, 0.4, 0, &opened.control, &n, &status);
  EXPECT_EQ(n, 0);
  lon = std::nextafter(lon, -1);
  while (lon * 57.29577951308232 > -33.50001) lon -= 1e-8;
  TWget_geo90(lon, 0.4, 0, &opened.control, &n, &status);
  EXPECT_NEAR(n, -0.125, 1e-4);  // u rose to 1.49999: (1.5 - 1) (1.5 - 2) / 2
}

TEST_F(Geoid, WindowStaysInsideTheGrid) {
  write_grid(folder, "g", {-100, 20, 60, 50, place});
  const Opened opened = open(folder, {"g"});
  const auto expect = [&](double x, double y, int row, int col) {
    SCOPED_TRACE(testing::Message() << x << " " << y);
    const Loaded loaded(opened.control, x, y);
    EXPECT_EQ(loaded.index, 0);
    loaded.expect_nodes(-100, 20, row, col);
  };
  expect(-70.5, 45.5, 15, 19);  // ix = 29, iy = 25
  expect(-89.5, 30.5, 0, 0);    // ix = iy = 10: the first that are not held
  expect(-90.5, 29.5, 0, 0);    // ix = iy = 9 become 10
  expect(-99.5, 20.5, 0, 0);
  expect(-51.5, 58.5, 28, 38);  // ix = 48 = nc - 12, iy = 38 = nr - 12: the last
  expect(-50.5, 59.5, 28, 38);  // one more becomes the same
  expect(-41.5, 68.5, 28, 38);
  expect(-99.5, 68.5, 28, 0);
}

TEST_F(Geoid, EdgesOfTheGrid) {
  write_grid(folder, "g", {-100, 20, 60, 50, curved_node});
  const Opened opened = open(folder, {"g"});
  for (const auto& [x, y] : {std::pair{-100.0, 45.0},
                             {-41.0, 45.0},
                             {-70.0, 20.0},
                             {-70.0, 69.0},
                             {kNaN, 45.0},
                             {-70.0, kNaN}}) {
    const Loaded loaded(opened.control, x, y);
    EXPECT_EQ(loaded.status, TW_I_OUTSIDE_GEOID);
    EXPECT_EQ(loaded.index, 0);
    loaded.expect_window_untouched();
  }
  // In the outermost cells the nearest three nodes are those of the edge.
  for (const double x : {-99.875, -99.25, -41.125, -41.75}) {
    for (const double y : {20.125, 20.75, 68.875, 68.25}) {
      const Undulation n(opened.control, x, y);
      EXPECT_EQ(n.status, TW_SUCCESS);
      EXPECT_NEAR(n.n, curved(y - 20, x + 100), 2e-4);  // figures up to 250
    }
  }
}

TEST_F(Geoid, FirstGridOfTheListWins) {
  write_grid(folder, "wide", {-100, 0, 81, 81, level(1)});
  write_grid(folder, "fine", {-75, 30, 30, 30, level(2)});
  const Loaded wide(open(folder, {"wide", "fine"}).control, -60.5, 45.5);
  EXPECT_EQ(wide.index, 0);
  EXPECT_EQ(wide.data[0], 1);
  const Opened opened = open(folder, {"fine", "wide"});
  EXPECT_EQ(Loaded(opened.control, -60.5, 45.5).data[0], 2);
  const Loaded south(opened.control, -60.5, 15.5);
  EXPECT_EQ(south.index, 1);
  EXPECT_EQ(south.data[0], 1);
}

TEST_F(Geoid, OuterCellsOfTheWindowAreNotUsed) {
  write_grid(folder, "g", {-100, 20, 60, 50, level(1)});
  const Opened opened = open(folder, {"g"});
  // Loads columns 19 to 40, -81 to -60, and rows 15 to 36, 35 to 56; then the values change.
  const auto value_after = [&](double x, double y) {
    write_grid(folder, "g", {-100, 20, 60, 50, level(1)});
    EXPECT_EQ(Undulation(opened.control, -45, 25).n, 1);
    EXPECT_EQ(Undulation(opened.control, -70.5, 45.5).n, 1);
    write_grid(folder, "g", {-100, 20, 60, 50, level(2)});
    return Undulation(opened.control, x, y).n;
  };
  EXPECT_EQ(value_after(-79.999, 45.5), 1);
  EXPECT_EQ(value_after(-80.001, 45.5), 2);
  EXPECT_EQ(value_after(-61.001, 45.5), 1);
  EXPECT_EQ(value_after(-60.999, 45.5), 2);
  EXPECT_EQ(value_after(-70.5, 36.001), 1);
  EXPECT_EQ(value_after(-70.5, 35.999), 2);
  EXPECT_EQ(value_after(-70.5, 54.999), 1);
  EXPECT_EQ(value_after(-70.5, 55.001), 2);
}

TEST_F(Geoid, LongitudesFromAllTurns) {
  write_grid(folder, "g", {-200, 20, 60, 50, curved_node});
  const Opened opened = open(folder, {"g"});
  for (const double turns : {0.0, 360.0, -360.0, 1080.0}) {
    EXPECT_NEAR(Undulation(opened.control, -170.25 + turns, 45.5).n, curved(25.5, 29.75), 1e-4);
  }
  for (const double lon : {kInfinity, -kInfinity, 1e300}) {
    double n = kUntouched;
    TWstatus status = 0;
    TWget_geo90(lon, 0.5, 0, &opened.control, &n, &status);
    EXPECT_EQ(status, TW_I_OUTSIDE_GEOID);
    EXPECT_EQ(n, kUntouched);
  }
}

// A grid of 81 by 81 nodes beside another one, which stands before or behind it in the list.  By
// itself (-60.5, 40.5) loads columns from -71 to -50 and rows from 30 to 51.
class GeoidMoves : public Geoid {
 protected:
  void expect(const GridFile& other, double xmin, double ymin, double x = -60.5, double y = 40.5) {
    write_grid(folder, "wide", {-100, 0, 81, 81, place});
    write_grid(folder, "other", other);
    Loaded(open(folder, {"other", "wide"}).control, x, y)
        .expect_nodes(-100, 0, static_cast<int>(ymin), static_cast<int>(xmin + 100));
    Loaded(open(folder, {"wide", "other"}).control, x, y)
        .expect_nodes(-100, 0, static_cast<int>(ymin), static_cast<int>(xmin + 100));
  }
  static GridFile box(float xmin, float ymin, float xmax, float ymax) {
    return {xmin, ymin, static_cast<std::int32_t>(xmax - xmin) + 1,
            static_cast<std::int32_t>(ymax - ymin) + 1, level(0)};
  }
};

TEST_F(GeoidMoves, OffAGridToTheEast) { expect(box(-55, 10, -30, 70), -71 - 4, 30); }
TEST_F(GeoidMoves, OffAGridToTheSouth) { expect(box(-90, 10, -30, 35), -71, 30 + 4); }
TEST_F(GeoidMoves, OffAGridToTheWest) { expect(box(-90, 10, -65, 70), -71 + 5, 30); }
TEST_F(GeoidMoves, OffAGridToTheNorth) { expect(box(-90, 45, -30, 70), -71, 30 - 5); }

TEST_F(GeoidMoves, KeepsANodeOnTheOthersEdge) {
  expect(box(-51, 10, -30, 70), -71, 30);     // one column in
  expect(box(-52, 10, -30, 70), -72, 30);     // two
  expect(box(-52.4F, 10, -30, 70), -72, 30);  // 2.4 counts as two
  expect(box(-52.5F, 10, -30, 70), -73, 30);  // 2.5 as three
  expect(box(-50.4F, 10, -30, 70), -71, 30);
}

TEST_F(GeoidMoves, SmallestMoveWins) {
  expect(box(-55, 48, -30, 70), -71, 30 - 2);  // 4 west against 2 south
  expect(box(-53, 45, -30, 70), -71 - 2, 30);  // 2 west against 5 south
}

TEST_F(GeoidMoves, JudgedFromThePointItself) {
  // The window is held at the grid's west edge, so that the point is far from its middle. The other
  // grid ends east of the point but west of the middle: no move of two columns east, but one of
  // eight rows south.
  expect(box(-120, 33, -97, 70), -100, 21 - 8, -98.5, 31.5);
}

TEST_F(GeoidMoves, ClippedToTheGrid) {
  write_grid(folder, "wide", {-100, 0, 81, 81, place});
  write_grid(folder, "other", box(-85, 10, -30, 70));
  const Opened opened = open(folder, {"wide", "other"});
  // Columns -100 to -79 give way by five: what lies before the grid is cut.
  const Loaded west(opened.control, -95.5, 5.5);
  west.expect_nodes(-100, 0, 0, 0, 22, 17);
  // East, by a grid to the west; rows by grids south and north.
  write_grid(folder, "other", box(-90, 10, -35, 70));
  Loaded(open(folder, {"wide", "other"}).control, -24.5, 5.5).expect_nodes(-100, 0, 0, 64, 22, 17);
  write_grid(folder, "other", box(-90, 65, -35, 70));
  Loaded(open(folder, {"wide", "other"}).control, -60.5, 74.5)
      .expect_nodes(-100, 0, 69, 29, 12, 22);
  write_grid(folder, "other", box(-90, 10, -35, 15));
  Loaded(open(folder, {"wide", "other"}).control, -60.5, 4.5).expect_nodes(-100, 0, 0, 29, 12, 22);
}

TEST_F(GeoidMoves, ClippedWindowInterpolates) {
  write_grid(folder, "wide", {-100, 0, 81, 81, curved_node});
  write_grid(folder, "other", box(-85, 10, -30, 70));
  const Opened opened = open(folder, {"wide", "other"});
  for (const double x : {-99.875, -95.5, -86.25}) {
    const Undulation n(opened.control, x, 5.5);
    EXPECT_EQ(n.status, TW_SUCCESS);
    EXPECT_NEAR(n.n, curved(5.5, x + 100), 1e-4);
  }
}

TEST_F(GeoidMoves, OffThePointIsAnError) {
  // In the first cell, with the other grid beginning at the point's own meridian: two columns are
  // left, which is too few to interpolate in.
  write_grid(folder, "wide", {-100, 0, 81, 81, place});
  write_grid(folder, "other", box(-99.5F, -5, -30, 70));
  const Opened opened = open(folder, {"wide", "other"});
  Loaded(opened.control, -99.5, 5.5).expect_nodes(-100, 0, 0, 0, 22, 2);
  CoordinateTriple out = kUntouchedPoint;
  const CoordinateTriple in = {-99.5 / 57.29577951308232, degrees(5.5), 0};
  ASSERT_LE(in.x * 57.29577951308232, -99.5);
  TWstatus status = 0;
  TWgeo90_f(1, &in, &opened.control, &out, &status);
  EXPECT_EQ(status, TW_GEOID_READ_ERROR);
  expect_untouched(out);
}

TEST_F(Geoid, NarrowGrids) {
  // Fewer than 22 columns or rows: the whole width is the window.
  for (const int n : {12, 15, 21}) {
    write_grid(folder, "columns", {-100, 20, n, 60, place});
    write_grid(folder, "rows", {-70, 20, 60, n, place});
    const Opened opened = open(folder, {"columns", "rows"});
    for (const double d : {0.5, 5.5, n - 1.5}) {
      Loaded(opened.control, -100 + d, 50.5).expect_nodes(-100, 20, 20, 0, 22, n);
      Loaded(opened.control, -40.5, 20 + d).expect_nodes(-70, 20, 0, 19, n, 22);
    }
  }
  write_grid(folder, "columns", {-100, 20, 12, 60, curved_node});
  const Opened opened = open(folder, {"columns"});
  for (double x = -99.875; x < -89; x += 0.25) {
    EXPECT_NEAR(Undulation(opened.control, x, 50.5).n, curved(30.5, x + 100), 1e-4);
  }
}

TEST_F(Geoid, OneCallAsOneForEachPoint) {
  // Enough points for the files to be read whole on the way; three grids, off which windows move
  // and to which they are clipped, and points outside.
  const auto node = [](int r, int c) { return static_cast<float>(r * r % 13 + c * c % 7); };
  const auto write = [&] {
    write_grid(folder, "fine", {-84.3F, 24.2F, 32, 30, node, 0.25F, 0.25F});
    write_grid(folder, "a", {-100, 20, 45, 37, node, 0.5F, 0.5F});
    write_grid(folder, "b", {-79, 21, 14, 15, node});
  };
  write();
  const Opened opened = open(folder, {"fine", "a", "b"});
  ASSERT_EQ(opened.status, TW_SUCCESS);
  for (const auto call : {TWgeo90_f, TWgeo90_i}) {
    const auto run = [&](std::int32_t n, const CoordinateTriple* from, CoordinateTriple* to) {
      TWstatus status = 0;
      call(n, from, &opened.control, to, &status);
      return status;
    };
    const auto aside = [&] {
      const CoordinateTriple p = {degrees(-98.5), degrees(34.5), 0};
      CoordinateTriple out;
      run(1, &p, &out);
    };
    const auto reset = [&] {
      write();
      aside();
    };
    write();
    // Not where windows give way so far that a point stops the call.
    Points in;
    for (const CoordinateTriple& p : scattered(900, -101, -64, 19, 38)) {
      aside();
      CoordinateTriple out;
      if (TW_OK(run(1, &p, &out))) in.push_back(p);
    }
    ASSERT_GT(in.size(), 700U);
    // A window held from an earlier point serves such a point, and may give it another figure: both
    // ways see the same windows.
    expect_one_call_as_many(in, reset, run, [&] {
      for (const char* name : {"fine", "a", "b"}) {
        fs::remove(folder.path() / (std::string(name) + ".geo"));
      }
    });
  }
}

TEST_F(Geoid, GridsOfTooFewNodes) {
  write_grid(folder, "columns", {-100, 20, 11, 60, place});
  write_grid(folder, "rows", {-70, 20, 60, 11, place});
  const Opened opened = open(folder, {"columns", "rows"});
  EXPECT_EQ(opened.status, TW_SUCCESS);
  for (const auto& [x, y] : {std::pair{-95.5, 50.5}, {-40.5, 25.5}}) {
    const Loaded loaded(opened.control, x, y);
    EXPECT_EQ(loaded.status, TW_GEOID_READ_ERROR);
    loaded.expect_window_untouched();
  }
}

TEST_F(Geoid, WindowOutlivesTheBlock) {
  write_grid(folder, "g", {-100, 20, 60, 50, level(1)});
  const ScratchFolder other;
  write_grid(other, "g", {-100, 20, 60, 50, level(2)});
  const Opened first = open(folder, {"g"}), second = open(other, {"g"});
  EXPECT_EQ(Undulation(first.control, -70.5, 45.5).n, 1);
  EXPECT_EQ(Undulation(second.control, -70.5, 45.5).n, 1);
  EXPECT_EQ(Undulation(second.control, -50.5, 45.5).n, 2);
  // A point outside leaves the window in use.
  EXPECT_EQ(Undulation(second.control, -10, 45.5).status, TW_I_OUTSIDE_GEOID);
  fs::remove(other.path() / "g.geo");
  EXPECT_EQ(Undulation(second.control, -50.5, 45.5).n, 2);
}

TEST_F(Geoid, IndexFallsBackToTheFirstGrid) {
  // After a point outside, the window is that of the second grid but the bounds used are those of
  // the first: half a node off, they shift the cell, and with it nothing but the node taken.
  write_grid(folder, "first", {-200.5F, 20, 30, 50, level(0)});
  write_grid(folder, "second", {-100, 20, 60, 50, [](int, int c) { return c == 30 ? 1.F : 0; }});
  const Opened opened = open(folder, {"first", "second"});
  const double before = Undulation(opened.control, -70, 45.25).n;
  EXPECT_EQ(before, 1);
  EXPECT_EQ(Undulation(opened.control, -10, 45.25).status, TW_I_OUTSIDE_GEOID);
  // 130.5 columns from the first grid's corner; the window's first column, 19 of its own, is taken
  // for column 120 (119.5 rounded up): the tenth of the window, node 29, and 0.5 beyond it.
  EXPECT_NEAR(Undulation(opened.control, -70, 45.25).n, 0.75, 1e-6);
}

TEST_F(Geoid, UnusableLists) {
  write_grid(folder, "good", {-100, 20, 60, 50, place});
  const std::string good = "               good\n";
  Opened opened;
  std::strcpy(opened.control.directory, "before");
  opened.control.grid_count = 17;
  const auto expect = [&](const std::string& directory, TWstatus status) {
    TWgeo90_c(directory.c_str(), &opened.control, &opened.status);
    EXPECT_EQ(opened.status, status);
    EXPECT_EQ(opened.control.grid_count, 17);
  };
  expect(folder.directory(), TW_GEOID_FILE_ERROR);  // no list
  folder.write("area.par", good);
  expect(folder.path().string(), TW_GEOID_FILE_ERROR);  // no separator is added
  expect(std::string(260, '/'), TW_GEOID_FILE_ERROR);
  expect(std::string(100000, 'x'), TW_GEOID_FILE_ERROR);
  EXPECT_STREQ(opened.control.directory, "before");
  fs::remove(folder.path() / "area.par");
  fs::create_directory(folder.path() / "area.par");
  expect(folder.directory(), TW_GEOID_FILE_ERROR);
  EXPECT_STREQ(opened.control.directory, "before");
  fs::remove(folder.path() / "area.par");

  const auto expect_list = [&](const std::string& list, TWstatus status) {
    SCOPED_TRACE(list);
    std::strcpy(opened.control.grids[0].name, "");
    folder.write("area.par", good + list);
    expect(folder.directory(), status);
    EXPECT_STREQ(opened.control.grids[0].name, "good");
    EXPECT_EQ(opened.control.directory, folder.directory());
  };
  expect_list("123456789012345\n", TW_GEOID_FILE_ERROR);  // 15 characters
  expect_list("good\n", TW_GEOID_FILE_ERROR);
  expect_list("123456789012345 \n", TW_GEOID_FILE_ERROR);  // 16, but no name in them
  expect_list("123456789012345     \t\n", TW_GEOID_FILE_ERROR);
  expect_list(" * not in the first\n", TW_GEOID_READ_ERROR);  // no comment: the name is "irst"
  expect_list("123456789012345x\n", TW_GEOID_READ_ERROR);     // 16: a name, of no file
  folder.write("short.geo", GridFile{-100, 20, 60, 50, place}.bytes().substr(0, 95));
  expect_list("               short\n", TW_GEOID_READ_ERROR);
  fs::create_directory(folder.path() / "folder.geo");
  expect_list("               folder\n", TW_GEOID_READ_ERROR);

  folder.write("short.geo", GridFile{-100, 20, 60, 50, place}.bytes().substr(0, 96));
  folder.write("area.par", "               short");  // a header is enough, and no newline
  EXPECT_EQ(open(folder).control.grid_count, 1);
  folder.write("area.par", "");
  TWgeo90_c(folder.directory().c_str(), &opened.control, &opened.status);
  EXPECT_EQ(opened.status, TW_SUCCESS);
  EXPECT_EQ(opened.control.grid_count, 0);
}

TEST_F(Geoid, ListOfFiftyOneGrids) {
  write_grid(folder, "g", {-100, 20, 60, 50, place});
  std::vector<std::string> names(50, "g");
  names.emplace_back("missing");
  Opened opened = open(folder, names);
  EXPECT_EQ(opened.status, TW_SUCCESS);
  EXPECT_EQ(opened.control.grid_count, 50);
  // Lines that are skipped take no slot.
  std::string list;
  for (int i = 0; i < 50; ++i) list += "* comment\n\n               g\n";
  folder.write("area.par", list);
  opened = open(folder);
  EXPECT_EQ(opened.status, TW_SUCCESS);
  EXPECT_EQ(opened.control.grid_count, 50);
}

TEST_F(Geoid, LongLinesAreReadInPieces) {
  write_grid(folder, "g", {-100, 20, 60, 50, place});
  const std::string front = "               g";
  // 274 characters with the newline are one line; of more, the rest is a line of its own.
  folder.write("area.par", front + std::string(274 - 17, ' ') + "\n");
  EXPECT_EQ(open(folder).control.grid_count, 1);
  folder.write("area.par", front + std::string(274 - 16, ' ') + front + "\n");
  EXPECT_EQ(open(folder).control.grid_count, 2);
  folder.write("area.par", std::string(15, ' ') + std::string(259, 'x') + "\n");
  EXPECT_EQ(open(folder).status, TW_GEOID_READ_ERROR);
}

TEST_F(Geoid, FileGoneAtTheLoad) {
  write_grid(folder, "g", {-100, 20, 60, 50, level(1)});
  write_grid(folder, "gone", {-200, 20, 60, 50, level(2)});
  const Opened opened = open(folder, {"g", "gone"});
  fs::remove(folder.path() / "gone.geo");
  const Loaded loaded(opened.control, -170.5, 45.5);
  EXPECT_EQ(loaded.status, TW_GEOID_READ_ERROR);
  EXPECT_EQ(loaded.index, 0);
  loaded.expect_window_untouched();
  const Points in = {at(-70.5, 45.5), at(-10, 45), at(-170.5, 45.5), at(-70.5, 45.5)};
  for (const auto run : {TWgeo90_f, TWgeo90_i}) {
    Points out = untouched(4);
    TWstatus status = 0;
    run(4, in.data(), &opened.control, out.data(), &status);
    EXPECT_EQ(status, TW_GEOID_READ_ERROR);  // the outside point is forgotten
    EXPECT_NE(out[0].z, kUntouched);
    EXPECT_EQ(out[1].z, in[1].z);
    expect_untouched(out[2]);
    expect_untouched(out[3]);
  }
}

TEST_F(Geoid, FileCutAtEachRecord) {
  write_grid(folder, "g", {-100, 20, 60, 50, place});
  const Opened opened = open(folder, {"g"});
  const fs::path path = folder.path() / "g.geo";
  const auto full = fs::file_size(path);
  ASSERT_EQ(full, 244U * 51);
  for (std::uintmax_t length = full; length-- > 0;) {
    if (length % 244 > 1 && length % 244 < 243) continue;
    fs::resize_file(path, length);
    // Rows 15 to 36, records 16 to 37.
    const Loaded loaded(opened.control, -70.5, 45.5);
    EXPECT_EQ(loaded.window.xmin, -81);  // the bounds are new
    if (length >= 244U * 38) {
      loaded.expect_nodes(-100, 20, 15, 19);
    } else {
      EXPECT_EQ(loaded.status, TW_GEOID_READ_ERROR) << length;
      loaded.expect_data_untouched();
    }
  }
}

TEST_F(Geoid, TheSamePointAskedAgainIsServedFromTheOldNodes) {
  // By contract: the bounds are those of the window that could not be read.
  write_grid(folder, "g", {-100, 20, 60, 60, [](int r, int) { return r < 30 ? 1.0F : 2.0F; }});
  const Opened opened = open(folder, {"g"});
  EXPECT_EQ(Undulation(opened.control, -70, 25.25).n, 1);
  fs::resize_file(folder.path() / "g.geo", 5);
  EXPECT_EQ(Undulation(opened.control, -70, 70.25).status, TW_GEOID_READ_ERROR);
  const Undulation again(opened.control, -70, 70.25);
  EXPECT_EQ(again.status, TW_SUCCESS);
  EXPECT_EQ(again.n, 1);
}

TEST_F(Geoid, HeadersOfImpossibleSizes) {
  constexpr std::int32_t kMost = 2147483647;
  const float infinity = std::numeric_limits<float>::infinity();
  const struct {
    std::int32_t nc, nr;
    float dx, dy;
    bool window_unchanged;
  } cases[] = {{-5, 30, -3, 1, true},
               {30, -5, 1, -3, true},
               {kMost, kMost, 1e-7F, 1e-7F, true},
               {kMost, 30, 1e-7F, 1, false},  // a record longer than the file
               {30, kMost, 1, 1e-7F, false},
               {-kMost - 1, 30, -1e-7F, 1, true},
               {30, 30, infinity, 1, true}};
  for (const auto& c : cases) {
    std::string bytes(64, ' ');
    for (const std::int32_t n : {c.nc, c.nr, 1}) append_i32(bytes, n);
    for (const float f : {-100.0F, c.dx, 20.0F, c.dy, 0.0F}) append_f32(bytes, f);
    bytes.resize(4000);
    folder.write("g.geo", bytes);
    const Opened opened = open(folder, {"g"});
    EXPECT_EQ(opened.status, TW_SUCCESS);
    const Loaded loaded(opened.control, -95.5, 23.5);
    EXPECT_EQ(loaded.status, TW_GEOID_READ_ERROR);
    if (c.window_unchanged) loaded.expect_window_untouched();
    loaded.expect_data_untouched();
  }
  for (const float spacing : {0.0F, -1.0F, std::numeric_limits<float>::quiet_NaN()}) {
    write_grid(folder, "g", {-100, 20, 60, 50, place, spacing, 1});
    EXPECT_EQ(Loaded(open(folder, {"g"}).control, -95.5, 23.5).status, TW_I_OUTSIDE_GEOID);
  }
}

TEST_F(Geoid, NoMemoryForTheRecords) {
  TIDEWATER_NEED_MEMORY_LIMIT();
  // Twenty-two records of 64 megabytes, in a file without content.
  constexpr std::int32_t kColumns = 1 << 24;
  std::string bytes(64, ' ');
  for (const std::int32_t n : {kColumns, 30, 1}) append_i32(bytes, n);
  for (const float f : {-100.0F, 4e-6F, 20.0F, 1.0F, 0.0F}) append_f32(bytes, f);
  folder.write("g.geo", bytes);
  fs::resize_file(folder.path() / "g.geo", 4 * (std::uintmax_t{kColumns} + 1) * 31);
  const Opened opened = open(folder, {"g"});
  EXPECT_EQ(opened.status, TW_SUCCESS);
  const auto fails = [&] {
    const Loaded loaded(opened.control, -95.5, 35.5);
    CoordinateTriple out = kUntouchedPoint;
    const CoordinateTriple in = at(-95.5, 35.5);
    TWstatus status = 0;
    TWgeo90_f(1, &in, &opened.control, &out, &status);
    return loaded.status == TW_NO_MEMORY && loaded.window.nc == 22 && loaded.window.ymin == 25 &&
           loaded.data[0] == -1 && status == TW_NO_MEMORY && out.z == kUntouched;
  };
  expect_with_little_memory(fails);
}

TEST_F(Geoid, DamagedHeadersDoNoHarm) {
  std::mt19937 random(6);
  const std::string better = GridFile{-97, 22, 30, 30, level(1)}.bytes();
  const std::string wide = GridFile{-100, 20, 60, 50, level(2)}.bytes();
  int loaded_windows = 0;
  for (int round = 0; round < 400; ++round) {
    std::string damaged[] = {better, wide};
    for (std::string& bytes : damaged) {
      for (auto changes = random() % 4; changes > 0; --changes) {
        bytes.at(64 + random() % 32) = static_cast<char>(random());
      }
      if (random() % 8 == 0) bytes.resize(random() % bytes.size());
    }
    folder.write("better.geo", damaged[0]);
    folder.write("wide.geo", damaged[1]);
    const Opened opened = open(folder, {"better", "wide"});
    if (opened.status != TW_SUCCESS) continue;
    Points points = {at(-98.5, 23.5), at(-90.1, 34), at(-99.9, 20.1), at(-50, 25), at(-1e-6, 0)};
    TWstatus status = 0;
    for (CoordinateTriple& p : points) {
      TWgeo90_f(1, &p, &opened.control, &p, &status);
      TWgeo90_i(1, &p, &opened.control, &p, &status);
    }
    for (const double x : {-99.0, -97.5, -85.5, -60.25}) {
      loaded_windows += Loaded(opened.control, x, 33.5).status == TW_SUCCESS;
    }
  }
  EXPECT_GT(loaded_windows, 30);
}

TEST_F(Geoid, BlockOfOtherBoundsDoesNoHarm) {
  // The window serves under any block; its grid's bounds may then be anything.
  write_grid(folder, "g", {-100, 20, 60, 50, level(1)});
  Opened opened = open(folder, {"g"});
  EXPECT_EQ(Undulation(opened.control, -70.5, 45.5).n, 1);
  for (const float bound : {1e30F, -1e30F, std::numeric_limits<float>::quiet_NaN(),
                            std::numeric_limits<float>::infinity()}) {
    opened.control.grids[0].xmin = bound;
    const Undulation x(opened.control, -70.5, 45.5);
    EXPECT_TRUE(x.status == TW_SUCCESS || x.status == TW_GEOID_READ_ERROR);
    opened.control.grids[0].xmin = -100;
    opened.control.grids[0].ymin = bound;
    const Undulation y(opened.control, -70.5, 45.5);
    EXPECT_TRUE(y.status == TW_SUCCESS || y.status == TW_GEOID_READ_ERROR);
    opened.control.grids[0].ymin = 20;
  }
}

}  // namespace
