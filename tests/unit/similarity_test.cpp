#include <gtest/gtest.h>

#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/datum.h"

using namespace tidewater::test;

namespace {

using Matrix = std::array<double, 9>;

constexpr Matrix kIdentity = {1, 0, 0, 0, 1, 0, 0, 0, 1};
constexpr Matrix kQuarterAboutZ = {0, -1, 0, 1, 0, 0, 0, 0, 1};

// Small angles in arc-seconds, as the position vector convention has them.
Matrix position_vector(double rx, double ry, double rz) {
  const double x = degrees(0, 0, rx), y = degrees(0, 0, ry), z = degrees(0, 0, rz);
  return {1, -z, y, z, 1, -x, -y, x, 1};
}

TEST(BursaWolf, PublishedExample) {
  // EPSG Guidance Note 7-2, Position Vector transformation: WGS 72 to WGS 84.
  const auto rotation = position_vector(0, 0, 0.554);
  const CoordinateTriple in = {3657660.66, 255768.55, 5201382.11};
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWbw_f(1, &in, 0.219e-6, rotation.data(), 0, 0, 4.5, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out, 3657660.78, 255778.43, 5201387.75, 0.01);  // the note's own arithmetic is in cm
}

TEST(BursaWolf, ScalesThenTurnsThenShifts) {
  const Points in = {{1, 2, 3}, {-4, 0.5, 8}};
  Points out = untouched(2);
  TWstatus status = 0;
  TWbw_f(2, in.data(), 1, kQuarterAboutZ.data(), 10, 20, 30, out.data(), &status);
  expect_near(out[0], 10 - 4, 20 + 2, 30 + 6, 0);
  expect_near(out[1], 10 - 1, 20 - 8, 30 + 16, 0);
  TWbw_i(2, out.data(), 1, kQuarterAboutZ.data(), 10, 20, 30, out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out[0], 1, 2, 3, 0);
  expect_near(out[1], -4, 0.5, 8, 0);
  // Rows and columns: a matrix with nine different elements.
  const Matrix m = {1, 2, 3, 4, 5, 6, 7, 8, 10};
  TWbw_f(1, in.data(), 0, m.data(), 0, 0, 0, out.data(), &status);
  expect_near(out[0], 1 + 4 + 9, 4 + 10 + 18, 7 + 16 + 30, 0);
  TWbw_i(1, in.data(), 0, m.data(), 0, 0, 0, out.data(), &status);
  expect_near(out[0], 1 + 8 + 21, 2 + 10 + 24, 3 + 12 + 30, 0);  // the transpose
}

TEST(BursaWolf, NothingToDoIsBitForBit) {
  const CoordinateTriple in = {3657660.663333333, 255768.55777777, -5201382.111111111};
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWbw_f(1, &in, 0, kIdentity.data(), 0, 0, 0, &out, &status);
  expect_near(out, in.x, in.y, in.z, 0);
}

TEST(BursaWolf, InverseWithoutAFactor) {
  const Points in = {{1, 2, 3}, {4, 5, 6}};
  Points out = untouched(2);
  TWstatus status = 0;
  TWbw_i(2, in.data(), -1, kQuarterAboutZ.data(), 1, 1, 1, out.data(), &status);
  EXPECT_EQ(status, TW_SINGULAR);
  expect_near(out[0], 1, 0, 2, 0);  // not divided
  expect_near(out[1], 4, -3, 5, 0);
  TWbw_i(2, in.data(), std::nextafter(-1, 0), kQuarterAboutZ.data(), 1, 1, 1, out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_GT(out[0].x, 1e15);
}

TEST(MolodenskyBadekas, PublishedExample) {
  // EPSG Guidance Note 7-2, Molodensky-Badekas (coordinate frame): La Canoa to REGVEN.  The
  // coordinate frame turns the other way.
  const auto rotation = position_vector(5.266, 1.238, -2.381);
  const CoordinateTriple in = {2550408.96, -5749912.26, 1054891.11};
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  const double px = 2464351.59, py = -5783466.61, pz = 974809.81;
  TWmol_bdk_f(1, &in, -5.109e-6, rotation.data(), px, py, pz, px - 270.933, py + 115.599,
              pz - 360.226, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out, 2550138.45, -5749799.87, 1054530.82, 0.0151);
  TWmol_bdk_i(1, &out, -5.109e-6, rotation.data(), px, py, pz, px - 270.933, py + 115.599,
              pz - 360.226, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out, in.x, in.y, in.z, 1e-3);  // the small angles are not quite orthogonal
}

TEST(MolodenskyBadekas, TurnsAboutTheCentre) {
  const CoordinateTriple in = {3, 4, 5};
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWmol_bdk_f(1, &in, 1, kQuarterAboutZ.data(), 1, 1, 1, 10, 20, 30, &out, &status);
  expect_near(out, 10 - 6, 20 + 4, 30 + 8, 0);
  TWmol_bdk_i(1, &out, 1, kQuarterAboutZ.data(), 1, 1, 1, 10, 20, 30, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out, 3, 4, 5, 0);
}

TEST(MolodenskyBadekas, InverseWithoutAScaleChangeIsRightAndAFailure) {
  const Points in = {{3, 4, 5}, {6, 7, 8}};
  Points out = untouched(2);
  TWstatus status = 0;
  TWmol_bdk_i(2, in.data(), 0, kIdentity.data(), 1, 2, 3, 10, 20, 30, out.data(), &status);
  EXPECT_EQ(status, TW_FAILURE);
  expect_near(out[0], 3 - 10 + 1, 4 - 20 + 2, 5 - 30 + 3, 0);
  expect_near(out[1], 6 - 10 + 1, 7 - 20 + 2, 8 - 30 + 3, 0);
  TWmol_bdk_i(2, in.data(), 1e-300, kIdentity.data(), 1, 2, 3, 10, 20, 30, out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out[0], 3 - 10 + 1, 4 - 20 + 2, 5 - 30 + 3, 0);
  // No points, no failure.
  TWmol_bdk_i(0, in.data(), 0, kIdentity.data(), 1, 2, 3, 10, 20, 30, out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  // A factor of zero is divided by.
  TWmol_bdk_i(1, in.data(), -1, kIdentity.data(), 1, 2, 3, 10, 20, 30, out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_TRUE(std::isinf(out[0].x));
}

TEST(Shifts, ThereAndBack) {
  const Points in = {{1, 2, 3}, {0.5, 0.25, 0.125}};
  Points out = untouched(3);
  TWstatus status = 0;
  TWshifts_f(2, in.data(), 10, 20, 30, out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out[0], 11, 22, 33, 0);
  expect_near(out[1], 10.5, 20.25, 30.125, 0);
  expect_untouched(out[2]);
  TWshifts_i(2, out.data(), 10, 20, 30, out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out[0], 1, 2, 3, 0);
  expect_near(out[1], 0.5, 0.25, 0.125, 0);
}

TEST(Similarity, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const ProjPeer helmert(
      "+proj=helmert +convention=position_vector +x=-87.2 +y=98.1 +z=121.5 +rx=0.4 +ry=-1.3 "
      "+rz=2.2 +s=1.7");
  const ProjPeer badekas(
      "+proj=molobadekas +convention=position_vector +x=-87.2 +y=98.1 +z=121.5 +rx=0.4 +ry=-1.3 "
      "+rz=2.2 +s=1.7 +px=4000000 +py=100000 +pz=4900000");
  ASSERT_TRUE(helmert.ok());
  ASSERT_TRUE(badekas.ok());
  const auto rotation = position_vector(0.4, -1.3, 2.2);
  const CoordinateTriple in = {4012345.6, -78901.2, 4934567.8};
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWbw_f(1, &in, 1.7e-6, rotation.data(), -87.2, 98.1, 121.5, &out, &status);
  auto expected = helmert.forward(in);
  expect_near(out, expected.x, expected.y, expected.z, 1e-8);
  TWmol_bdk_f(1, &in, 1.7e-6, rotation.data(), 4e6, 1e5, 4.9e6, 4e6 - 87.2, 1e5 + 98.1,
              4.9e6 + 121.5, &out, &status);
  expected = badekas.forward(in);
  expect_near(out, expected.x, expected.y, expected.z, 1e-8);
#endif
}

}  // namespace
