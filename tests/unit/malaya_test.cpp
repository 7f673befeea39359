#include <gtest/gtest.h>

#include <numeric>
#include <vector>

#include "support/points.hpp"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

constexpr double kChain = 20.1167824946;

TEST(Malaya, ParametersAreThoseOfTheSkewGrid) {
  double m[6] = {}, r[6] = {};
  TWstatus status = 0;
  TWmalaya_param(&m[0], &m[1], &m[2], &m[3], &m[4], &m[5], &status);
  EXPECT_EQ(status, TW_SUCCESS);
  TWrso_param(&r[0], &r[1], &r[2], &r[3], &r[4], &r[5], &status);
  EXPECT_EQ(m[0], r[0]);
  EXPECT_EQ(m[1], r[1]);
  EXPECT_EQ(m[2], 804671.2998);
  EXPECT_EQ(m[3], 0);
  EXPECT_EQ(m[4], 0.99984);
  EXPECT_EQ(m[5], r[2]);
}

TEST(Malaya, Table) {
  std::vector<double> table(85, kUntouched);
  TWstatus status = 0;
  TWmalaya_c(table.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(table[84], kUntouched);
  // Forward by rows of 21: E, N; back: E, N.
  const double printed[84] = {
      -5070.0,     -32370.0,   -75.0,     -52440.0,  -3506.0,   -8047.3,      41570.0,
      -17650.0,    -34705.3,   131.22,    36030.0,   -1917.0,   120624.9,     -17547.62,
      189383.1095, -4200.0,    3685.0,    11456.8,   6633.08,   252611.3,     0.0,
      590.0,       4180.0,     -13.0,     47100.0,   -3791.0,   30959.8,      72270.0,
      -1650.0,     120588.7,   174.3,     -20910.0,  14677.0,   34226.7,      13210.7,
      251555.3866, -7240.0,    481.0,     -40377.1,  8810.64,   -190178.0524, 27490.8082,
      33.7348,     25.2917,    7.1508,    -100.8099, -53.8975,  -1088.5873,   38.0828,
      30.5043,     -1691.0952, -466.4008, 19.7374,   20.6693,   1243.3699,    680.5524,
      39399.5128,  -7.3462,    -9.9364,   -331.7415, -270.5924, 52333.9158,   0.0,
      -9.2574,     -78.9592,   -21.2579,  92.5735,   48.6088,   -236.8446,    157.9184,
      127.5476,    2538.6948,  691.5037,  -46.2868,  -48.6088,  710.5339,     397.9187,
      52115.1603,  -15.7918,   -21.2579,  -846.2316, -691.5037, -39234.8231,  0.0,
  };
  for (std::size_t i = 0; i < 84; ++i) EXPECT_EQ(table[i], printed[i]) << i;
}

TEST(Malaya, EveryEntryStandsAtItsPower) {
  // The entries of a row belong, in order, to q^5; then m = 0..4, for each the coefficient of
  // q^(4 - m) with powers p^(m+1) down to p^0.
  const double p = 0.3, q = -0.7;
  for (int entry = 0; entry < 21; ++entry) {
    double power = std::pow(q, 5);
    if (entry > 0) {
      int m = 0, first = 1;
      while (entry >= first + m + 2) first += m++ + 2;
      power = std::pow(q, 4 - m) * std::pow(p, m + 1 - (entry - first));
    }
    std::vector<double> table(84, 0.0);
    table[static_cast<std::size_t>(entry)] = 1;       // E of the forward
    table[static_cast<std::size_t>(42 + entry)] = 1;  // E of the inverse
    const CoordinateTriple in = {1 + p, 2 + q, 0};
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWmalaya_f(table.data(), 1, 2, 1, &in, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    const double unit = kChain / 6377304.063 / 0.99984;
    expect_near(out, 0.8 * power * unit, 0.6 * power * unit, kUntouched, 1e-15 * unit);
    // inverse: X = 27490.8082 + 1e5 p, Y = 1e5 q
    const double X = 27490.8082 + 1e5 * p - 24000, Y = 1e5 * q + 32000;
    const CoordinateTriple plane = {(0.8 * Y - 0.6 * X) * kChain, (0.6 * Y + 0.8 * X) * kChain, 0};
    TWmalaya_i(table.data(), 0, 0, 1, &plane, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_NEAR(out.y, power * 4.84813681109536e-6, 1e-19);
    EXPECT_EQ(out.x, 0);
  }
}

TEST(Malaya, StandsForTheSkewGrid) {
  // Over the peninsula the polynomials meet the closed projection but for the datum's choice of
  // origin: some tens of metres in 400 km; forward and inverse meet to a few centimetres.
  double table[84];
  double lon_c = 0, lat_c = 0, fe = 0, fn = 0, k0 = 0, skew = 0;
  TWstatus status = 0;
  TWmalaya_c(table, &status);
  TWmalaya_param(&lon_c, &lat_c, &fe, &fn, &k0, &skew, &status);
  const auto ellipsoid = Ellipsoid::from_inverse_flattening(6377304.063, 300.8017);
  double A = 0, B = 0, C = 0, lon0 = 0;
  TWrso_c(ellipsoid.e, lon_c, lat_c, skew, &A, &B, &C, &lon0, &status);
  for (double lat = 1.5; lat < 6.6; lat += 1) {
    for (double lon = 100.2; lon < 104; lon += 0.9) {
      const CoordinateTriple in = {degrees(lon), degrees(lat), 0};
      CoordinateTriple grid, closed;
      TWmalaya_f(table, lon_c, lat_c, 1, &in, &grid, &status);
      TWrso_f(lon0, skew, A, B, C, ellipsoid.e, 1, &in, &closed, &status);
      expect_near(grid, closed.x, closed.y, 100 / ellipsoid.a);
      // to metres, with the false origin, for the inverse
      const double unit = 6377304.063 * 0.99984;
      CoordinateTriple back = {grid.x * unit + fe, grid.y * unit + fn, 0};
      TWmalaya_i(table, lon_c, lat_c, 1, &back, &back, &status);
      EXPECT_EQ(status, TW_SUCCESS);
      expect_near(back, in.x, in.y, 0.1 / ellipsoid.a);
    }
  }
}

TEST(Malaya, NothingToDoAndNotANumber) {
  double table[84];
  TWstatus status = 0;
  TWmalaya_c(table, &status);
  CoordinateTriple q = kUntouchedPoint;
  TWmalaya_f(table, 0, 0, 0, &q, &q, &status);
  TWmalaya_i(table, 0, 0, -1, &q, &q, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_untouched(q);
  q = {kNaN, 0, 5};
  TWmalaya_f(table, 0, 0, 1, &q, &q, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_TRUE(std::isnan(q.x));
  EXPECT_EQ(q.z, 5);
}

}  // namespace
