#include <gtest/gtest.h>

#include <array>
#include <cstring>
#include <random>

#include "support/data.hpp"
#include "support/grids.hpp"
#include "support/little_memory.hpp"
#include "support/points.hpp"
#include "tidewater/datum.h"

using namespace tidewater::test;
namespace fs = std::filesystem;

namespace {

CoordinateTriple at(double lon, double lat, double height = 5) {
  return {degrees(lon), degrees(lat), height};
}

// Every node tells its place: longitude shifts 100 row + col, latitude shifts the negative.
float place(int row, int col) { return static_cast<float>(100 * row + col); }

// A field that bilinear interpolation gives back exactly, small enough for any grid.
float flat(int row, int col) { return 0.5F + 0.25F * static_cast<float>(row + 2 * col); }

void write_pair(const ScratchFolder& folder, const std::string& name, GridFile file) {
  folder.write(name + ".los", file.bytes());
  const auto value = file.value;
  file.value = [value](int r, int c) { return -value(r, c); };
  folder.write(name + ".las", file.bytes());
}

struct Opened {
  TWstatus status = 0;
  NadconControl control = {};
};

Opened open(const ScratchFolder& folder) {
  Opened opened;
  TWnadcon_c(folder.directory().c_str(), &opened.control, &opened.status);
  return opened;
}

Opened open(const ScratchFolder& folder, const std::string& list) {
  folder.write("area.par", list);
  return open(folder);
}

// The window belongs to the process: each test begins with one where no test's grid lies.
class Nadcon : public ::testing::Test {
 protected:
  Nadcon() {
    const ScratchFolder far_away;
    write_pair(far_away, "far", {-30, -80, 25, 4, flat});
    const Opened far = open(far_away, "far\n");
    CoordinateTriple p = at(-8.5, -78.5);
    TWstatus status = 0;
    TWnadcon_f(1, &p, &far.control, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
  }

  ScratchFolder folder;
};

// What TWloc_grids() leaves behind.
struct Loaded {
  NadconWindow window;
  std::array<double, 16> lon, lat;
  TWstatus status = 0;

  Loaded(const NadconControl& control, double x, double y) {
    std::memset(&window, 0, sizeof window);
    window.xmin = kUntouched;
    window.nc = -5;
    lon.fill(kUntouched);
    lat.fill(kUntouched);
    TWloc_grids(x, y, kNaN, &control, &window, lon.data(), lat.data(), &status);
  }

  void expect_bounds(double xmin, double ymin) const {
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_EQ(window.nc, 4);
    EXPECT_EQ(window.nr, 4);
    EXPECT_EQ(window.xmin, xmin);
    EXPECT_EQ(window.ymin, ymin);
    EXPECT_EQ(window.xmax, xmin + 3);
    EXPECT_EQ(window.ymax, ymin + 3);
    EXPECT_EQ(window.dx, 1);
    EXPECT_EQ(window.dy, 1);
  }
  // The tables hold nodes from (row, col) of a grid of places.
  void expect_places(int row, int col) const {
    for (int r = 0; r < 4; ++r) {
      for (int c = 0; c < 4; ++c) {
        EXPECT_EQ(lon[static_cast<std::size_t>(4 * r + c)], 100 * (row + r) + col + c);
        EXPECT_EQ(lat[static_cast<std::size_t>(4 * r + c)], -(100 * (row + r) + col + c));
      }
    }
  }
  void expect_window_untouched() const {
    EXPECT_EQ(window.xmin, kUntouched);
    EXPECT_EQ(window.nc, -5);
    expect_tables_untouched();
  }
  void expect_tables_untouched() const {
    for (const double v : lon) EXPECT_EQ(v, kUntouched);
    for (const double v : lat) EXPECT_EQ(v, kUntouched);
  }
};

TEST_F(Nadcon, HeadersFillTheBlock) {
  write_pair(folder, "first", {-100, 20, 11, 6, place, 0.25F, 0.5F});
  write_pair(folder, "second", {-50, -20, 5, 7, place, 2, 3});
  const Opened opened = open(folder, "first  a comment\n  second\tanother\n");
  EXPECT_EQ(opened.status, TW_SUCCESS);
  const NadconControl& control = opened.control;
  EXPECT_EQ(control.directory, folder.directory());
  ASSERT_EQ(control.grid_count, 2);
  EXPECT_STREQ(control.grids[0].name, "first");
  EXPECT_EQ(control.grids[0].nc, 11);
  EXPECT_EQ(control.grids[0].nr, 6);
  EXPECT_EQ(control.grids[0].xmin, -100);
  EXPECT_EQ(control.grids[0].xmax, -97.5);
  EXPECT_EQ(control.grids[0].ymin, 20);
  EXPECT_EQ(control.grids[0].ymax, 22.5);
  EXPECT_EQ(control.grids[0].dx, 0.25);
  EXPECT_EQ(control.grids[0].dy, 0.5);
  EXPECT_STREQ(control.grids[1].name, "second");
  EXPECT_EQ(control.grids[1].xmax, -42);
  EXPECT_EQ(control.grids[1].ymax, -2);
}

TEST_F(Nadcon, MeadesRanch) {
  TIDEWATER_NEED_SHARED_DATA();
  NadconControl control = {};
  TWstatus status = 0;
  TWnadcon_c((shared_data() / "nadcon/").string().c_str(), &control, &status);
  ASSERT_EQ(status, TW_SUCCESS);
  ASSERT_EQ(control.grid_count, 2);
  EXPECT_STREQ(control.grids[0].name, "alaska");
  EXPECT_STREQ(control.grids[1].name, "conus");

  const double lon = -(98 + 32 / 60.0 + 30.506 / 3600), lat = 39 + 13 / 60.0 + 26.686 / 3600;
  CoordinateTriple out = kUntouchedPoint;
  const CoordinateTriple in = at(lon, lat, 611);
  TWnadcon_f(1, &in, &control, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(out.z, 611);
  constexpr double kSecond = kPi / 180 / 3600;
  // The published NAD 83 position of the station, by adjustment.
  EXPECT_NEAR(out.x, -degrees(98, 32, 31.74604), 0.02 * kSecond);
  EXPECT_NEAR(out.y, degrees(39, 13, 26.71220), 0.02 * kSecond);

  // The bilinear value from the four nodes of the file, as weights of the nodes.
  const auto shift = [&](const char* name) {
    const std::string bytes = file_bytes(shared_data() / "nadcon" / name);
    const int nc = i32_at(bytes, 64);
    const double u =
        (lon - static_cast<double>(f32_at(bytes, 76))) / static_cast<double>(f32_at(bytes, 80));
    const double v =
        (lat - static_cast<double>(f32_at(bytes, 84))) / static_cast<double>(f32_at(bytes, 88));
    const int c = static_cast<int>(u), r = static_cast<int>(v);
    const auto node = [&](int row, int col) {
      return static_cast<double>(
          f32_at(bytes, static_cast<std::size_t>(4 * ((row + 1) * (nc + 1) + 1 + col))));
    };
    const double p = u - c, q = v - r;
    return (1 - p) * (1 - q) * node(r, c) + p * (1 - q) * node(r, c + 1) +
           (1 - p) * q * node(r + 1, c) + p * q * node(r + 1, c + 1);
  };
  EXPECT_NEAR(out.x, in.x - shift("conus.los") * kSecond, 1e-6 * kSecond);
  EXPECT_NEAR(out.y, in.y + shift("conus.las") * kSecond, 1e-6 * kSecond);
}

TEST_F(Nadcon, RealGridsThereAndBack) {
  TIDEWATER_NEED_SHARED_DATA();
  NadconControl control = {};
  TWstatus status = 0;
  TWnadcon_c((shared_data() / "nadcon/").string().c_str(), &control, &status);
  std::mt19937 random(63);
  std::uniform_real_distribution<double> lon(-120, -70), lat(28, 48);
  Points in(300);
  for (auto& p : in) p = at(lon(random), lat(random));
  Points out = in;
  TWnadcon_f(300, out.data(), &control, out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  for (std::size_t i = 0; i < in.size(); ++i) EXPECT_NE(out[i].x, in[i].x);
  TWnadcon_i(300, out.data(), &control, out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  // The pass in which one component came within 1e-9 degrees ends it; the other is near by then:
  // a pass leaves the product of the shift (5e-5 at most) and its slope (about 1e-5).
  for (std::size_t i = 0; i < in.size(); ++i) expect_near(out[i], in[i].x, in[i].y, 5, 1e-9);
}

TEST_F(Nadcon, ShiftIsPositiveWestAndNorth) {
  // Three seconds everywhere in .los, minus three in .las.
  write_pair(folder, "g", {-100, 20, 30, 8, [](int, int) { return 3.0F; }});
  const Opened opened = open(folder, "g\n");
  const CoordinateTriple in = at(-96.5, 23.25, 8);
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWnadcon_f(1, &in, &opened.control, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out, degrees(-96.5) - degrees(0, 0, 3), degrees(23.25) - degrees(0, 0, 3), 8, 1e-15);
}

TEST_F(Nadcon, EveryCellOfTheWindowServes) {
  write_pair(folder, "g", {-100, 20, 30, 20, flat});
  const Opened opened = open(folder, "g\n");
  // The first point loads columns 9 to 12, rows 9 to 12; the others lie in its corner cells.
  Points points = {at(-89.5, 30.5), at(-90.75, 29.25), at(-88.25, 31.75), at(-88.25, 29.25)};
  const Points in = points;
  TWstatus status = 0;
  TWnadcon_f(1, points.data(), &opened.control, points.data(), &status);
  fs::remove(folder.path() / "g.los");  // nothing more can be loaded
  TWnadcon_f(3, &points[1], &opened.control, &points[1], &status);
  EXPECT_EQ(status, TW_SUCCESS);
  for (std::size_t i = 0; i < in.size(); ++i) {
    const double u = in[i].x * 180 / kPi + 100, v = in[i].y * 180 / kPi - 20;
    const double seconds = 0.5 + 0.25 * (v + 2 * u);
    expect_near(points[i], in[i].x - degrees(0, 0, seconds), in[i].y - degrees(0, 0, seconds), 5,
                1e-14);
  }
}

TEST_F(Nadcon, WindowStaysInsideTheGrid) {
  write_pair(folder, "g", {-100, 20, 30, 8, place});
  const Opened opened = open(folder, "g\n");
  const auto expect = [&](double x, double y, int row, int col) {
    SCOPED_TRACE(testing::Message() << x << " " << y);
    const Loaded loaded(opened.control, x, y);
    loaded.expect_bounds(-100 + col, 20 + row);
    loaded.expect_places(row, col);
  };
  expect(-95.5, 23.5, 2, 3);   // ix = 4, iy = 3: nothing is held
  expect(-98.5, 21.5, 0, 0);   // ix = iy = 1: the first that is not held
  expect(-99.5, 20.5, 0, 0);   // ix = iy = 0 become 1
  expect(-72.5, 25.5, 4, 26);  // ix = 27 = nc - 3, iy = 5 = nr - 3: the last that are not held
  expect(-71.5, 26.5, 4, 26);  // one more becomes the same
  expect(-99.5, 26.99, 4, 0);  // each direction by itself
  expect(-71.01, 20.01, 0, 26);
  expect(-96, 23, 2, 3);  // on a node: the cell to its east and north
}

TEST_F(Nadcon, FourNodesAreEnough) {
  write_pair(folder, "rows", {-100, 20, 30, 4, place});
  write_pair(folder, "columns", {-60, 20, 4, 30, place});
  const Opened opened = open(folder, "rows\ncolumns\n");
  for (const double d : {0.5, 1.5, 2.5}) {
    const Loaded rows(opened.control, -90.5, 20 + d);
    rows.expect_bounds(-92, 20);
    rows.expect_places(0, 8);
    const Loaded columns(opened.control, -60 + d, 30.5);
    columns.expect_bounds(-60, 29);
    columns.expect_places(9, 0);
  }
}

TEST_F(Nadcon, PointInTheFirstCell) {
  write_pair(folder, "g", {-100, 20, 30, 8, flat});
  const Opened opened = open(folder, "g\n");
  const CoordinateTriple in = at(-99.75, 20.5);
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWnadcon_f(1, &in, &opened.control, &out, &status);
  const double seconds = 0.5 + 0.25 * (0.5 + 2 * 0.25);
  expect_near(out, in.x - degrees(0, 0, seconds), in.y - degrees(0, 0, seconds), 5, 1e-15);
}

TEST_F(Nadcon, EdgesAreOutside) {
  write_pair(folder, "g", {-100, 20, 30, 8, place});
  const Opened opened = open(folder, "g\n");
  const double west = -100, east = -71, south = 20, north = 27;
  for (const auto& [x, y] : {std::pair{west, 23.0}, {east, 23.0}, {-95.0, south}, {-95.0, north}}) {
    const Loaded loaded(opened.control, x, y);
    EXPECT_EQ(loaded.status, TW_I_OUTSIDE_NADCON);
    loaded.expect_window_untouched();
  }
  EXPECT_EQ(Loaded(opened.control, std::nextafter(west, 0), 23).status, TW_SUCCESS);
  EXPECT_EQ(Loaded(opened.control, std::nextafter(east, -100), 23).status, TW_SUCCESS);
  EXPECT_EQ(Loaded(opened.control, -95, std::nextafter(south, 90)).status, TW_SUCCESS);
  EXPECT_EQ(Loaded(opened.control, -95, std::nextafter(north, 0)).status, TW_SUCCESS);
  EXPECT_EQ(Loaded(opened.control, kNaN, 23).status, TW_I_OUTSIDE_NADCON);
  EXPECT_EQ(Loaded(opened.control, -95, kNaN).status, TW_I_OUTSIDE_NADCON);
}

TEST_F(Nadcon, FirstGridOfTheListWins) {
  write_pair(folder, "coarse", {-100, 20, 30, 8, place});
  write_pair(folder, "fine", {-98, 22, 25, 5, flat});
  const Opened coarse_first = open(folder, "coarse\nfine\n");
  EXPECT_EQ(Loaded(coarse_first.control, -95.5, 24.5).lon[0], 303);
  const Opened fine_first = open(folder, "fine\ncoarse\n");
  EXPECT_EQ(Loaded(fine_first.control, -95.5, 24.5).lon[0], 1.25);
  // On the edge of the first the second takes over, and gives way by the two columns beyond it.
  EXPECT_EQ(Loaded(fine_first.control, -98, 24.5).window.xmin, -99 - 2);
}

// A grid of 41 by 41 nodes behind a better one of the given bounds, and the window that it loads.
class NadconMoves : public Nadcon {
 protected:
  Loaded load(float xmin, float ymin, float xmax, float ymax, double x, double y) {
    write_pair(folder, "wide", {-100, 0, 41, 41, place});
    write_pair(folder, "better",
               {xmin, ymin, static_cast<std::int32_t>(xmax - xmin) + 1,
                static_cast<std::int32_t>(ymax - ymin) + 1, flat});
    return {open(folder, "better\nwide\n").control, x, y};
  }
  static void expect(const Loaded& loaded, double xmin, double ymin) {
    loaded.expect_bounds(xmin, ymin);
    loaded.expect_places(static_cast<int>(ymin), static_cast<int>(xmin + 100));
  }
};

// Without a better grid near, (-80.5, 20.5) loads columns from -82 and rows from 19.
TEST_F(NadconMoves, OffAGridToTheEast) { expect(load(-80, 10, -70, 30, -80.5, 20.5), -83, 19); }
TEST_F(NadconMoves, OffAGridToTheSouth) { expect(load(-90, 10, -70, 20, -80.5, 20.5), -82, 20); }
TEST_F(NadconMoves, OffAGridToTheWest) { expect(load(-90, 10, -81, 30, -80.5, 20.5), -81, 19); }
TEST_F(NadconMoves, OffAGridToTheNorth) { expect(load(-90, 21, -70, 30, -80.5, 20.5), -82, 18); }

TEST_F(NadconMoves, NotForLessThanACell) {
  expect(load(-79.5F, 10, -69.5F, 30, -80.5, 20.5), -82, 19);
  expect(load(-90, 10, -70, 19.5F, -80.5, 20.5), -82, 19);
}

TEST_F(NadconMoves, NotForAGridThatOnlyTouches) {
  expect(load(-79, 10, -70, 30, -80.5, 20.5), -82, 19);  // begins where the window ends
  expect(load(-90, 22, -70, 30, -80.5, 20.5), -82, 19);
  expect(load(-80, 22, -70, 30, -80.5, 20.5), -82, 19);  // east of it, but in no row of it
  expect(load(-80, 9, -70, 19, -80.5, 20.5), -82, 19);
}

TEST_F(NadconMoves, NotWhereThePointLiesBeyondTheEdge) {
  // A strip that the point's meridian runs through is only given way to along the meridian.
  expect(load(-81, 21, -70, 30, -80.5, 20.5), -82, 18);
}

TEST_F(NadconMoves, SmallestMoveWins) {
  // On a node (amounts 2 west and 1 south): the window of (-80, 20.5) begins at -81.
  expect(load(-80, 21, -70, 30, -80, 20.5), -81, 18);
  expect(load(-80, 10, -70, 30, -80, 20.5), -83, 19);  // 2 west alone
}

TEST_F(NadconMoves, EqualMovesGoTheWayOfTheSort) {
  expect(load(-80, 21, -70, 30, -80.5, 20.5), -83, 19);  // west before south
  expect(load(-80, 10, -70, 20, -80.5, 20.5), -83, 19);  // west before north
  expect(load(-90, 21, -81, 30, -80.5, 20.5), -81, 19);  // east before south
  // The exchange of entries 1 and 3 carries north behind east.
  expect(load(-90, 10, -81, 20, -80.5, 20.5), -81, 19);
}

TEST_F(NadconMoves, WorseGridsDoNotCount) {
  write_pair(folder, "wide", {-100, 0, 41, 41, place});
  write_pair(folder, "worse", {-80, 10, 11, 21, flat});
  const Opened opened = open(folder, "wide\nworse\n");
  Loaded(opened.control, -80.5, 20.5).expect_bounds(-82, 19);
}

TEST_F(NadconMoves, OneAfterTheOther) {
  write_pair(folder, "wide", {-100, 0, 41, 41, place});
  write_pair(folder, "east", {-80, 10, 11, 21, flat});
  write_pair(folder, "north", {-90, 21, 21, 10, flat});
  // The second is judged by the window that the first left: a move each.
  const Loaded loaded(open(folder, "east\nnorth\nwide\n").control, -80.5, 20.5);
  loaded.expect_bounds(-83, 18);
  loaded.expect_places(18, 17);
}

TEST_F(NadconMoves, ReadsTheLabelOnTheWayOut) {
  // A grid of four columns has no room: one column west of it stand the labels.
  write_pair(folder, "small", {-100, 20, 4, 20, place});
  write_pair(folder, "better", {-98, 10, 11, 31, flat});
  const Loaded loaded(open(folder, "better\nsmall\n").control, -98.5, 30.5);
  loaded.expect_bounds(-101, 29);
  EXPECT_EQ(loaded.lon[0], 7777);
  EXPECT_EQ(loaded.lat[4], 7777);
  EXPECT_EQ(loaded.lon[1], 900);
  EXPECT_EQ(loaded.lat[15], -1202);
}

TEST_F(NadconMoves, ReadsTheHeaderOnTheWayOut) {
  write_pair(folder, "small", {-100, 20, 30, 4, place});
  write_pair(folder, "better", {-120, 22, 41, 11, flat});
  const Loaded loaded(open(folder, "better\nsmall\n").control, -80.5, 21.5);
  loaded.expect_bounds(-82, 19);
  // Floats 19 to 22 of the header's record: its xmin, dx, ymin, dy.
  EXPECT_EQ(loaded.lon[0], -100);
  EXPECT_EQ(loaded.lon[1], 1);
  EXPECT_EQ(loaded.lon[2], 20);
  EXPECT_EQ(loaded.lon[3], 1);
  EXPECT_EQ(loaded.lon[4], 18);
  EXPECT_EQ(loaded.lon[15], 221);
}

TEST_F(NadconMoves, OffTheRecordsIsAnError) {
  write_pair(folder, "small", {-100, 20, 4, 4, place});
  const auto expect_error = [&](const GridFile& better, double x, double y, double xmin,
                                double ymin) {
    write_pair(folder, "better", better);
    const Loaded loaded(open(folder, "better\nsmall\n").control, x, y);
    EXPECT_EQ(loaded.status, TW_GRID_FILE_ERROR);
    EXPECT_EQ(loaded.window.xmin, xmin);
    EXPECT_EQ(loaded.window.ymin, ymin);
    loaded.expect_tables_untouched();
  };
  expect_error({-99, 10, 11, 31, flat}, -99, 21.5, -102, 20);     // two columns west
  expect_error({-110, 10, 12, 31, flat}, -98.5, 21.5, -99, 20);   // one east
  expect_error({-110, 21, 21, 11, flat}, -98.5, 21, -100, 18);    // two rows south: before the file
  expect_error({-110, 10, 21, 12, flat}, -98.5, 21.5, -100, 21);  // one north: behind the file
}

TEST_F(NadconMoves, OffThePointByLessThanACellExtends) {
  // The point lies in the first column, where the window is judged from the second: a better grid
  // whose columns end between the two takes the window a column away from the point.
  write_pair(folder, "wide", {-100, 0, 41, 41, flat});
  write_pair(folder, "better", {-120, 20, 22, 11, flat});  // up to -99
  const Opened opened = open(folder, "better\nwide\n");
  const CoordinateTriple in = at(-99.75, 19.25);
  const CoordinateTriple near_edge = at(-100 + 1e-9, 19.25);
  // Judged from -98.75 and -99 + 1e-9, both beyond the better grid.
  Loaded(opened.control, -99.75, 19.25).expect_bounds(-99, 18);
  for (const CoordinateTriple& p : {in, near_edge}) {
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWnadcon_f(1, &p, &opened.control, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    const double seconds = 0.5 + 0.25 * (19.25 + 2 * (p.x * 180 / kPi + 100));
    expect_near(out, p.x - degrees(0, 0, seconds), p.y - degrees(0, 0, seconds), 5, 1e-15);
  }
}

TEST_F(NadconMoves, OffThePointByMoreIsAnError) {
  // The last column but one, judged from a column further west: two columns' move takes the window
  // past the point.
  write_pair(folder, "wide", {-100, 0, 30, 41, flat});
  write_pair(folder, "better", {-73, 20.5F, 30, 11, flat});
  const Opened opened = open(folder, "better\nwide\n");
  Loaded(opened.control, -72, 19.25).expect_bounds(-76, 18);
  const CoordinateTriple in = at(-72, 19.25);
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWnadcon_f(1, &in, &opened.control, &out, &status);
  EXPECT_EQ(status, TW_GRID_FILE_ERROR);
  expect_untouched(out);
}

TEST_F(Nadcon, MarkerTakesTheMeanOfTheOthers) {
  // In the cell around the point stand 1 (south-west), 2 (south-east), 4 (north-west), 8.
  const auto cell = [](int hole) {
    return [hole](int r, int c) {
      if (r == hole / 2 + 3 && c == hole % 2 + 3) return 181.0F;
      if (r < 3 || r > 4 || c < 3 || c > 4) return 100.0F;
      return std::array{1.0F, 2.0F, 4.0F, 8.0F}[static_cast<std::size_t>(2 * (r - 3) + c - 3)];
    };
  };
  const double u = 0.25, v = 0.5;
  const std::array<double, 4> weights = {(1 - u) * (1 - v), u * (1 - v), (1 - u) * v, u * v};
  for (int hole = 0; hole < 4; ++hole) {
    std::array<double, 4> nodes = {1, 2, 4, 8};
    const auto h = static_cast<std::size_t>(hole);
    nodes[h] = (15 - nodes[h]) / 3;
    double expected = 0;
    for (std::size_t k = 0; k < 4; ++k) expected += weights[k] * nodes[k];
    // each its own longitudes, so that the last one's window does not serve
    const auto xmin = static_cast<float>(-170 + 20 * hole);
    write_pair(folder, "g", {xmin, 20, 30, 8, cell(hole)});
    const Opened opened = open(folder, "g\n");
    const CoordinateTriple in = at(static_cast<double>(xmin) + 3.25, 23.5);
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWnadcon_f(1, &in, &opened.control, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_near(out, in.x - degrees(0, 0, expected), in.y - degrees(0, 0, expected), 5, 1e-15);
  }
}

TEST_F(Nadcon, OneEightyIsNoMarker) {
  write_pair(folder, "g",
             {-100, 20, 30, 4, [](int r, int c) { return r == 1 && c == 1 ? 180.F : 0; }});
  const Opened opened = open(folder, "g\n");
  const CoordinateTriple in = at(-98.5, 21.5);
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWnadcon_f(1, &in, &opened.control, &out, &status);
  EXPECT_NEAR(out.x, in.x - degrees(0, 0, 45), 1e-15);
}

TEST_F(Nadcon, SeveralMarkersAreRepairedInTurn) {
  // South-west and north-west are markers of 300: the first takes (8 + 2 + 300) / 3 with the other
  // marker in it, then the other takes its mean with the repaired value.
  const auto field = [](int r, int c) {
    if (c == 3 && (r == 3 || r == 4)) return 300.0F;
    return r == 3 ? 2.0F : 8.0F;
  };
  write_pair(folder, "g", {-100, 20, 30, 8, field});
  const Opened opened = open(folder, "g\n");
  const CoordinateTriple in = at(-96.75, 23.5);
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWnadcon_f(1, &in, &opened.control, &out, &status);
  const double p00 = (8.0 + 2 + 300) / 3;
  const double p01 = (8 + 2 + p00) / 3;
  const double expected = 0.75 * (0.5 * p00 + 0.5 * p01) + 0.25 * (0.5 * 2 + 0.5 * 8);
  EXPECT_NEAR(out.x, in.x - degrees(0, 0, expected), 1e-14);
  // In .las the markers are negative: their size counts.
  EXPECT_NEAR(out.y, in.y - degrees(0, 0, expected), 1e-14);
}

TEST_F(Nadcon, OutsidePointsAreCopied) {
  write_pair(folder, "g", {-100, 20, 30, 8, flat});
  const Opened opened = open(folder, "g\n");
  const Points in = {at(-95.5, 23.5, 1), at(-60 + 360, 23.5, 2), at(-96.5, 23.5, 3)};
  Points out = untouched(3);
  TWstatus status = 0;
  TWnadcon_f(3, in.data(), &opened.control, out.data(), &status);
  EXPECT_EQ(status, TW_I_OUTSIDE_NADCON);
  EXPECT_LT(out[0].x, in[0].x);
  expect_near(out[1], degrees(-60), degrees(23.5), 2, 1e-15);
  EXPECT_LT(out[2].x, in[2].x);
  EXPECT_EQ(out[2].z, 3);

  Points back = untouched(3);
  const Points far = {at(-95.5, 23.5, 1), at(200, 23.5, 2), at(-96.5, 23.5, 3)};
  TWnadcon_i(3, far.data(), &opened.control, back.data(), &status);
  EXPECT_EQ(status, TW_I_OUTSIDE_NADCON);
  EXPECT_GT(back[0].x, far[0].x);
  expect_near(back[1], degrees(-160), degrees(23.5), 2, 1e-15);
  EXPECT_GT(back[2].x, far[2].x);
}

TEST_F(Nadcon, OutsideLongitudeOfHalfATurn) {
  write_pair(folder, "g", {-100, 20, 30, 8, flat});
  const Opened opened = open(folder, "g\n");
  Points points = {{kPi, 0, 0}, {-kPi, 0, 0}, {3 * kPi + 1e-9, 0, 0}};
  TWstatus status = 0;
  TWnadcon_f(3, points.data(), &opened.control, points.data(), &status);
  EXPECT_EQ(points[0].x, kPi);
  EXPECT_EQ(points[1].x, kPi);
  EXPECT_NEAR(points[2].x, -kPi + 1e-9, 1e-14);
}

TEST_F(Nadcon, LongitudesFromAllTurns) {
  write_pair(folder, "g", {-165, 20, 30, 8, [](int, int) { return 3.6F; }});
  write_pair(folder, "west", {-205, 20, 30, 8, [](int, int) { return 3.6F; }});
  const Opened opened = open(folder, "g\nwest\n");
  const double shift = 3.6F / 3600.0;
  for (const double turns : {0.0, 360.0, -360.0, 720.0, -1080.0}) {
    CoordinateTriple p = at(-160.5 + turns, 23.5);
    TWstatus status = 0;
    TWnadcon_f(1, &p, &opened.control, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_NEAR(p.x, degrees(-160.5 - shift), 1e-14);
    p = at(-200.5 + turns, 23.5);
    TWnadcon_f(1, &p, &opened.control, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_NEAR(p.x, degrees(159.5 - shift), 1e-14);  // comes out in (-pi, pi]
  }
}

TEST_F(Nadcon, LongitudesWithoutEnd) {
  write_pair(folder, "g", {-100, 20, 30, 8, flat});
  const Opened opened = open(folder, "g\n");
  Points points = {{kInfinity, 0.4, 1}, {-kInfinity, 0.4, 1}, {1e300, 0.4, 1}, {kNaN, 0.4, 1},
                   {-1.6, kNaN, 1},     {-1.6, kInfinity, 1}, {1e9, 0.1, 1}};
  TWstatus status = 0;
  TWnadcon_f(7, points.data(), &opened.control, points.data(), &status);
  EXPECT_EQ(status, TW_I_OUTSIDE_NADCON);
  EXPECT_EQ(points[0].x, kInfinity);
  EXPECT_EQ(points[2].x, 1e300);
  EXPECT_TRUE(std::isnan(points[3].x));
  EXPECT_TRUE(std::isnan(points[4].y));
  EXPECT_LE(std::fabs(points[6].x), kPi);
  TWnadcon_i(7, points.data(), &opened.control, points.data(), &status);
  EXPECT_EQ(status, TW_I_OUTSIDE_NADCON);
}

TEST_F(Nadcon, WindowOutlivesTheBlock) {
  write_pair(folder, "g", {-100, 20, 30, 8, [](int, int) { return 1.0F; }});
  const ScratchFolder other;
  write_pair(other, "g", {-100, 20, 30, 8, [](int, int) { return 2.0F; }});
  const Opened first = open(folder, "g\n");
  const Opened second = open(other, "g\n");
  const CoordinateTriple in = at(-95.5, 23.5);
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWnadcon_f(1, &in, &first.control, &out, &status);
  TWnadcon_f(1, &in, &second.control, &out, &status);
  EXPECT_NEAR(out.x, in.x - degrees(0, 0, 1), 1e-15);
  // Outside the window the new block serves.
  const CoordinateTriple away = at(-92.25, 23.5);
  TWnadcon_f(1, &away, &second.control, &out, &status);
  EXPECT_NEAR(out.x, away.x - degrees(0, 0, 2), 1e-15);
  // A point outside all grids leaves the window in use.
  CoordinateTriple lost = at(-10, 0);
  TWnadcon_f(1, &lost, &second.control, &lost, &status);
  fs::remove(other.path() / "g.las");
  TWnadcon_f(1, &away, &second.control, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
}

TEST_F(Nadcon, NothingToDo) {
  const NadconControl control = {};
  CoordinateTriple p = kUntouchedPoint;
  for (const int32_t count : {0, -1}) {
    TWstatus status = 0;
    TWnadcon_f(count, &p, &control, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    status = 0;
    TWnadcon_i(count, &p, &control, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_untouched(p);
  }
}

// Forward by a field that is worked out here: shift of the longitude sx + kx u, of the latitude
// -(sy + ky v), with u and v in degrees from the grid's corner.
TEST_F(Nadcon, InverseStopsWhenOneComponentIsNear) {
  // The latitude's shift is the same everywhere: it is right after the first pass, and its
  // difference is within the tolerance in the second.  The longitude's slope of 18 seconds a degree
  // leaves 5e-3 of its error at each pass.
  folder.write("g.los", GridFile{-100, 20, 30, 8,
                                 [](int, int c) { return 10.0F + 18.0F * static_cast<float>(c); }}
                            .bytes());
  folder.write("g.las", GridFile{-100, 20, 30, 8, [](int, int) { return 18.0F; }}.bytes());
  const Opened opened = open(folder, "g\n");
  const CoordinateTriple target = at(-95.5, 23.5, 9);
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWnadcon_i(1, &target, &opened.control, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(out.z, 9);
  const auto shift = [](double lon) { return (10 + 18 * (lon + 100)) / 3600; };
  double lon = -95.5;
  for (int pass = 0; pass < 2; ++pass) lon += -95.5 - (lon - shift(lon));
  EXPECT_NEAR(out.x, degrees(lon), 1e-14);
  // By contract: the true inverse is 6e-7 degrees away, far beyond the tolerance.
  const double truth = (-95.5 + (10 + 1800) / 3600.0) / (1 - 0.005);
  EXPECT_GT(std::fabs(lon - truth), 1e-7);
  EXPECT_NEAR(out.y, degrees(23.5) - degrees(0, 0, 18), 1e-14);
}

TEST_F(Nadcon, InverseTakesFourPassesAtMost) {
  // Both components keep 5e-3 of their error of some 0.02 degrees at each pass: 3e-9 degrees after
  // three, 1e-11 after four.
  folder.write("g.los", GridFile{-100, 20, 30, 8,
                                 [](int, int c) { return 10.0F + 18.0F * static_cast<float>(c); }}
                            .bytes());
  folder.write("g.las", GridFile{-100, 20, 30, 8,
                                 [](int r, int) { return 9.0F + 18.0F * static_cast<float>(r); }}
                            .bytes());
  const Opened opened = open(folder, "g\n");
  CoordinateTriple p = at(-95.5, 23.5);
  TWstatus status = 0;
  TWnadcon_i(1, &p, &opened.control, &p, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  double lon = -95.5, lat = 23.5;
  for (int pass = 0; pass < 4; ++pass) {
    lon += -95.5 - (lon - (10 + 18 * (lon + 100)) / 3600);
    lat += 23.5 - (lat + (9 + 18 * (lat - 20)) / 3600);
  }
  expect_near(p, degrees(lon), degrees(lat), 2e-15);
  EXPECT_GT(std::fabs(lon - (-95.5 + (10 + 1800) / 3600.0) / 0.995), 5e-12);
}

TEST_F(Nadcon, InverseLongitudeComesBackInRange) {
  write_pair(folder, "g", {-205, 20, 30, 8, flat});
  const Opened opened = open(folder, "g\n");
  for (const double lon : {160.0, -200.0, 520.0}) {
    CoordinateTriple p = at(lon, 23.5);
    TWstatus status = 0;
    TWnadcon_f(1, &p, &opened.control, &p, &status);
    TWnadcon_i(1, &p, &opened.control, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_near(p, degrees(160), degrees(23.5), 1e-10);
  }
}

TEST_F(Nadcon, MissingListLeavesTheBlock) {
  Opened opened;
  std::strcpy(opened.control.directory, "before");
  opened.control.grid_count = 17;
  const auto expect_untouched_block = [&](const std::string& directory) {
    TWnadcon_c(directory.c_str(), &opened.control, &opened.status);
    EXPECT_EQ(opened.status, TW_GRID_NOT_FOUND);
    EXPECT_STREQ(opened.control.directory, "before");
    EXPECT_EQ(opened.control.grid_count, 17);
  };
  expect_untouched_block(folder.directory());
  folder.write("area.par", "g\n");
  expect_untouched_block(folder.path().string());  // no separator is added
  expect_untouched_block(std::string(260, '/'));
  expect_untouched_block(std::string(100000, 'x'));
  folder.write("area.par", "\n");  // a blank first line names nothing
  expect_untouched_block(folder.directory());
  fs::remove(folder.path() / "area.par");
  fs::create_directory(folder.path() / "area.par");  // opens, but cannot be read
  expect_untouched_block(folder.directory());
}

TEST_F(Nadcon, LongestDirectory) {
  TIDEWATER_NOT_ON_WINDOWS("no path is as long");
  write_pair(folder, "g", {-100, 20, 30, 8, flat});
  folder.write("area.par", "g\n");
  std::string directory = folder.directory();
  directory.insert(0, 259 - directory.size(), '/');  // slashes in front change nothing
  Opened opened;
  TWnadcon_c(directory.c_str(), &opened.control, &opened.status);
  EXPECT_EQ(opened.status, TW_SUCCESS);
  EXPECT_EQ(opened.control.directory, directory);
  CoordinateTriple p = at(-95.5, 23.5);
  TWstatus status = 0;
  TWnadcon_f(1, &p, &opened.control, &p, &status);
  EXPECT_EQ(status, TW_SUCCESS);
}

TEST_F(Nadcon, ListOfNoLines) {
  Opened opened;
  opened.control.grid_count = 17;
  folder.write("area.par", "");
  TWnadcon_c(folder.directory().c_str(), &opened.control, &opened.status);
  EXPECT_EQ(opened.status, TW_SUCCESS);
  EXPECT_EQ(opened.control.grid_count, 0);
}

TEST_F(Nadcon, ListOfFiftyOneLines) {
  std::string list;
  for (int i = 0; i < 50; ++i) {
    write_pair(folder, "g" + std::to_string(i), {-100, 20, 30, 8, flat});
    list += "g" + std::to_string(i) + "\n";
  }
  const Opened opened = open(folder, list + "missing\n");
  EXPECT_EQ(opened.status, TW_SUCCESS);
  EXPECT_EQ(opened.control.grid_count, 50);
  EXPECT_STREQ(opened.control.grids[49].name, "g49");
}

TEST_F(Nadcon, LinesWithoutANameRepeatTheOneAbove) {
  write_pair(folder, "a", {-100, 20, 30, 8, flat});
  write_pair(folder, "b", {-90, 20, 10, 8, flat});
  const Opened opened = open(folder, "a\n\n \t\nb");  // and no newline at the end
  EXPECT_EQ(opened.status, TW_SUCCESS);
  ASSERT_EQ(opened.control.grid_count, 4);
  EXPECT_STREQ(opened.control.grids[1].name, "a");
  EXPECT_STREQ(opened.control.grids[2].name, "a");
  EXPECT_EQ(opened.control.grids[2].xmin, -100);
  EXPECT_STREQ(opened.control.grids[3].name, "b");
}

TEST_F(Nadcon, LongLinesAreReadInPieces) {
  write_pair(folder, "a", {-100, 20, 30, 8, flat});
  write_pair(folder, "b", {-90, 20, 10, 8, flat});
  // 259 characters with the newline are one line; of more, the rest is a line of its own.
  EXPECT_EQ(open(folder, "a" + std::string(257, ' ') + "\nb\n").control.grid_count, 2);
  const Opened opened = open(folder, "a" + std::string(258, ' ') + "b\n");
  EXPECT_EQ(opened.status, TW_SUCCESS);
  ASSERT_EQ(opened.control.grid_count, 2);
  EXPECT_STREQ(opened.control.grids[1].name, "b");
  EXPECT_EQ(open(folder, std::string(1000, 'x') + "\n").status, TW_GRID_FILE_ERROR);
}

TEST_F(Nadcon, UnusableHeaders) {
  write_pair(folder, "good", {-100, 20, 30, 8, flat});
  folder.write("area.par", "good\nbad\n");
  const auto expect_error = [&](const char* what) {
    SCOPED_TRACE(what);
    Opened opened;
    opened.control.grid_count = 17;
    TWnadcon_c(folder.directory().c_str(), &opened.control, &opened.status);
    EXPECT_EQ(opened.status, TW_GRID_FILE_ERROR);
    EXPECT_EQ(opened.control.grid_count, 17);
    EXPECT_EQ(opened.control.directory, folder.directory());
    EXPECT_STREQ(opened.control.grids[0].name, "good");
  };
  const std::string bytes = GridFile{-90, 20, 30, 8, flat}.bytes();
  expect_error("both missing");
  folder.write("bad.las", bytes);
  expect_error(".los missing");
  folder.write("bad.los", bytes.substr(0, 95));
  expect_error(".los short");
  fs::remove(folder.path() / "bad.las");
  folder.write("bad.los", bytes);
  expect_error(".las missing");
  folder.write("bad.las", bytes.substr(0, 95));
  expect_error(".las short");
  folder.write("bad.las", bytes.substr(0, 96));
  EXPECT_EQ(open(folder).status, TW_SUCCESS);  // a header is enough
  for (std::size_t offset = 0; offset < 64; ++offset) {
    std::string changed = bytes;
    changed[offset] = 'x';
    folder.write("bad.las", changed);
  }
  EXPECT_EQ(open(folder).status, TW_SUCCESS);  // the identification may differ
  for (std::size_t offset = 64; offset < 96; offset += 4) {
    std::string changed = bytes;
    changed[offset] = static_cast<char>(changed[offset] ^ 1);
    folder.write("bad.las", changed);
    expect_error("another field");
  }
  std::string nan = bytes;
  for (std::size_t k = 0; k < 4; ++k) nan[92 + k] = static_cast<char>(0xFF);
  folder.write("bad.las", nan);
  folder.write("bad.los", nan);
  expect_error("a not-a-number equals nothing");
  fs::remove(folder.path() / "bad.las");
  fs::create_directory(folder.path() / "bad.las");
  expect_error("a folder");
}

TEST_F(Nadcon, FilesGoneAtTheLoad) {
  for (const char* extension : {".los", ".las"}) {
    write_pair(folder, "g", {-100, 20, 30, 8, flat});
    write_pair(folder, "gone", {-60, 20, 30, 8, flat});
    const Opened opened = open(folder, "g\ngone\n");
    fs::remove(folder.path() / ("gone" + std::string(extension)));
    const Loaded loaded(opened.control, -55.5, 23.5);
    EXPECT_EQ(loaded.status, TW_GRID_FILE_ERROR);
    loaded.expect_window_untouched();

    Points points = {at(-95.5, 23.5), at(-55.5, 23.5), at(-95.75, 23.5), at(-92.5, 23.5)};
    const Points in = points;
    TWstatus status = 0;
    TWnadcon_f(2, points.data(), &opened.control, points.data(), &status);
    EXPECT_EQ(status, TW_GRID_FILE_ERROR);
    EXPECT_NE(points[0].x, in[0].x);
    EXPECT_EQ(points[1].x, in[1].x);

    // The word stands, and keeps the third point unwritten though the window holds it, until the
    // fourth loads another window.
    Points out = untouched(4);
    TWnadcon_f(4, in.data(), &opened.control, out.data(), &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_NE(out[0].x, kUntouched);
    expect_untouched(out[1]);
    expect_untouched(out[2]);
    EXPECT_LT(out[3].x, in[3].x);
    // An outside point hides it likewise.
    out = untouched(4);
    const Points last = {at(-10, 0), at(-55.5, 23.5)};
    TWnadcon_f(2, last.data(), &opened.control, out.data(), &status);
    EXPECT_EQ(status, TW_I_OUTSIDE_NADCON);
    expect_untouched(out[1]);
  }
}

TEST_F(Nadcon, InverseAfterAFailure) {
  write_pair(folder, "g", {-100, 20, 30, 8, flat});
  write_pair(folder, "gone", {-60, 20, 30, 8, flat});
  const Opened opened = open(folder, "g\ngone\n");
  fs::remove(folder.path() / "gone.los");
  const Points in = {at(-55.5, 23.5), at(-95.5, 23.5), at(-55.5, 23.5)};
  Points out = untouched(3);
  out[0].x = 7;
  TWstatus status = 0;
  TWnadcon_i(2, in.data(), &opened.control, out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);            // the next point wiped the word out
  EXPECT_DOUBLE_EQ(out[0].x, 7 - 2 * kPi);  // the caller's own longitude is wrapped
  EXPECT_EQ(out[0].y, kUntouched);
  EXPECT_EQ(out[0].z, kUntouched);
  EXPECT_GT(out[1].x, in[1].x);
  TWnadcon_i(3, in.data(), &opened.control, out.data(), &status);
  EXPECT_EQ(status, TW_GRID_FILE_ERROR);  // at the last point it reaches the caller
  const Points with_outside = {at(-10, 0), at(-55.5, 23.5)};
  TWnadcon_i(2, with_outside.data(), &opened.control, out.data(), &status);
  EXPECT_EQ(status, TW_I_OUTSIDE_NADCON);
}

TEST_F(Nadcon, FilesCutAtEachRecord) {
  const GridFile file = {-100, 20, 30, 8, place};  // records of 124 bytes
  for (const char* extension : {".los", ".las"}) {
    write_pair(folder, "g", file);
    const Opened opened = open(folder, "g\n");
    const fs::path path = folder.path() / ("g" + std::string(extension));
    const auto full = fs::file_size(path);
    ASSERT_EQ(full, 124U * 9);
    for (std::uintmax_t length = full; length-- > 0;) {
      if (length % 124 > 1 && length % 124 < 123) continue;
      fs::resize_file(path, length);
      // Rows 2 to 5, records 3 to 6: up to byte 7 * 124.
      const Loaded loaded(opened.control, -85.5, 23.5);
      const bool read = length >= 7 * 124U;
      EXPECT_EQ(loaded.status, read ? TW_SUCCESS : TW_GRID_FILE_ERROR) << length;
      EXPECT_EQ(loaded.window.xmin, -87);  // the bounds are new
      const bool lon_cut = !read && extension[2] == 'o';
      const bool lat_cut = !read && extension[2] == 'a';
      EXPECT_EQ(loaded.lon[0], lon_cut ? kUntouched : 213);
      EXPECT_EQ(loaded.lat[0], lat_cut ? kUntouched : -213);
    }
    fs::resize_file(path, full);
  }
}

TEST_F(Nadcon, LaterCallsUseWhatAShortReadLeft) {
  // The first window is good; the second cannot read .los, so its table of longitudes is the old.
  write_pair(folder, "g", {-100, 20, 30, 8, [](int r, int) { return r < 4 ? 1.0F : 2.0F; }});
  const Opened opened = open(folder, "g\n");
  CoordinateTriple p = at(-85.5, 21.5);
  TWstatus status = 0;
  TWnadcon_f(1, &p, &opened.control, &p, &status);  // rows 0 to 3
  EXPECT_EQ(status, TW_SUCCESS);
  fs::resize_file(folder.path() / "g.los", 5);
  const Points in = {at(-85.5, 25.5), at(-85.6, 25.5)};
  Points out = untouched(2);
  TWnadcon_f(2, in.data(), &opened.control, out.data(), &status);
  EXPECT_EQ(status, TW_GRID_FILE_ERROR);
  expect_untouched(out[0]);
  expect_untouched(out[1]);  // inside the new bounds, but nothing loaded again
  TWnadcon_f(1, &in[1], &opened.control, &out[1], &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out[1], in[1].x - degrees(0, 0, 1), in[1].y - degrees(0, 0, 2), 5, 1e-15);
}

TEST_F(Nadcon, OneCallAsOneForEachPoint) {
  // Enough points for the files to be read whole on the way; three grids, off which windows move,
  // and points outside.
  const auto node = [](int r, int c) { return static_cast<float>(r * r % 13 + c * c % 7) / 8; };
  const auto write = [&] {
    write_pair(folder, "fine", {-84.3F, 24.2F, 12, 10, node, 0.5F, 0.5F});
    write_pair(folder, "a", {-100, 20, 25, 17, node});
    write_pair(folder, "b", {-79, 21, 9, 12, node});
  };
  write();
  const Opened opened = open(folder, "fine\na\nb\n");
  ASSERT_EQ(opened.status, TW_SUCCESS);
  for (const auto call : {TWnadcon_f, TWnadcon_i}) {
    const auto run = [&](std::int32_t n, const CoordinateTriple* from, CoordinateTriple* to) {
      TWstatus status = 0;
      call(n, from, &opened.control, to, &status);
      return status;
    };
    const auto reset = [&] {
      write();
      const CoordinateTriple p = at(-98.5, 34.5);
      CoordinateTriple out;
      run(1, &p, &out);
    };
    expect_one_call_as_many(scattered(800, -101, -69, 19, 37), reset, run, [&] {
      for (const char* name : {"fine.las", "a.las", "b.los"}) fs::remove(folder.path() / name);
    });
  }
}

TEST_F(Nadcon, ShortFilesInMemory) {
  // The rows that a file lacks are told also where the rest has been read whole.
  const auto node = [](int r, int c) { return static_cast<float>(r * r % 13 + c * c % 7) / 8; };
  write_pair(folder, "g", {-100, 20, 30, 30, node});
  const Opened opened = open(folder, "g\n");
  fs::resize_file(folder.path() / "g.las", 31 * 4 * 21);  // rows 0 to 19
  const auto run = [&](std::int32_t n, const CoordinateTriple* from, CoordinateTriple* to) {
    TWstatus status = 0;
    TWnadcon_f(n, from, &opened.control, to, &status);
    return status;
  };
  Points in = scattered(300, -99, -72, 21, 48);
  in.push_back(at(-80.5, 45.5));
  Points all = untouched(in.size());
  EXPECT_EQ(run(static_cast<std::int32_t>(in.size()), in.data(), all.data()), TW_GRID_FILE_ERROR);
  int written = 0;
  for (std::size_t i = 0; i < in.size(); ++i) {
    // Far from any window that another point may have left.
    const CoordinateTriple aside = at(in[i].x < degrees(-85) ? -75.5 : -95.5, 22.5);
    CoordinateTriple out = kUntouchedPoint;
    run(1, &aside, &out);
    out = kUntouchedPoint;
    const TWstatus word = run(1, &in[i], &out);
    if (word != TW_SUCCESS) expect_untouched(all[i]);
    // A window's place is rounded: another one gives the same to the last bits.
    if (all[i].y != kUntouched) {
      ++written;
      EXPECT_NEAR(all[i].y, out.y, 1e-12);
    }
  }
  EXPECT_GT(written, 100);
  EXPECT_LT(written, 250);
}

TEST_F(Nadcon, GridsOfTooFewNodes) {
  for (const auto& [nc, nr] : {std::pair{3, 8}, {8, 3}, {1, 1}}) {
    write_pair(folder, "g", {-100, 20, 30, 8, flat});
    Opened opened = open(folder, "g\n");
    opened.control.grids[0].nc = nc;  // bounds as before: the point is inside
    opened.control.grids[0].nr = nr;
    const Loaded loaded(opened.control, -95.5, 23.5);
    EXPECT_EQ(loaded.status, TW_GRID_FILE_ERROR);
    loaded.expect_window_untouched();
  }
  // As a file tells it: three columns from -100 to -98.
  write_pair(folder, "g", {-100, 20, 3, 30, flat});
  const Loaded loaded(open(folder, "g\n").control, -99.5, 23.5);
  EXPECT_EQ(loaded.status, TW_GRID_FILE_ERROR);
  loaded.expect_window_untouched();
}

TEST_F(Nadcon, HeadersOfImpossibleSizes) {
  constexpr std::int32_t kMost = 2147483647;
  struct Case {
    std::int32_t nc, nr;
    float dx, dy;
    bool window_unchanged;
  };
  const float nan = std::numeric_limits<float>::quiet_NaN();
  const Case cases[] = {{-5, 8, -1, 1, true},
                        {8, -5, 1, -1, true},
                        {kMost, kMost, 1e-8F, 1e-8F, true},
                        {kMost, 8, 1e-8F, 1, false},  // a record longer than the file
                        {8, kMost, 1, 1e-8F, false},
                        {-2147483647 - 1, 8, -1e-8F, 1, true},
                        {8, 8, std::numeric_limits<float>::infinity(), 1, true}};
  for (const Case& c : cases) {
    std::string bytes(64, ' ');
    for (const std::int32_t n : {c.nc, c.nr, 1}) append_i32(bytes, n);
    for (const float f : {-100.0F, c.dx, 20.0F, c.dy, 0.0F}) append_f32(bytes, f);
    bytes.resize(4000);
    folder.write("g.los", bytes);
    folder.write("g.las", bytes);
    const Opened opened = open(folder, "g\n");
    EXPECT_EQ(opened.status, TW_SUCCESS);
    const Loaded loaded(opened.control, -95.5, 23.5);
    EXPECT_EQ(loaded.status, TW_GRID_FILE_ERROR);
    if (c.window_unchanged) loaded.expect_window_untouched();
    loaded.expect_tables_untouched();
  }
  for (const float spacing : {0.0F, -1.0F, nan}) {
    write_pair(folder, "g", {-100, 20, 30, 8, flat, spacing, 1});
    const Opened opened = open(folder, "g\n");
    if (opened.status != TW_SUCCESS) continue;  // not-a-numbers end it there
    EXPECT_EQ(Loaded(opened.control, -95.5, 23.5).status, TW_I_OUTSIDE_NADCON);
  }
}

TEST_F(Nadcon, CountThatNoBlockCanHold) {
  Opened opened;
  opened.control.grid_count = 2147483647;  // no grid of the block holds the point
  EXPECT_EQ(Loaded(opened.control, -95.5, 23.5).status, TW_I_OUTSIDE_NADCON);
  opened.control.grid_count = -3;
  EXPECT_EQ(Loaded(opened.control, -95.5, 23.5).status, TW_I_OUTSIDE_NADCON);
}

TEST_F(Nadcon, NoMemoryForTheRecords) {
  TIDEWATER_NEED_MEMORY_LIMIT();
  // Four records of a quarter of a gigabyte, in files without content.
  constexpr std::int32_t kColumns = 1 << 26;
  std::string bytes(64, ' ');
  for (const std::int32_t n : {kColumns, 6, 1}) append_i32(bytes, n);
  for (const float f : {-100.0F, 1e-6F, 20.0F, 1.0F, 0.0F}) append_f32(bytes, f);
  for (const char* name : {"g.los", "g.las"}) {
    folder.write(name, bytes);
    fs::resize_file(folder.path() / name, 4 * (std::uintmax_t{kColumns} + 1) * 7);
  }
  const Opened opened = open(folder, "g\n");
  EXPECT_EQ(opened.status, TW_SUCCESS);
  const auto fails = [&] {
    const Loaded loaded(opened.control, -95.5, 22.5);
    CoordinateTriple out = kUntouchedPoint;
    const CoordinateTriple in = at(-95.5, 22.5);
    TWstatus status = 0;
    TWnadcon_f(1, &in, &opened.control, &out, &status);
    return loaded.status == TW_NO_MEMORY && loaded.window.nc == 4 && loaded.window.ymin == 21 &&
           loaded.lon[0] == kUntouched && loaded.lat[0] == kUntouched && status == TW_NO_MEMORY &&
           out.x == kUntouched;
  };
  expect_with_little_memory(fails);
}

TEST_F(Nadcon, DamagedHeadersDoNoHarm) {
  // Both files change alike, or the comparison of the headers would end it at once.
  std::mt19937 random(4);
  const std::string better = GridFile{-97, 22, 25, 6, flat}.bytes();
  const std::string wide = GridFile{-100, 20, 30, 12, flat}.bytes();
  int loaded_windows = 0;
  for (int round = 0; round < 400; ++round) {
    std::string damaged[] = {better, wide};
    for (std::string& bytes : damaged) {
      for (auto changes = random() % 4; changes > 0; --changes) {
        bytes.at(64 + random() % 32) = static_cast<char>(random());
      }
      if (random() % 8 == 0) bytes.resize(random() % bytes.size());
    }
    for (const char* extension : {".los", ".las"}) {
      folder.write("better" + std::string(extension), damaged[0]);
      folder.write("wide" + std::string(extension), damaged[1]);
    }
    const Opened opened = open(folder, "better\nwide\n");
    if (opened.status != TW_SUCCESS) continue;
    Points points = {at(-97.5, 23.5), at(-95.1, 24), at(-99.9, 20.1), at(-80, 25), at(-1e-6, 0)};
    TWstatus status = 0;
    TWnadcon_f(5, points.data(), &opened.control, points.data(), &status);
    TWnadcon_i(5, points.data(), &opened.control, points.data(), &status);
    for (const double x : {-99.0, -97.5, -95.5, -90.25}) {
      loaded_windows += Loaded(opened.control, x, 23.5).status == TW_SUCCESS;
    }
  }
  EXPECT_GT(loaded_windows, 30);
}

}  // namespace
