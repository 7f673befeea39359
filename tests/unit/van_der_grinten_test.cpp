#include <gtest/gtest.h>

#include <random>

#include "support/numeric_scale.hpp"
#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

CoordinateTriple forward(double lon, double lat, double lon0 = 0, double y0 = 0) {
  const CoordinateTriple in = {lon, lat, 0};
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWvdg_f(lon0, y0, 1, &in, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(out.z, kUntouched);
  return out;
}

CoordinateTriple inverse(double x, double y, double lon0 = 0, double y0 = 0) {
  const CoordinateTriple in = {x, y, 0};
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWvdg_i(lon0, y0, 1, &in, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  return out;
}

CoordinateTriple scale(double lon, double lat, double k0 = 1) {
  const CoordinateTriple in = {lon, lat, 0};
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWvdg_s(k0, 0, 1, &in, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  return out;
}

// The ordinate on the central meridian, by the half angle: tan(t / 2) = s / (1 + cos t).
double axis(double lat) {
  const double s = 2 * lat / kPi;
  return kPi * s / (1 + std::sqrt(1 - s * s));
}

TEST(VanDerGrinten, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const ProjPeer peer("+proj=vandg +R=1 +lon_0=10");
  ASSERT_TRUE(peer.ok());
  for (double lat = -88; lat < 89; lat += 4.4) {
    for (double lon = -160; lon < 180; lon += 23) {
      const CoordinateTriple expected = peer.forward({degrees(lon), degrees(lat), 0});
      // the ordinate is the root of a difference that cancels towards both axes
      const double tolerance = 3e-14 / std::fabs(degrees(lon - 10) * degrees(lat));
      expect_near(forward(degrees(lon), degrees(lat), degrees(10)), expected.x, expected.y,
                  tolerance);
    }
  }
#endif
}

TEST(VanDerGrinten, OriginLatitude) {
  for (const double lat : {0.0, 0.5, -0.5, kPi / 2, -kPi / 2}) {
    double y0 = kUntouched;
    TWvdg_c(lat, &y0);
    EXPECT_NEAR(y0, axis(lat), 1e-15);
  }
  double y0 = 0;
  TWvdg_c(1.6, &y0);
  EXPECT_TRUE(std::isnan(y0));
  EXPECT_NEAR(forward(0, 0.5, 0, axis(0.5)).y, 0, 1e-15);
}

TEST(VanDerGrinten, Axes) {
  const double y0 = 0.25;
  expect_near(forward(0.8, 0, 0, y0), 0.8, -y0, 0);
  expect_near(forward(0, 0.8, 0, y0), 0, axis(0.8) - y0, 1e-15);
  expect_near(forward(0, -0.8, 0, y0), 0, -axis(0.8) - y0, 1e-15);
  // near an axis x is the difference of longitude, even at a high latitude
  expect_near(forward(0.000299, 1.2, 0, y0), 0.000299, axis(1.2) - y0, 1e-15);
  expect_near(forward(1.2, -0.000299, 0, y0), 1.2, -axis(0.000299) - y0, 1e-15);
  EXPECT_LT(forward(0.0003, 1.2).x, 0.00025);  // at the limit the map's own formula
  EXPECT_NE(forward(1.2, 0.0003).x, 1.2);
}

TEST(VanDerGrinten, Poles) {
  expect_near(forward(1, kPi / 2), 0, kPi, 1e-15);
  expect_near(forward(1, -kPi / 2, 0, 0.5), 0, -kPi - 0.5, 1e-15);
  EXPECT_TRUE(std::isnan(forward(1, 1.58).x));
}

TEST(VanDerGrinten, EdgeIsACircle) {
  for (double lat = 0.1; lat < 1.5; lat += 0.2) {
    const CoordinateTriple p = forward(kPi, lat);
    EXPECT_NEAR(std::hypot(p.x, p.y), kPi, 1e-14);
    EXPECT_GT(p.x, 0);
    EXPECT_LT(forward(-kPi, lat).x, 0);  // exactly -pi stays
  }
}

TEST(VanDerGrinten, SingleWrap) {
  const CoordinateTriple p = forward(0.5, 0.4);
  const CoordinateTriple above = forward(0.5 + 2 * kPi, 0.4), below = forward(0.5 - 2 * kPi, 0.4);
  expect_near(above, p.x, p.y, 1e-14);
  expect_near(below, p.x, p.y, 1e-14);
  EXPECT_EQ(forward(0.5 + 4 * kPi, 0).x, 0.5 + 4 * kPi - 2 * kPi);  // one turn at most
}

TEST(VanDerGrinten, InverseNearTheAxes) {
  expect_near(inverse(0.000299, axis(0.8), 0.1), 0.100299, 0.8, 1e-15);
  expect_near(inverse(0.7, 0.0002, 0.1, -0.0001), 0.8,
              std::sin(2 * std::atan(0.0001 / kPi)) * kPi / 2, 1e-15);
  expect_near(inverse(0, -axis(0.8)), 0, -0.8, 1e-15);
  // y0 counts for the sign
  expect_near(inverse(0, -0.5, 0, 0.5 + axis(0.3)), 0, 0.3, 1e-15);
  EXPECT_NE(inverse(0.0003, axis(0.8)).x, 0.0003);
}

TEST(VanDerGrinten, RoundTrip) {
  std::mt19937 random(14);
  std::uniform_real_distribution<double> lon(-3.1, 3.1), lat(-1.55, 1.55);
  Points in(3000);
  for (auto& q : in) q = {lon(random), lat(random), 2};
  Points out = in;
  TWstatus status = 0;
  TWvdg_f(0.02, 0.3, 3000, out.data(), out.data(), &status);
  TWvdg_i(0.02, 0.3, 3000, out.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  for (std::size_t i = 0; i < in.size(); ++i) {
    const double d = std::remainder(in[i].x - 0.02, 2 * kPi);
    if (std::fabs(d) < 3e-3 || std::fabs(in[i].y) < 3e-3) continue;
    // the last Newton step is not applied; the forward ordinate is the root of a difference that
    // cancels towards the axes, and the condition near the poles costs the rest
    const double colat = kPi / 2 - std::fabs(in[i].y);
    const double cancelled = 2e-14 / std::fabs(d * in[i].y);
    expect_near(out[i], 0.02 + d, in[i].y, 2, 1e-11 / colat / std::fabs(d) + cancelled);
  }
}

TEST(VanDerGrinten, LatitudeBeyondThePoleIsInformation) {
  // Outside the circle no latitude fits: the estimate passes the pole, the loop ends, the next
  // point is done, the word stands.
  const Points in = {{0.5, 4.5, 0}, {1, 1, 0}};
  Points out = untouched(2);
  TWstatus status = 0;
  TWvdg_i(0, 0, 2, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_I_LATITUDE_LIMITED);
  EXPECT_NE(out[0].y, kUntouched);
  EXPECT_GT(std::fabs(out[0].y), kPi / 2);
  const CoordinateTriple alone = inverse(1, 1);
  expect_near(out[1], alone.x, alone.y, 0);
}

TEST(VanDerGrinten, EveryInputLeavesTheLoop) {
  std::mt19937 random(15);
  std::uniform_real_distribution<double> wide(-10, 10), exponent(-4, 2);
  Points in;
  for (int i = 0; i < 20000; ++i) {
    in.push_back({wide(random), wide(random), 0});
    in.push_back({std::pow(10, exponent(random)), std::pow(10, exponent(random)), 0});
  }
  for (const double v : {1e300, static_cast<double>(kInfinity), kNaN, 0.1}) {
    for (const double w : {1e300, static_cast<double>(kInfinity), kNaN, 0.1})
      in.push_back({v, w, 0});
  }
  Points out = untouched(in.size());
  TWstatus status = 0;
  TWvdg_i(0, 0, static_cast<int32_t>(in.size()), in.data(), out.data(), &status);
  for (const auto& q : out) EXPECT_NE(q.y, kUntouched);
  TWvdg_f(0, 0, static_cast<int32_t>(in.size()), in.data(), out.data(), &status);
  TWvdg_s(1, 0, static_cast<int32_t>(in.size()), in.data(), out.data(), &status);
}

TEST(VanDerGrinten, ScaleByDifferentiation) {
  const auto map = [](const CoordinateTriple& q) { return forward(q.x, q.y); };
  for (double lat = -1.44; lat < 1.46; lat += 0.31) {  // off the equator's margin
    for (double lon = -2.9; lon < 3; lon += 0.4) {
      const CoordinateTriple ours = scale(lon, lat, 0.9);
      const CoordinateTriple expected = numeric_scale(map, lon, lat, 0);
      EXPECT_NEAR(ours.x, 0.9 * expected.x, 1e-7 * expected.x) << lon << ' ' << lat;
      EXPECT_NEAR(ours.y, 0.9 * expected.y, 1e-7 * expected.y) << lon << ' ' << lat;
      EXPECT_NEAR(ours.z, 0.81 * expected.z, 1e-7 * expected.z) << lon << ' ' << lat;
    }
  }
}

TEST(VanDerGrinten, ScaleNearTheAxes) {
  // near the equator the unit partials, k divided by the cosine
  expect_near(scale(1, 0.000299), 1 / std::cos(0.000299), 1, 1 / std::cos(0.000299), 1e-15);
  // near the central meridian: dy/dlat of pi tan(asin(2 lat / pi) / 2), by hand
  const double lat = 0.8, s = 2 * lat / kPi, t = std::asin(s);
  const double slope = 1 / std::pow(std::cos(t / 2), 2) / std::cos(t);
  const double A = (kPi - std::sqrt(kPi * kPi - 4 * lat * lat)) * kPi / (2 * lat);
  const CoordinateTriple at = scale(0.0003, lat);
  EXPECT_NEAR(at.y, slope, 1e-13);
  EXPECT_NEAR(at.x, (1 - A * A / (kPi * kPi)) / std::cos(lat), 1e-14);
  EXPECT_NEAR(at.z, at.x * at.y, 1e-14);
  // the same a little off, from the general formulas
  const CoordinateTriple off = scale(0.00031, lat);
  expect_near(off, at.x, at.y, at.z, 1e-6);
}

TEST(VanDerGrinten, ScaleFillsAtThePoles) {
  const double limit = kPi / 2 - 1e-14;
  const Points in = {{1, limit, 0}, {1, -limit, 0}, {1, 0.5, 0}, {1, 3, 0}};
  Points out = untouched(4);
  TWstatus status = 0;
  TWvdg_s(3, 0, 4, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_BAD_LATITUDE);
  for (const int i : {0, 1, 3}) expect_near(out[static_cast<std::size_t>(i)], 3, 3, 9, 0);
  EXPECT_NE(out[2].x, 3);
  const Points inside = {{1, std::nextafter(limit, 0), 0}};
  TWvdg_s(3, 0, 1, inside.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
}

// The latitude of (X, Y), in units of pi, by the iteration, pass for pass.
struct StatedLatitude {
  double lat = 0;
  bool limited = false;

  StatedLatitude(double X, double Y) {
    double p = 2 * std::atan(Y), previous = p + 1;
    for (int pass = 0; pass < 200 && std::fabs(p - previous) > 1e-12; ++pass) {
      previous = p;
      limited = std::fabs(2 * p / kPi) > 1;
      if (limited) break;
      const double th = std::asin(2 * p / kPi), s = std::sin(th), c = std::cos(th);
      const double t = std::tan(th / 2), G = c / (c + s - 1), B = Y / s - 1 / (c + 1), f = 2 - s;
      const double F = (X * X + Y * Y - 2 * f * G * B - t * t) * c * kPi / 4;
      const double D = ((2 * c * c + 1) / c + (c - s) * f / (c + s - 1)) * G * B +
                       (c * Y / (1 - c) + t) * f * G / (c + 1) - (t * t - 1) * t;
      p -= F / D;
    }
    lat = previous;
  }
};

TEST(VanDerGrinten, TheRimByTheStatedIteration) {
  int within = 0, beyond = 0;
  for (const double r : {0.99996, 0.99999, 1.0, 1.0001, 1.01, 1.1, 1.3}) {
    for (double angle = 0.05; angle < 1.5; angle += 0.037) {
      const double X = r * std::cos(angle), Y = r * std::sin(angle);
      const StatedLatitude stated(X, Y), aside(X * (1 + 1e-12), Y);
      // Near its singular places rounding decides what becomes of a start.
      if (aside.limited != stated.limited || !(std::fabs(aside.lat - stated.lat) < 1e-9)) continue;
      const CoordinateTriple in = {X * kPi, -Y * kPi, 0};
      CoordinateTriple out = kUntouchedPoint;
      TWstatus status = 0;
      TWvdg_i(0, 0, 1, &in, &out, &status);
      EXPECT_EQ(status, stated.limited ? TW_I_LATITUDE_LIMITED : TW_SUCCESS) << r << " " << angle;
      EXPECT_NEAR(out.y, -stated.lat, 1e-8) << r << " " << angle;
      ++(stated.limited ? beyond : within);
    }
  }
  EXPECT_GT(within, 50);
  EXPECT_GT(beyond, 10);
}

TEST(VanDerGrinten, ClosedFormBesideTheStatedIteration) {
  const auto stated = [](double X, double Y) { return StatedLatitude(X, Y).lat; };
  for (double r = 0.01; r < 0.99; r += 0.021) {
    for (double angle = 0.01; angle < kPi / 2; angle += 0.037) {
      const double X = r * std::cos(angle), Y = r * std::sin(angle);
      // Closer to a pole the library goes through the passes too, and rounding spreads their ends.
      if (stated(X, Y) > kPi / 2 - 0.01) continue;
      const CoordinateTriple in = {-X * kPi, Y * kPi, 0};
      CoordinateTriple out = {};
      TWstatus status = 0;
      TWvdg_i(0, 0, 1, &in, &out, &status);
      EXPECT_EQ(status, TW_SUCCESS);
      EXPECT_NEAR(out.y, stated(X, Y), 1e-11) << X << " " << Y;
    }
  }
}

}  // namespace
