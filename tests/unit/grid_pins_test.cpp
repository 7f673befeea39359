// What single changed tokens of the grid shifts showed to be held by no other test.

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <string>

#include "support/data.hpp"
#include "support/grids.hpp"
#include "support/points.hpp"
#include "tidewater/datum.h"

using namespace tidewater::test;

namespace {

CoordinateTriple at(double lon, double lat) { return {degrees(lon), degrees(lat), 5}; }

// A grid of its own, and a window far from it to begin with.
class NadconPins : public ::testing::Test {
 protected:
  void open(const GridFile& los, const GridFile& las) {
    const auto opened = [](const ScratchFolder& in, const GridFile& lon, const GridFile& lat) {
      in.write("g.los", lon.bytes());
      in.write("g.las", lat.bytes());
      in.write("area.par", "g\n");
      NadconControl block = {};
      TWstatus status = 0;
      TWnadcon_c(in.directory().c_str(), &block, &status);
      EXPECT_EQ(status, TW_SUCCESS);
      return block;
    };
    const auto none = [](int, int) { return 0.0F; };
    const ScratchFolder far_away;
    const NadconControl far = opened(far_away, {-300, -80, 25, 4, none}, {-300, -80, 25, 4, none});
    CoordinateTriple p = at(-290.5, -78.5);
    TWstatus status = 0;
    TWnadcon_f(1, &p, &far, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    control = opened(folder, los, las);
  }

  ScratchFolder folder;
  NadconControl control = {};
};

TEST_F(NadconPins, FourPassesOfASlowInverse) {
  // Around node 15 the shifts grow by 90 seconds a node of an eighth of a degree, a fifth of the
  // way: four passes leave 3e-4 of the error, far above the tolerance.
  const auto value = [](int place) {
    return std::clamp(90.0F * static_cast<float>(place - 15), -180.0F, 180.0F);
  };
  open({-100, 20, 31, 31, [value](int, int c) { return value(c); }, 0.125F, 0.125F},
       {-100, 20, 31, 31, [value](int r, int) { return value(r); }, 0.125F, 0.125F});
  const double node = 15 * 0.125;
  const double east = 0.1, north = 0.15;
  CoordinateTriple p = at(-100 + node + east, 20 + node + north);
  TWstatus status = 0;
  TWnadcon_i(1, &p, &control, &p, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  double lon = east, lat = north;
  for (int pass = 0; pass < 4; ++pass) {
    lon = east + 0.2 * lon;   // positive west
    lat = north - 0.2 * lat;  // positive north
  }
  expect_near(p, degrees(-100 + node + lon), degrees(20 + node + lat), 1e-14);
  EXPECT_GT(std::fabs(lon - (east + 0.2 * lon)), 1e-6);  // one pass more would show
}

TEST_F(NadconPins, OneEightyIsNoMarkerInAnyCorner) {
  for (int corner = 0; corner < 4; ++corner) {
    const auto value = [corner](int r, int c) {
      return r == 1 + corner / 2 && c == 1 + corner % 2 ? 180.0F : 0.0F;
    };
    const auto xmin = static_cast<float>(-170 + 20 * corner);
    open({xmin, 20, 30, 4, value}, {xmin, 20, 30, 4, value});
    const CoordinateTriple in = at(static_cast<double>(xmin) + 1.5, 21.5);
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWnadcon_f(1, &in, &control, &out, &status);
    expect_near(out, in.x - degrees(0, 0, 45), in.y + degrees(0, 0, 45), 5, 1e-15);
  }
}

TEST_F(NadconPins, ALongitudeShiftedPastHalfATurnComesRound) {
  // Only markers that repair each other shift so far: south-west takes M / 3, then north-west takes
  // M / 9, and in the middle of the cell a quarter of both is M / 9.
  const double far = 188.0 * 3600;  // seconds that a point is to move east
  const auto marker = static_cast<float>(-9 * far);
  const auto value = [marker](int r, int c) {
    if (r == 3 && c == 3) return 1000.0F;
    return r == 4 && c == 3 ? marker : 0.0F;
  };
  open({-11, 20, 10, 8, value}, {-11, 20, 10, 8, [](int, int) { return 0.0F; }});
  const CoordinateTriple in = at(-7.5, 23.5);
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWnadcon_f(1, &in, &control, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out, degrees(-179.5), in.y, 1e-12);
}

TEST_F(NadconPins, AGridThatCannotBeOpenedLeavesNoFileOpen) {
  // Two grids of other shifts; the second lacks one of its files by the time of the call.  What
  // comes after it, in a new window of the first, is read from the first.
  for (const char* gone : {"h.los", "h.las"}) {
    const auto constant = [](float seconds) { return [seconds](int, int) { return seconds; }; };
    open({-100, 20, 30, 8, constant(10)}, {-100, 20, 30, 8, constant(20)});
    folder.write("h.los", GridFile{-60, 20, 30, 8, constant(70)}.bytes());
    folder.write("h.las", GridFile{-60, 20, 30, 8, constant(80)}.bytes());
    folder.write("area.par", "g\nh\n");
    TWstatus status = 0;
    TWnadcon_c(folder.directory().c_str(), &control, &status);
    ASSERT_EQ(status, TW_SUCCESS);
    std::filesystem::remove(folder.path() / gone);
    const Points in = {at(-95.5, 23.5), at(-55.5, 23.5), at(-85.5, 23.5)};
    Points out = untouched(3);
    TWnadcon_f(3, in.data(), &control, out.data(), &status);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_untouched(out[1]);
    for (const std::size_t k : {std::size_t{0}, std::size_t{2}}) {
      expect_near(out[k], in[k].x - degrees(0, 0, 10), in[k].y + degrees(0, 0, 20), 5, 1e-14);
    }
  }
}

TEST_F(NadconPins, ADirectoryThatTheBlockCannotHoldIsNone) {
  const auto none = [](int, int) { return 0.0F; };
  open({-100, 20, 30, 8, none}, {-100, 20, 30, 8, none});
  std::string directory = folder.directory();
  directory.insert(0, 260 - directory.size(), '/');  // one more than with its end fits
  NadconControl block = {};
  block.grid_count = -7;
  TWstatus status = 0;
  TWnadcon_c(directory.c_str(), &block, &status);
  EXPECT_EQ(status, TW_GRID_NOT_FOUND);
  EXPECT_EQ(block.grid_count, -7);
  EXPECT_STREQ(block.directory, "");
}

TEST_F(NadconPins, AGridBehindTheCountDoesNotServe) {
  const auto ten = [](int, int) { return 10.0F; };
  open({-100, 20, 30, 8, ten}, {-100, 20, 30, 8, ten});
  control.grids[1] = control.grids[0];
  control.grids[1].xmin += 100;
  control.grids[1].xmax += 100;
  const CoordinateTriple in = at(-10.5, 23.5);
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWnadcon_f(1, &in, &control, &out, &status);
  EXPECT_EQ(status, TW_I_OUTSIDE_NADCON);
  expect_near(out, in.x, in.y, 5, 0);
}

TEST(MolodenskyPins, NearAPoleOnePointIsWritten) {
  // Beyond 89 degrees a point goes through geocentric coordinates, and no neighbour with it.
  const CoordinateTriple in[2] = {{0.3, degrees(89.5), 100}, {0.4, 0.5, 6}};
  CoordinateTriple out[2] = {kUntouchedPoint, kUntouchedPoint};
  TWstatus status = 0;
  TWmol_std_i(6378137, 0.0818, 100, 1e-5, 10, 20, 30, 1, in, out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NE(out[0].x, kUntouched);
  expect_untouched(out[1]);
}

}  // namespace
