#include <gtest/gtest.h>

#include <array>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <random>

#include "support/data.hpp"
#include "support/failing_new.hpp"
#include "support/grids.hpp"
#include "support/little_memory.hpp"
#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/datum.h"

using namespace tidewater::test;
namespace fs = std::filesystem;

namespace {

constexpr double kDegree = 3600;  // in the file's arc-seconds
constexpr double kSecond = kPi / 180 / 3600;

// A point in degrees, the longitude positive WEST as in the files.
CoordinateTriple west(double lon, double lat, double height = 5) {
  return {-degrees(lon), degrees(lat), height};
}

// Planes, which bilinear interpolation gives back exactly.
float lat_plane(int r, int c) {
  return 0.125F + static_cast<float>(r) / 64 + static_cast<float>(c) / 32;
}
float lon_plane(int r, int c) {
  return -(0.25F + static_cast<float>(r) / 32 + static_cast<float>(c) / 64);
}

// Ten rows of a degree from 40 north, fifteen columns from 100 west.
SubGrid root(const char* name = "ROOT") {
  return {name,          "NONE",        40 * kDegree, 50 * kDegree, 100 * kDegree,
          115 * kDegree, 1.0 * kDegree, lat_plane,    lon_plane};
}

// Half a degree of spacing, the same value at each node.
SubGrid child(const char* name, const char* parent, double south, double north, double east,
              double to_west, float value) {
  const auto constant = [value](int, int) { return value; };
  return {
      name,          parent,   south * kDegree, north * kDegree, east * kDegree, to_west * kDegree,
      0.5 * kDegree, constant, constant};
}

struct Shift {
  double lon = kUntouched, lat = kUntouched;  // arc-seconds
  TWstatus status = 0;
};

Shift shift_at(const CoordinateTriple& p) {
  Shift s;
  TWget_cnt_shift(p, 12345, &s.lon, &s.lat, &s.status);
  if (s.lon != kUntouched) s.lon /= kSecond;
  if (s.lat != kUntouched) s.lat /= kSecond;
  return s;
}

class NationalGrid : public ::testing::Test {
 protected:
  TWstatus open(const std::string& bytes) {
    folder.write("grid.gsb", bytes);
    folder.write("area.par", "grid\n");
    TWstatus status = 0;
    TWcnt_c(folder.directory().c_str(), 0, &status);
    return status;
  }
  TWstatus open(const std::vector<SubGrid>& grids, bool end_record = true) {
    GsbFile file{grids};
    file.end_record = end_record;
    return open(file.bytes());
  }
  // Writes over the open file: what a later load reads.
  void overwrite(const std::string& bytes) const {
    std::fstream file(folder.path() / "grid.gsb", std::ios::in | std::ios::out | std::ios::binary);
    file << bytes;
  }

  ScratchFolder folder;
};

// Shift of a plane at a point given in degrees, positive west.
void expect_plane(double lon, double lat) {
  SCOPED_TRACE(testing::Message() << lon << " W " << lat << " N");
  const Shift s = shift_at(west(lon, lat));
  EXPECT_EQ(s.status, TW_SUCCESS);
  const double r = lat - 40, c = lon - 100;
  EXPECT_NEAR(s.lat, 0.125 + r / 64 + c / 32, 1e-11);
  EXPECT_NEAR(s.lon, 0.25 + r / 32 + c / 64, 1e-11);  // the longitude is negative: sign turned
}

// Ends the process, with 0 where points are outside as long as no grid was opened in it.
[[noreturn]] void leave_with_nothing_open() {
  const CoordinateTriple in = west(107.5, 45.25);
  CoordinateTriple out = kUntouchedPoint;
  CoordinateTriple back = kUntouchedPoint;
  TWstatus status = 0;
  TWstatus status_back = 0;
  TWload_cnt_local_grid(0, 23);
  TWcnt_f(1, &in, 0, &out, &status);
  TWcnt_i(1, &in, 0, &back, &status_back);
  const bool good = status == TW_I_OUTSIDE_CNT && status_back == TW_I_OUTSIDE_CNT &&
                    out.x == in.x && out.y == in.y && out.z == 5 && back.x == in.x;
  std::_Exit(good ? 0 : 1);
}

TEST_F(NationalGrid, NothingOpenAtProcessStart) {
  TIDEWATER_NEED_NEW_PROCESS();
  // A process of its own, whatever ran here before.
  GTEST_FLAG_SET(death_test_style, "threadsafe");
  EXPECT_EXIT(leave_with_nothing_open(), testing::ExitedWithCode(0), "");
}

TEST_F(NationalGrid, CanadasGridAgainstItsNodes) {
  TIDEWATER_NEED_SHARED_DATA();
  TWstatus status = 0;
  TWcnt_c((shared_data() / "ntv2/").string().c_str(), 0, &status);
  ASSERT_EQ(status, TW_SUCCESS);
  const std::string bytes = file_bytes(shared_data() / "ntv2/canada.gsb");

  struct Header {
    std::string name, parent;
    std::array<double, 6> v;  // south, north, east, west, increments
    std::size_t nodes;        // byte offset
  };
  std::vector<Header> headers;
  std::size_t offset = 176;
  for (std::int32_t i = 0; i < i32_at(bytes, 40); ++i) {
    Header h = {bytes.substr(offset + 8, 8), bytes.substr(offset + 24, 8), {}, offset + 176};
    for (std::size_t k = 0; k < 6; ++k) h.v[k] = f64_at(bytes, offset + 72 + 16 * k);
    headers.push_back(h);
    offset += 176 + 16 * static_cast<std::size_t>(i32_at(bytes, offset + 168));
  }
  ASSERT_GT(headers.size(), 1U);
  const auto holds = [](const Header& h, double x, double y) {
    return y >= h.v[0] && y < h.v[1] && x >= h.v[2] && x < h.v[3];
  };
  const auto value = [&](const Header& h, double x, double y, std::size_t field) {
    const double u = (x - h.v[2]) / h.v[5], v = (y - h.v[0]) / h.v[4];
    const auto c = static_cast<std::size_t>(u), r = static_cast<std::size_t>(v);
    const auto cols = static_cast<std::size_t>((h.v[3] - h.v[2]) / h.v[5] + 0.5) + 1;
    const auto node = [&](std::size_t row, std::size_t col) {
      return static_cast<double>(f32_at(bytes, h.nodes + 16 * (row * cols + col) + 4 * field));
    };
    const double p = u - static_cast<double>(c), q = v - static_cast<double>(r);
    return (1 - p) * (1 - q) * node(r, c) + p * (1 - q) * node(r, c + 1) +
           (1 - p) * q * node(r + 1, c) + p * q * node(r + 1, c + 1);
  };
  std::mt19937 random(64);
  int in_children = 0;
  for (const Header& chosen : headers) {
    std::uniform_real_distribution<double> lat(chosen.v[0], chosen.v[1]),
        lon(chosen.v[2], chosen.v[3]);
    for (int i = 0; i < 200; ++i) {
      const double x = lon(random), y = lat(random);
      // The deepest sub-grid that holds the point, found from the leaves up.
      const Header* deepest = nullptr;
      for (const Header& h : headers) {
        if (!holds(h, x, y)) continue;
        if (!deepest || h.parent == deepest->name) deepest = &h;
      }
      // The file lists children before or after their parents: look once more.
      for (const Header& h : headers) {
        if (holds(h, x, y) && h.parent == deepest->name) deepest = &h;
      }
      in_children += deepest->parent != "NONE    ";
      const Shift s = shift_at({-x * kSecond, y * kSecond, 0});
      EXPECT_EQ(s.status, TW_SUCCESS);
      EXPECT_NEAR(s.lat, value(*deepest, x, y, 0), 1e-9);
      EXPECT_NEAR(s.lon, -value(*deepest, x, y, 1), 1e-9);
    }
  }
  EXPECT_GT(in_children, 100);
}

TEST_F(NationalGrid, FrenchGridAgainstProj) {
#ifdef TIDEWATER_HAVE_PROJ
  const fs::path french = proj_data() / "ntf_r93.gsb";
  if (!fs::exists(french)) GTEST_SKIP() << "ntf_r93.gsb is not installed";
  fs::create_symlink(french, folder.path() / "ntf_r93.gsb");
  folder.write("area.par", "ntf_r93\n");
  TWstatus status = 0;
  TWcnt_c(folder.directory().c_str(), 0, &status);
  ASSERT_EQ(status, TW_SUCCESS);
  const ProjPeer peer("+proj=hgridshift +grids=ntf_r93.gsb");
  ASSERT_TRUE(peer.ok());
  // West of Greenwich: to the east the longitudes of our points lose their sign.
  std::mt19937 random(93);
  std::uniform_real_distribution<double> lon(-4.9, -0.1), lat(42.5, 50.5);
  for (int i = 0; i < 1000; ++i) {
    const CoordinateTriple in = {degrees(lon(random)), degrees(lat(random)), 3};
    CoordinateTriple out = kUntouchedPoint;
    TWcnt_f(1, &in, 0, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    const CoordinateTriple expected = peer.forward(in);
    // The peer turns shifts of 3e-5 into radians in single precision.
    expect_near(out, expected.x, expected.y, 3, 2e-12);
    TWcnt_i(1, &out, 0, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    // Four passes: the shift's slope, about 1e-5, to the fourth power is nothing.
    expect_near(out, in.x, in.y, 3, 2e-15);
  }
#else
  TIDEWATER_NEED_PROJ();
#endif
}

TEST_F(NationalGrid, ShiftOfAPlane) {
  ASSERT_EQ(open({root()}), TW_SUCCESS);
  for (double lon = 100; lon < 115; lon += 0.375) {
    for (double lat = 40; lat < 50; lat += 0.625) expect_plane(lon, lat);
  }
}

TEST_F(NationalGrid, ForwardAndInverse) {
  ASSERT_EQ(open({root()}), TW_SUCCESS);
  const Points in = {west(107.25, 45.5, 1), west(99, 45, 2), west(100.5, 40.5, 3)};
  Points out = untouched(3);
  TWstatus status = 0;
  TWcnt_f(3, in.data(), 0, out.data(), &status);
  EXPECT_EQ(status, TW_I_OUTSIDE_CNT);
  expect_near(out[0], in[0].x + (0.25 + 5.5 / 32 + 7.25 / 64) * kSecond,
              in[0].y + (0.125 + 5.5 / 64 + 7.25 / 32) * kSecond, 1, 1e-15);
  expect_near(out[1], in[1].x, in[1].y, 2, 0);
  expect_near(out[2], in[2].x + (0.25 + 0.5 / 32 + 0.5 / 64) * kSecond,
              in[2].y + (0.125 + 0.5 / 64 + 0.5 / 32) * kSecond, 3, 1e-15);
  Points back = untouched(3);
  TWcnt_i(3, out.data(), 0, back.data(), &status);
  EXPECT_EQ(status, TW_I_OUTSIDE_CNT);
  for (std::size_t i = 0; i < 3; ++i) expect_near(back[i], in[i].x, in[i].y, in[i].z, 1e-15);
  TWcnt_f(3, out.data(), 0, out.data(), &status);  // in place
  EXPECT_EQ(out[1].x, in[1].x);
  const CoordinateTriple inside = west(107.25, 45.5);
  CoordinateTriple p = kUntouchedPoint;
  TWcnt_f(1, &inside, 0, &p, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  TWcnt_i(1, &inside, 0, &p, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  for (const int32_t count : {0, -1}) {
    p = kUntouchedPoint;
    TWcnt_f(count, &inside, 0, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    TWcnt_i(count, &inside, 0, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_untouched(p);
  }
}

TEST_F(NationalGrid, InverseThatLeavesTheGridIsOutside) {
  // Shifts of a hundred seconds east and north: from within a hundred seconds of the west or the
  // south edge the estimate leaves the grid, and stays where it left.
  SubGrid g = root();
  g.lat = [](int, int) { return 100.0F; };
  g.lon = [](int, int) { return -100.0F; };
  ASSERT_EQ(open({g}), TW_SUCCESS);
  const Points in = {west(107, 40 + 99 / kDegree), west(115 - 99 / kDegree, 45),
                     west(107, 40 + 101 / kDegree), west(115 - 101 / kDegree, 45)};
  Points out = untouched(4);
  TWstatus status = 0;
  TWcnt_i(4, in.data(), 0, out.data(), &status);
  EXPECT_EQ(status, TW_I_OUTSIDE_CNT);
  for (std::size_t i = 0; i < 2; ++i) expect_near(out[i], in[i].x, in[i].y, 5, 0);
  for (std::size_t i = 2; i < 4; ++i) {
    expect_near(out[i], in[i].x - 100 * kSecond, in[i].y - 100 * kSecond, 5, 1e-15);
  }
}

TEST_F(NationalGrid, SignOfTheLongitudeIsDropped) {
  ASSERT_EQ(open({root()}), TW_SUCCESS);
  const Shift in_the_west = shift_at(west(107.25, 45.5));
  const Shift in_the_east = shift_at(west(-107.25, 45.5));
  EXPECT_NEAR(in_the_east.lat, in_the_west.lat, 1e-11);
  EXPECT_NEAR(in_the_east.lon, -in_the_west.lon, 1e-11);
  // and no whole turn matters
  EXPECT_NEAR(shift_at(west(107.25 + 720, 45.5)).lon, in_the_west.lon, 1e-8);
  EXPECT_NEAR(shift_at(west(107.25 - 360, 45.5)).lon, in_the_west.lon, 1e-8);
}

TEST_F(NationalGrid, LongitudesOfNoneAndHalfATurn) {
  SubGrid g = root();
  g.e_long = 0;
  g.w_long = 180 * kDegree;
  g.lon = [](int, int) { return 2.0F; };
  ASSERT_EQ(open({g}), TW_SUCCESS);
  EXPECT_NEAR(shift_at({0, degrees(45), 0}).lon, 2, 1e-12);  // sign +1
  EXPECT_NEAR(shift_at({-1e-9, degrees(45), 0}).lon, -2, 1e-12);
  EXPECT_NEAR(shift_at({kPi, degrees(45), 0}).lon, -2, 1e-12);  // comes back as -pi
  EXPECT_NEAR(shift_at({-kPi, degrees(45), 0}).lon, -2, 1e-12);
  EXPECT_NEAR(shift_at({kPi - 1e-9, degrees(45), 0}).lon, 2, 1e-12);
  EXPECT_NEAR(shift_at({2 * kPi, degrees(45), 0}).lon, 2, 1e-12);
}

TEST_F(NationalGrid, ValuesWithoutEnd) {
  ASSERT_EQ(open({root()}), TW_SUCCESS);
  Points points = {{kInfinity, 0.7, 1}, {-kInfinity, 0.7, 1}, {1e300, 0.7, 1},
                   {-1e300, 0.7, 1},    {-1.8, kInfinity, 1}, {-1.8, -1e300, 1}};
  const Points in = points;
  TWstatus status = 0;
  TWcnt_f(6, points.data(), 0, points.data(), &status);
  EXPECT_EQ(status, TW_I_OUTSIDE_CNT);
  for (std::size_t i = 0; i < in.size(); ++i) EXPECT_EQ(points[i].x, in[i].x);
  // A not-a-number passes the comparisons of the bounds.
  const Shift s = shift_at({-1.8, kNaN, 0});
  EXPECT_EQ(s.status, TW_SUCCESS);
  EXPECT_TRUE(std::isnan(s.lat));
  EXPECT_TRUE(std::isnan(shift_at({kNaN, 0.8, 0}).lon));
}

TEST_F(NationalGrid, BoundsHoldToATolerance) {
  ASSERT_EQ(open({root()}), TW_SUCCESS);
  const auto status_at = [](double x, double y) {
    return shift_at({-x * kSecond, y * kSecond, 0}).status;
  };
  const double mid_lat = 45.5 * kDegree, mid_lon = 107.5 * kDegree;
  // 2e-7 seconds is the tolerance; rounding of radians is 1e-10 seconds.
  for (const double sign : {-1.0, 1.0}) {
    const double lat_edge = (sign < 0 ? 40 : 50) * kDegree;
    const double lon_edge = (sign < 0 ? 100 : 115) * kDegree;
    EXPECT_EQ(status_at(mid_lon, lat_edge + sign * 1.9e-7), TW_SUCCESS);
    EXPECT_EQ(status_at(mid_lon, lat_edge + sign * 2.1e-7), TW_I_OUTSIDE_CNT);
    EXPECT_EQ(status_at(lon_edge + sign * 1.9e-7, mid_lat), TW_SUCCESS);
    EXPECT_EQ(status_at(lon_edge + sign * 2.1e-7, mid_lat), TW_I_OUTSIDE_CNT);
  }
  const Shift outside = shift_at(west(99, 45));
  EXPECT_EQ(outside.lon, kUntouched);
  EXPECT_EQ(outside.lat, kUntouched);
}

TEST_F(NationalGrid, NorthAndWestEdgesUseTheirOwnNodes) {
  // Beyond the north row and west column stand values that would show.
  SubGrid g = root();
  ASSERT_EQ(open({g, child("OTHER", "NONE", 10, 12, 10, 12, 1e6F)}), TW_SUCCESS);
  expect_plane(107.25, 50);  // north edge
  expect_plane(115, 45.75);  // west edge
  expect_plane(115, 50);     // corner
  expect_plane(100, 40);     // the other corners
  expect_plane(115, 40);
  expect_plane(100, 50);
  expect_plane(100, 45.75);
  expect_plane(107.25, 40);
}

TEST_F(NationalGrid, AHairBeforeTheEdge) {
  // Still in the last cell but within the tolerance of its north edge, a point takes the row to its
  // south, not the one it all but lies on: wanted.
  ASSERT_EQ(open({root()}), TW_SUCCESS);
  const double hair = 1e-7;
  Shift s = shift_at({-107.25 * kDegree * kSecond, (50 * kDegree - hair) * kSecond, 0});
  EXPECT_NEAR(s.lat, 0.125 + 9.0 / 64 + 7.25 / 32, 1e-9);
  s = shift_at({-(115 * kDegree - hair) * kSecond, 45.5 * kDegree * kSecond, 0});
  EXPECT_NEAR(s.lat, 0.125 + 5.5 / 64 + 14.0 / 32, 1e-9);
  // At the corner the fourth node, which is there, has all the weight.
  s = shift_at({-(115 * kDegree - hair) * kSecond, (50 * kDegree - hair) * kSecond, 0});
  EXPECT_NEAR(s.lat, 0.125 + 10.0 / 64 + 15.0 / 32, 1e-9);
  // With the point on one edge and a hair before the other, it is beyond the sub-grid.
  s = shift_at({-115 * kDegree * kSecond, (50 * kDegree - hair) * kSecond, 0});
  EXPECT_NEAR(s.lat, 0.125 + 9.0 / 64 + 15.0 / 32, 1e-9);
  s = shift_at({-(115 * kDegree - hair) * kSecond, 50 * kDegree * kSecond, 0});
  EXPECT_NEAR(s.lat, 0.125 + 10.0 / 64 + 14.0 / 32, 1e-9);
}

TEST_F(NationalGrid, DeepestSubGridServes) {
  // Children before and after their parents.
  ASSERT_EQ(
      open({child("DEEP", "CHILD", 44, 45, 105, 106, 3), root(),
            child("CHILD", "ROOT", 43, 47, 104, 108, 2), child("FAR", "NONE", 0, 5, 10, 15, 9)}),
      TW_SUCCESS);
  EXPECT_NEAR(shift_at(west(105.25, 44.25)).lat, 3, 1e-9);
  EXPECT_NEAR(shift_at(west(107.25, 44.25)).lat, 2, 1e-9);
  expect_plane(110.5, 44.25);
  EXPECT_NEAR(shift_at(west(12, 3)).lat, 9, 1e-9);
}

TEST_F(NationalGrid, SharedEdgesGoToTheChild) {
  ASSERT_EQ(open({root(), child("CHILD", "ROOT", 43, 47, 104, 108, 2)}), TW_SUCCESS);
  for (const auto& [lon, lat] : {std::pair{104.0, 45.25},
                                 {108.0, 45.25},
                                 {105.25, 43.0},
                                 {105.25, 47.0},
                                 {108.0, 47.0},
                                 {104.0, 43.0}}) {
    EXPECT_NEAR(shift_at(west(lon, lat)).lat, 2, 1e-9) << lon << " " << lat;
  }
}

TEST_F(NationalGrid, ChildOutsideItsParentIsNotFound) {
  ASSERT_EQ(open({root(), child("CHILD", "ROOT", 43, 47, 113, 117, 2)}), TW_SUCCESS);
  EXPECT_NEAR(shift_at(west(114.25, 45.25)).lat, 2, 1e-9);
  EXPECT_EQ(shift_at(west(116.25, 45.25)).status, TW_I_OUTSIDE_CNT);
}

TEST_F(NationalGrid, LowestCodeThenFileOrder) {
  // Meeting edges: 45 north and 106 west. What lies north or west of them has the point on its
  // south or east edge, which is inside (code 0).
  ASSERT_EQ(
      open({root(), child("SE", "ROOT", 43, 45, 104, 106, 2),
            child("NE", "ROOT", 45, 47, 104, 106, 3), child("SW", "ROOT", 43, 45, 106, 108, 4),
            child("NW", "ROOT", 45, 47, 106, 108, 5)}),
      TW_SUCCESS);
  EXPECT_NEAR(shift_at(west(105.25, 45)).lat, 3, 1e-9);  // code 1 against 0
  EXPECT_NEAR(shift_at(west(106, 44.25)).lat, 4, 1e-9);  // code 2 against 0
  EXPECT_NEAR(shift_at(west(106, 45)).lat, 5, 1e-9);     // 3, 2, 1, 0
  ASSERT_EQ(open({root(), child("A", "ROOT", 43, 47, 104, 108, 6),
                  child("B", "ROOT", 42, 48, 103, 109, 7)}),
            TW_SUCCESS);
  EXPECT_NEAR(shift_at(west(105.25, 45.25)).lat, 6, 1e-9);  // equal codes: the first
  EXPECT_NEAR(shift_at(west(105.25, 47)).lat, 7, 1e-9);     // code 1 of the first, 0 of the second
  // 1 of one against 2 of the other
  ASSERT_EQ(open({root(), child("W2", "ROOT", 43, 47, 104, 106, 8),
                  child("N1", "ROOT", 43, 45, 104, 108, 9)}),
            TW_SUCCESS);
  EXPECT_NEAR(shift_at(west(106, 45)).lat, 9, 1e-9);
}

TEST_F(NationalGrid, NamesInACircle) {
  // A sub-grid that is its own parent's parent would be gone down into without end.
  SubGrid a = child("NONE", "NONE", 43, 47, 104, 108, 2), b = a;
  b.lat = b.lon = [](int, int) { return 3.0F; };
  ASSERT_EQ(open({a, b}), TW_SUCCESS);
  EXPECT_EQ(shift_at(west(105.25, 45.25)).status, TW_SUCCESS);
  ASSERT_EQ(
      open({root("A"), child("B", "A", 43, 47, 104, 108, 2), child("A", "B", 43, 47, 104, 108, 3)}),
      TW_SUCCESS);
  EXPECT_EQ(shift_at(west(105.25, 45.25)).status, TW_SUCCESS);
}

TEST_F(NationalGrid, NamesOfTheDatums) {
  GsbFile file{{root()}};
  file.from = "NAD27";
  file.to = "NAD83 (C";
  ASSERT_EQ(open(file.bytes()), TW_SUCCESS);
  char from[10] = "#########", to[10] = "#########";
  TWstatus status = 0;
  TWcnt_to_from(0, from, to, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_STREQ(from, "NAD27   ");
  EXPECT_STREQ(to, "NAD83 (C");
  EXPECT_EQ(from[9], '\0');
}

TEST_F(NationalGrid, NameInTheList) {
  const auto name_in = [&](const std::string& list) {
    folder.write("area.par", list);
    char name[300] = "untouched";
    TWstatus status = 0;
    TWget_cnt_fnam(folder.directory().c_str(), name, &status);
    return std::pair{std::string(name), status};
  };
  using Result = std::pair<std::string, TWstatus>;
  EXPECT_EQ(name_in("canada\n"), Result("canada", TW_SUCCESS));
  EXPECT_EQ(name_in("canada"), Result("canada", TW_SUCCESS));  // without a newline
  EXPECT_EQ(name_in("  canada\tof 1995\nsecond\n"), Result("canada", TW_SUCCESS));
  EXPECT_EQ(name_in(std::string(400, 'x')), Result(std::string(259, 'x'), TW_SUCCESS));
  EXPECT_EQ(name_in(""), Result("untouched", TW_GRID_NOT_FOUND));
  EXPECT_EQ(name_in("\ncanada\n"), Result("untouched", TW_GRID_NOT_FOUND));
  EXPECT_EQ(name_in(" \t \ncanada\n"), Result("untouched", TW_GRID_NOT_FOUND));
  char name[300] = "untouched";
  TWstatus status = 0;
  for (const std::string& directory : {folder.path().string(), std::string(5000, 'x')}) {
    TWget_cnt_fnam(directory.c_str(), name, &status);
    EXPECT_EQ(status, TW_GRID_NOT_FOUND);
    EXPECT_STREQ(name, "untouched");
  }
}

TEST_F(NationalGrid, MissingListKeepsTheOpenGrid) {
  ASSERT_EQ(open({root()}), TW_SUCCESS);
  const ScratchFolder empty;
  TWstatus status = 0;
  TWcnt_c(empty.directory().c_str(), 0, &status);
  EXPECT_EQ(status, TW_GRID_NOT_FOUND);
  empty.write("area.par", "\n");
  TWcnt_c(empty.directory().c_str(), 0, &status);
  EXPECT_EQ(status, TW_GRID_NOT_FOUND);
  TWcnt_c(std::string(300, '/').c_str(), 0, &status);
  EXPECT_EQ(status, TW_GRID_NOT_FOUND);
  expect_plane(107.25, 45.5);
}

TEST_F(NationalGrid, MissingFileDropsTheOpenGrid) {
  ASSERT_EQ(open({root()}), TW_SUCCESS);
  folder.write("area.par", "missing\ngrid\n");  // only the first line counts
  TWstatus status = 0;
  TWcnt_c(folder.directory().c_str(), 0, &status);
  EXPECT_EQ(status, TW_GSB_READ_ERROR);
  EXPECT_EQ(shift_at(west(107.25, 45.5)).status, TW_I_OUTSIDE_CNT);
}

TEST_F(NationalGrid, AnotherGridTakesThePlace) {
  TIDEWATER_NOT_ON_WINDOWS("a file that is open cannot be removed");
  ASSERT_EQ(open({root()}), TW_SUCCESS);
  expect_plane(107.25, 45.5);
  SubGrid g = root();
  g.lat = [](int, int) { return 7.0F; };
  fs::remove(folder.path() / "grid.gsb");
  ASSERT_EQ(open({g}), TW_SUCCESS);
  EXPECT_NEAR(shift_at(west(107.25, 45.5)).lat, 7, 1e-9);  // the block is not the old one's
}

TEST_F(NationalGrid, HeadersByThemselves) {
  folder.write("grid.gsb", GsbFile{{root()}}.bytes());
  const std::string path = (folder.path() / "grid.gsb").string();
  TWstatus status = 0;
  TWrd_cnt_fhdr(path.c_str(), 0, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_plane(107.25, 45.5);
  TWrd_cnt_fhdr(path.c_str(), 1, &status);
  EXPECT_EQ(status, TW_GSB_READ_ERROR);
  TWrd_cnt_fhdr((path + "x").c_str(), 0, &status);
  EXPECT_EQ(status, TW_GSB_READ_ERROR);
  expect_plane(107.25, 45.5);  // nothing was opened in its place
  TWrd_cnt_fhdr(folder.path().string().c_str(), 0, &status);
  EXPECT_EQ(status, TW_GSB_READ_ERROR);  // a folder
}

TEST_F(NationalGrid, HeadersThatCannotBe) {
  const auto with = [](auto change) {
    GsbFile file{{root(), child("CHILD", "ROOT", 43, 47, 104, 108, 2)}};
    change(file);
    return file.bytes();
  };
  EXPECT_EQ(open(with([](GsbFile&) {})), TW_SUCCESS);
  EXPECT_EQ(open(with([](GsbFile& f) { f.num_orec = 12; })), TW_GSB_READ_ERROR);
  EXPECT_EQ(open(with([](GsbFile& f) { f.num_orec = 10; })), TW_GSB_READ_ERROR);
  EXPECT_EQ(open(with([](GsbFile& f) { f.num_orec = 0x0B000000; })), TW_GSB_READ_ERROR);
  EXPECT_EQ(open(with([](GsbFile& f) { f.num_srec = 12; })), TW_GSB_READ_ERROR);
  EXPECT_EQ(open(with([](GsbFile& f) { f.num_file = 3; })), TW_GSB_READ_ERROR);
  EXPECT_EQ(open(with([](GsbFile& f) { f.num_file = 2147483647; })), TW_GSB_READ_ERROR);
  EXPECT_EQ(open(with([](GsbFile& f) { f.num_file = 1; })), TW_SUCCESS);
  EXPECT_EQ(open(with([](GsbFile& f) { f.grids[0].count_error = 1; })), TW_GSB_READ_ERROR);
  EXPECT_EQ(open(with([](GsbFile& f) { f.grids[1].count_error = -1; })), TW_GSB_READ_ERROR);
  std::string negative = with([](GsbFile&) {});
  negative.replace(40, 4, std::string(4, '\xFF'));
  EXPECT_EQ(open(negative), TW_GSB_READ_ERROR);
  // What no key says matters.
  std::string keys = with([](GsbFile&) {});
  for (std::size_t offset = 0; offset < 352; offset += 16) keys.replace(offset, 8, "whatever");
  EXPECT_EQ(open(keys), TW_SUCCESS);
  expect_plane(110.25, 45.5);
}

TEST_F(NationalGrid, SpacingsAndBoundsThatCannotBe) {
  const std::string good = GsbFile{{root()}}.bytes();
  for (std::size_t field = 0; field < 6; ++field) {
    const bool spacing = field >= 4;
    for (const double v : {0.0, -3600.0, kNaN, kInfinity, -kInfinity, 1e-300, 1e300}) {
      if (!spacing && std::isfinite(v)) continue;
      std::string value, bytes = good;
      append_f64(value, v);
      bytes.replace(176 + 72 + 16 * field, 8, value);
      EXPECT_EQ(open(bytes), TW_GSB_READ_ERROR) << field << " " << v;
      EXPECT_EQ(shift_at(west(107.25, 45.5)).status, TW_I_OUTSIDE_CNT);
    }
  }
}

TEST_F(NationalGrid, FileWithoutSubGrids) {
  ASSERT_EQ(open(std::vector<SubGrid>{}), TW_SUCCESS);
  EXPECT_EQ(shift_at(west(107.25, 45.5)).status, TW_I_OUTSIDE_CNT);
}

TEST_F(NationalGrid, SubGridsReadBeforeAFailureDoNoHarm) {
  GsbFile file{{root(), child("CHILD", "ROOT", 43, 47, 104, 108, 2)}};
  file.grids[1].count_error = 5;
  ASSERT_EQ(open(file.bytes()), TW_GSB_READ_ERROR);
  expect_plane(105.25, 45.5);  // of the root, which is all that was read
}

TEST_F(NationalGrid, FileCutAtEachRecord) {
  GsbFile file{{child("A", "NONE", 43, 45, 104, 106, 2), child("B", "NONE", 53, 55, 104, 106, 3)}};
  const std::string bytes = file.bytes();
  const std::size_t nodes = 25;  // each way five
  const std::size_t second = 176 + 176 + nodes * 16;
  ASSERT_EQ(bytes.size(), second + 176 + nodes * 16 + 16);
  for (std::size_t length = 0; length <= bytes.size(); length += 8) {
    const TWstatus status = open(bytes.substr(0, length));
    EXPECT_EQ(status, length >= second + 176 ? TW_SUCCESS : TW_GSB_READ_ERROR) << length;
    if (status != TW_SUCCESS) continue;
    EXPECT_NEAR(shift_at(west(104.75, 43.75)).lat, 2, 1e-9);
    // The block for the point starts at row and column 0; its last node is of row 3, column 3.
    const bool read = length >= second + 176 + (3 * 5 + 4) * 16;
    const Shift s = shift_at(west(104.75, 53.75));
    EXPECT_EQ(s.status, read ? TW_SUCCESS : TW_GSB_READ_ERROR) << length;
    EXPECT_NE(s.lat, kUntouched);  // written all the same
    // Rows that could not be read keep the nodes of the block before.
    const std::size_t rows_read = std::min<std::size_t>(
        4, length < second + 176 + 64 ? 0 : (length - second - 176 - 64) / 80 + 1);
    const double expected = rows_read >= 3 ? 3 : rows_read == 2 ? 2.5 : 2;
    EXPECT_NEAR(s.lat, expected, 1e-9) << length;
    // By contract: the block counts as loaded, and the word is not given again.
    EXPECT_EQ(shift_at(west(104.75, 53.75)).status, TW_SUCCESS);
  }
}

TEST_F(NationalGrid, ArrayStopsAtAShortRead) {
  const GsbFile file{
      {child("A", "NONE", 43, 45, 104, 106, 2), child("B", "NONE", 53, 55, 104, 106, 3)}};
  const std::string bytes = file.bytes();
  ASSERT_EQ(open(bytes.substr(0, bytes.size() - 16 - 24 * 16)), TW_SUCCESS);
  const Points in = {west(104.75, 43.75), west(90, 10), west(104.75, 53.75), west(104.75, 43.75),
                     west(90, 10)};
  for (const auto run : {TWcnt_f, TWcnt_i}) {
    Points out = untouched(5);
    TWstatus status = 0;
    TWload_cnt_local_grid(0, 23);  // another block, so that the failing one is loaded again
    run(5, in.data(), 0, out.data(), &status);
    EXPECT_EQ(status, TW_GSB_READ_ERROR);
    EXPECT_NE(out[0].y, kUntouched);
    EXPECT_EQ(out[1].y, in[1].y);
    for (std::size_t i = 2; i < 5; ++i) expect_untouched(out[i]);
  }
}

TEST_F(NationalGrid, TheSamePointAskedAgainIsServedFromTheOldNodes) {
  // By contract: the block that could not be read counts as loaded.
  const GsbFile file{
      {child("A", "NONE", 43, 45, 104, 106, 2), child("B", "NONE", 53, 55, 104, 106, 3)}};
  const std::string bytes = file.bytes();
  ASSERT_EQ(open(bytes.substr(0, bytes.size() - 16 - 24 * 16)), TW_SUCCESS);
  const CoordinateTriple first = west(104.75, 43.75), in = west(104.75, 53.75);
  CoordinateTriple out = {};
  TWstatus status = 0;
  TWcnt_f(1, &first, 0, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  TWcnt_f(1, &in, 0, &out, &status);
  EXPECT_EQ(status, TW_GSB_READ_ERROR);
  TWcnt_f(1, &in, 0, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NEAR((out.y - in.y) / kSecond, 2, 1e-6);  // and not the 3 of its own nodes
}

// Which nodes a load keeps is seen by writing other values into the file behind it.
class NationalBlock : public NationalGrid {
 protected:
  void SetUp() override {
    ASSERT_EQ(open({root(), child("C", "NONE", 0, 3, 10, 13, 1)}), TW_SUCCESS);
  }

  // Record number of a node of the root, from 1.
  static std::int32_t record(int row, int col) { return 22 + row * 16 + col + 1; }

  void expect_block(int row, int col) {
    SCOPED_TRACE(testing::Message() << row << " " << col);
    SubGrid changed = root();
    changed.lat = [](int, int) { return 50.0F; };
    overwrite(GsbFile{{changed}}.bytes().substr(0, 352 + 176 * 16));
    // All nine cells serve.
    for (const double r : {0.5, 1.5, 2.5}) {
      for (const double c : {0.5, 1.5, 2.5}) {
        const Shift s = shift_at(west(100 + col + c, 40 + row + r));
        EXPECT_NEAR(s.lat, 0.125 + (row + r) / 64 + (col + c) / 32, 1e-9);
      }
    }
    // The next ones load; each from the first block again.
    const auto expect_load = [&](double r, double c) {
      if (r < 0 || r > 10 || c < 0 || c > 15) return;
      EXPECT_NEAR(shift_at(west(100 + c, 40 + r)).lat, 50, 1e-9) << r << " " << c;
      overwrite(GsbFile{{root()}}.bytes().substr(0, 352 + 176 * 16));
      TWload_cnt_local_grid(1, 400);
      TWload_cnt_local_grid(0, record(row + 1, col + 1));
      overwrite(GsbFile{{changed}}.bytes().substr(0, 352 + 176 * 16));
    };
    expect_load(row - 0.5, col + 0.5);
    expect_load(row + 3.5, col + 0.5);
    expect_load(row + 0.5, col - 0.5);
    expect_load(row + 0.5, col + 3.5);
    overwrite(GsbFile{{root()}}.bytes().substr(0, 352 + 176 * 16));
    TWload_cnt_local_grid(1, 400);
  }
};

TEST_F(NationalBlock, StartsOneNodeSouthAndEast) {
  TWload_cnt_local_grid(0, record(5, 7));
  expect_block(4, 6);
  shift_at(west(107.5, 45.5));
  expect_block(4, 6);
}

TEST_F(NationalBlock, StaysInsideTheSubGrid) {
  const struct {
    int row, col, block_row, block_col;
  } cases[] = {{0, 0, 0, 0},   {1, 1, 0, 0},   {2, 2, 1, 1},   {10, 15, 7, 12}, {9, 14, 7, 12},
               {8, 13, 7, 12}, {7, 12, 6, 11}, {0, 15, 0, 12}, {10, 0, 7, 0}};
  for (const auto& c : cases) {
    TWload_cnt_local_grid(0, record(c.row, c.col));
    expect_block(c.block_row, c.block_col);
  }
}

TEST_F(NationalBlock, RecordsFarOffAreHeld) {
  TWload_cnt_local_grid(0, -2147483647 - 1);
  expect_block(0, 0);
  TWload_cnt_local_grid(0, 2147483647);
  shift_at(west(100.5, 49.5));
  for (const std::int32_t index : {-1, 2, 2147483647, -2147483647 - 1}) {
    TWload_cnt_local_grid(index, record(5, 7));  // no such sub-grid
  }
  expect_plane(107.5, 45.5);
}

TEST_F(NationalBlock, LoadsTheSameBlockOnce) {
  TWload_cnt_local_grid(0, record(5, 7));
  SubGrid changed = root();
  changed.lat = [](int, int) { return 50.0F; };
  overwrite(GsbFile{{changed}}.bytes().substr(0, 352 + 176 * 16));
  TWload_cnt_local_grid(0, record(5, 7));
  expect_plane(107.5, 45.5);
  TWload_cnt_local_grid(1, 400);
  TWload_cnt_local_grid(0, record(5, 7));
  EXPECT_NEAR(shift_at(west(107.5, 45.5)).lat, 50, 1e-9);
}

TEST_F(NationalGrid, SmallLastSubGridIsReadWithWhatFollows) {
  // Fewer rows or columns than the block: four reads of four records each reach behind the nodes.
  for (const auto& [lat_cells, lon_cells] : {std::pair{1, 1}, {2, 2}, {2, 6}, {6, 2}, {3, 3}}) {
    SubGrid g = root();
    g.n_lat = g.s_lat + lat_cells * kDegree;
    g.w_long = g.e_long + lon_cells * kDegree;
    const std::string bytes = GsbFile{{g}}.bytes();
    const int rows = lat_cells + 1, cols = lon_cells + 1;
    // Where the last of the four records of the fourth read ends, for the block of the first cell.
    const auto needed = static_cast<std::size_t>(352 + (3 * cols + 4) * 16);
    for (const int spare : {-16, -8, 0, 8}) {
      SCOPED_TRACE(testing::Message() << rows << " by " << cols << " spare " << spare);
      std::string cut = bytes.substr(0, 352 + static_cast<std::size_t>(rows * cols) * 16);
      cut.resize(static_cast<std::size_t>(static_cast<int>(needed) + spare), '\0');
      ASSERT_EQ(open(cut), TW_SUCCESS);
      const Shift s = shift_at(west(100.25, 40.25));
      EXPECT_EQ(s.status, spare < 0 ? TW_GSB_READ_ERROR : TW_SUCCESS);
      EXPECT_NE(s.lat, kUntouched);  // written all the same
    }
    // With enough behind it a small sub-grid serves all its cells.
    ASSERT_EQ(open(bytes + std::string(256, 'x')), TW_SUCCESS);
    for (double r = 0; r <= lat_cells; r += 0.25) {
      for (double c = 0; c <= lon_cells; c += 0.25) expect_plane(100 + c, 40 + r);
    }
  }
}

TEST_F(NationalGrid, OneCallAsOneForEachPoint) {
  // Enough points for the file to be read whole on the way; two roots, and points outside.
  const std::string bytes = GsbFile{
      {root(), child("IN", "ROOT", 43, 47, 104, 108, 2),
       child("B", "NONE", 53, 55, 104, 106,
             3)}}.bytes();
  const auto open_grid = [&] { ASSERT_EQ(open(bytes), TW_SUCCESS); };
  const Points in = scattered(600, -116, -99, 39, 56);
  for (const auto run : {TWcnt_f, TWcnt_i}) {
    expect_one_call_as_many(
        in, open_grid,
        [&](std::int32_t n, const CoordinateTriple* from, CoordinateTriple* to) {
          TWstatus status = 0;
          run(n, from, 0, to, &status);
          return status;
        },
        // The block outlives the call: other nodes in the file are not seen inside it.
        [&] { overwrite(std::string(bytes.size(), '\0')); });
  }
}

TEST_F(NationalGrid, WithoutMemoryForTheFileItIsReadOn) {
  ASSERT_EQ(open({root()}), TW_SUCCESS);
  const Points in = scattered(300, -114, -101, 41, 49);
  Points with = untouched(in.size()), without = untouched(in.size());
  TWstatus status = 0;
  const auto n = static_cast<std::int32_t>(in.size());
  TWcnt_f(n, in.data(), 0, with.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  {
    const FailingNew failing;
    TWcnt_f(n, in.data(), 0, without.data(), &status);
    EXPECT_GT(failing.asked(), 0);  // the file was wanted whole
  }
  EXPECT_EQ(status, TW_SUCCESS);
  for (std::size_t i = 0; i < in.size(); ++i) {
    EXPECT_EQ(with[i].x, without[i].x);
    EXPECT_EQ(with[i].y, without[i].y);
  }
}

TEST_F(NationalGrid, ShortFileInMemory) {
  // A block behind the end is told also where the rest of the file has been read whole.
  const GsbFile file{{root(), child("B", "NONE", 53, 55, 104, 106, 3)}};
  const std::string bytes = file.bytes();
  ASSERT_EQ(open(bytes.substr(0, bytes.size() - 16 - 5 * 16)), TW_SUCCESS);
  Points in = scattered(200, -114, -101, 41, 49);
  in.push_back(west(105.25, 53.25));  // in the part that is there
  in.push_back(west(105.75, 54.75));  // not there
  in.push_back(west(105, 45));
  Points out = untouched(in.size());
  TWstatus status = 0;
  TWcnt_f(static_cast<std::int32_t>(in.size()), in.data(), 0, out.data(), &status);
  EXPECT_EQ(status, TW_GSB_READ_ERROR);
  EXPECT_NEAR((out[200].y - in[200].y) / kSecond, 3, 1e-6);
  expect_untouched(out[201]);
  expect_untouched(out[202]);
  // By contract: the block counts as loaded, and holds what it held where nothing could be read.
  EXPECT_NEAR(shift_at(west(105.75, 54.75)).lat, 3, 1e-9);
}

TEST_F(NationalGrid, ManySubGridsUnderOneName) {
  // The way down looks at each a few times, not at all of them at each of as many levels.
  const SubGrid one = child("NONE", "NONE", 43, 44, 104, 105, 2);
  std::vector<SubGrid> grids(20000, one);
  ASSERT_EQ(open(grids), TW_SUCCESS);
  const Points in(20, west(104.25, 43.25));
  Points out = untouched(20);
  TWstatus status = 0;
  TWcnt_i(20, in.data(), 0, out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  for (const CoordinateTriple& p : out) EXPECT_NEAR((in[0].y - p.y) / kSecond, 2, 1e-6);
  // And a line of parents and children ends at the last.
  grids.clear();
  for (int i = 0; i < 5000; ++i) {
    grids.push_back(child("", "", 43, 44, 104, 105, static_cast<float>(i)));
    grids.back().name = std::to_string(i);
    grids.back().parent = i == 0 ? "NONE" : std::to_string(i - 1);
  }
  std::ranges::reverse(grids);
  ASSERT_EQ(open(grids), TW_SUCCESS);
  EXPECT_NEAR(shift_at(west(104.25, 43.25)).lat, 4999, 1e-9);
}

TEST_F(NationalGrid, NoMemoryForTheTable) {
  TIDEWATER_NEED_MEMORY_LIMIT();
  // As many headers as the file has room for, in a file without content.
  GsbFile file{{root()}};
  file.num_file = 1 << 23;
  folder.write("grid.gsb", file.bytes());
  folder.write("area.par", "grid\n");
  fs::resize_file(folder.path() / "grid.gsb", 176 * ((std::uintmax_t{1} << 23) + 1));
  const auto fails = [&] {
    TWstatus status = 0;
    TWcnt_c(folder.directory().c_str(), 0, &status);
    return status == TW_NO_MEMORY && shift_at(west(107.5, 45.5)).status == TW_I_OUTSIDE_CNT;
  };
  expect_with_little_memory(fails);
}

TEST_F(NationalGrid, DamagedHeadersDoNoHarm) {
  const std::string good = GsbFile{{root(), child("CHILD", "ROOT", 43, 47, 104, 108, 2)}}.bytes();
  const std::size_t second = 176 + 176 + 11 * 16 * 16;
  std::mt19937 random(5);
  int opened = 0;
  for (int round = 0; round < 400; ++round) {
    std::string bytes = good;
    for (auto changes = 1 + random() % 3; changes > 0; --changes) {
      const std::size_t at = random() % 3 == 0 ? random() % 352 : second + random() % 176;
      bytes[at] = static_cast<char>(random());
    }
    if (random() % 8 == 0) bytes.resize(random() % bytes.size());
    opened += open(bytes) == TW_SUCCESS;
    Points points = {west(105.25, 45.25), west(114.75, 49.75), west(100.25, 40.25),
                     west(0, 0),          {kNaN, 0.8, 0},      {-1.8, kNaN, 0}};
    TWstatus status = 0;
    TWcnt_f(6, points.data(), 0, points.data(), &status);
    TWcnt_i(6, points.data(), 0, points.data(), &status);
    TWload_cnt_local_grid(1, static_cast<std::int32_t>(random()));
  }
  EXPECT_GT(opened, 20);
}

}  // namespace
