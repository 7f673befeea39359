#include <gtest/gtest.h>

#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/datum.h"
#include "tidewater/lines.h"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

using Corners = std::array<CoordinateTriple, 3>;

// North America as it is often mapped: 55 N 150 W, 55 N 35 W, 10 N 92.5 W.
const Corners kAmerica = {{{degrees(-150), degrees(55), 0},
                           {degrees(-35), degrees(55), 0},
                           {degrees(-92.5), degrees(10), 0}}};
// A clockwise and an anticlockwise small triangle.
const Corners kSmall = {{{0.1, 0.2, 0}, {0.3, 0.25, 0}, {0.2, 0.5, 0}}};

struct Trimetric {
  double e;
  Corners control;
  std::array<double, 3> sides = {kUntouched, kUntouched, kUntouched};
  std::array<double, 3> azimuths = {kUntouched, kUntouched, kUntouched};
  Corners plane = {kUntouchedPoint, kUntouchedPoint, kUntouchedPoint};
  double lon_c = kUntouched, lat_c = kUntouched, rotation = kUntouched;
  int calls = 0;
  TWstatus word = TW_SUCCESS;

  static void call(TWcontext context, int32_t count, const CoordinateTriple* in,
                   CoordinateTriple* out, TWstatus* status) {
    auto& self = *reinterpret_cast<Trimetric*>(context);  // NOLINT(performance-no-int-to-ptr)
    ++self.calls;
    TWchamtri_f(self.e, self.control.data(), self.sides.data(), self.azimuths.data(),
                self.plane.data(), count, in, out, status);
    if (self.word != TW_SUCCESS) *status = self.word;
  }

  TWstatus set_up(int mode) {
    TWstatus status = 0;
    TWchamtri_c(mode == 1 ? nullptr : &call, reinterpret_cast<TWcontext>(this),
                static_cast<int16_t>(mode), e, control.data(), sides.data(), azimuths.data(),
                plane.data(), &lon_c, &lat_c, &rotation, &status);
    return status;
  }

  Points forward(Points p) const {
    TWstatus status = 0;
    TWchamtri_f(e, control.data(), sides.data(), azimuths.data(), plane.data(),
                static_cast<int32_t>(p.size()), p.data(), p.data(), &status);
    EXPECT_EQ(status, TW_SUCCESS);
    return p;
  }
};

double between(const CoordinateTriple& p, const CoordinateTriple& q) {
  return std::hypot(p.x - q.x, p.y - q.y);
}

TEST(Chamberlin, SidesAndAzimuthsAreThoseOfTheGeodesics) {
  Trimetric t = {0.08, kAmerica};
  EXPECT_EQ(t.set_up(0), TW_SUCCESS);
  for (std::size_t j = 0; j < 3; ++j) {
    double azimuth = 0, back = 0, distance = 0;
    TWstatus status = 0;
    TWgeodesic_inv(kAmerica[j], kAmerica[(j + 1) % 3], 6000000, 0.08, &azimuth, &back, &distance,
                   &status);
    EXPECT_EQ(t.sides[j], distance / 6000000);
    EXPECT_EQ(t.azimuths[j], azimuth);
    EXPECT_NEAR(between(t.plane[j], t.plane[(j + 1) % 3]), t.sides[j], 1e-14);
    EXPECT_EQ(t.plane[j].z, kUntouched);
  }
}

TEST(Chamberlin, CornersAndHeights) {
  for (const double e : {0.0, 0.08}) {
    Trimetric t = {e, kAmerica};
    EXPECT_EQ(t.set_up(0), TW_SUCCESS);
    Points p(kAmerica.begin(), kAmerica.end());
    for (std::size_t j = 0; j < 3; ++j) p[j].z = 10 + static_cast<double>(j);
    const auto out = t.forward(p);
    for (std::size_t j = 0; j < 3; ++j) {
      expect_near(out[j], t.plane[j].x, t.plane[j].y, p[j].z, 0);  // exactly
    }
  }
}

TEST(Chamberlin, CentroidIsTheOriginAndNorthIsUp) {
  for (const auto& control : {kAmerica, kSmall, Corners{kSmall[0], kSmall[2], kSmall[1]}}) {
    Trimetric t = {0.08, control};
    EXPECT_EQ(t.set_up(0), TW_SUCCESS);
    EXPECT_GT(t.calls, 3);
    EXPECT_NEAR(t.plane[0].x + t.plane[1].x + t.plane[2].x, 0, 1e-14);
    EXPECT_NEAR(t.plane[0].y + t.plane[1].y + t.plane[2].y, 0, 1e-14);
    EXPECT_EQ(t.rotation, kPi / 2);
    const auto out = t.forward(
        {{t.lon_c, t.lat_c, 0}, {t.lon_c, t.lat_c - 1e-4, 0}, {t.lon_c, t.lat_c + 1e-4, 0}});
    expect_near(out[0], 0, 0, 1e-12);
    EXPECT_NEAR(std::atan2(out[2].y - out[1].y, out[2].x - out[1].x), kPi / 2, 1e-9);
    // East lies to the right: the map is not a mirror image.
    const auto east = t.forward({{t.lon_c + 1e-4, t.lat_c, 0}});
    EXPECT_GT(east[0].x, 0);
  }
}

TEST(Chamberlin, OriginAndRotationOfTheCaller) {
  for (const double rotation : {kPi / 2, 0.3, -2.0}) {
    Trimetric t = {0.08, kAmerica};
    t.lon_c = degrees(-95);
    t.lat_c = degrees(40);
    t.rotation = rotation;
    EXPECT_EQ(t.set_up(1), TW_SUCCESS);
    EXPECT_EQ(t.calls, 0);
    EXPECT_EQ(t.rotation, rotation);
    const auto out = t.forward({{t.lon_c, t.lat_c, 0},
                                {t.lon_c, t.lat_c - 1e-4, 0},
                                {t.lon_c, t.lat_c + 1e-4, 0},
                                {t.lon_c + 1e-4, t.lat_c, 0}});
    expect_near(out[0], 0, 0, 1e-14);
    EXPECT_NEAR(std::atan2(out[2].y - out[1].y, out[2].x - out[1].x), rotation, 1e-9);
    // East is to the right of north.
    EXPECT_NEAR(std::remainder(std::atan2(out[3].y, out[3].x) - (rotation - kPi / 2), 2 * kPi), 0,
                0.05);
    for (std::size_t j = 0; j < 3; ++j) {
      EXPECT_NEAR(between(t.plane[j], t.plane[(j + 1) % 3]), t.sides[j], 1e-14);
    }
  }
}

TEST(Chamberlin, ASmallTriangleIsNearlyTrue) {
  // Within a triangle of 0.1 degree distances hold to the curvature: (0.002)^2 / 10.
  const Corners control = {{{0.1, 0.8, 0}, {0.102, 0.8, 0}, {0.101, 0.8015, 0}}};
  Trimetric t = {0.0818, control};
  EXPECT_EQ(t.set_up(0), TW_SUCCESS);
  const Points in = {{0.1009, 0.8005, 0}, {0.1012, 0.8008, 0}};
  const auto out = t.forward(in);
  double azimuth = 0, back = 0, distance = 0;
  TWstatus status = 0;
  TWgeodesic_inv(in[0], in[1], 6000000, 0.0818, &azimuth, &back, &distance, &status);
  EXPECT_NEAR(between(out[0], out[1]) / (distance / 6000000), 1, 1e-6);
  // and so does the bearing, with north up
  EXPECT_NEAR(std::atan2(out[1].x - out[0].x, out[1].y - out[0].y), azimuth, 1e-4);
}

TEST(Chamberlin, OnTheLineThroughTwoCorners) {
  // On the side 0-1 and on its continuation the cosine is 1 or -1 but for rounding: the estimate
  // from corner 0 lies on the plane's line.
  const Corners control = {{{0, 0, 0}, {0.4, 0, 0}, {0.2, 0.3, 0}}};
  Trimetric t = {0, control};
  t.lon_c = 0.2;
  t.lat_c = 0.1;
  t.rotation = kPi / 2;
  ASSERT_EQ(t.set_up(1), TW_SUCCESS);
  for (const double lon : {0.1, 0.3, -0.2, 0.7}) {
    const auto out = t.forward({{lon, 0, 0}});
    EXPECT_FALSE(std::isnan(out[0].x));
    // Symmetrical about the middle of the base.
    const auto mirror = t.forward({{0.4 - lon, 0, 0}});
    EXPECT_NEAR(out[0].y, mirror[0].y, 1e-8);
    EXPECT_NEAR(out[0].x, -mirror[0].x, 1e-8);
  }
}

TEST(Chamberlin, Failures) {
  for (const int mode : {2, -1}) {
    Trimetric t = {0.08, kAmerica};
    EXPECT_EQ(t.set_up(mode), TW_BAD_INPUT);
    EXPECT_NE(t.sides[2], kUntouched);  // the sides are solved before
    EXPECT_NE(t.azimuths[2], kUntouched);
    expect_untouched(t.plane[0]);
    EXPECT_EQ(t.lon_c, kUntouched);
  }
  Trimetric t = {0.08, kAmerica};
  t.word = TW_RANGE_ERROR;
  EXPECT_EQ(t.set_up(0), TW_NOT_CONVERGED);  // as TWgeneric_i() puts it
  EXPECT_NE(t.plane[1].x, kUntouched);
  EXPECT_EQ(t.lon_c, kUntouched);
  EXPECT_EQ(t.lat_c, kUntouched);
  EXPECT_EQ(t.rotation, kUntouched);
  // A failing geodesic of the last corner shows in TWchamtri_f(): a latitude beyond the pole.
  Trimetric good = {0.08, kAmerica};
  ASSERT_EQ(good.set_up(0), TW_SUCCESS);
  CoordinateTriple p = {0.3, 2, 5};
  TWstatus status = 0;
  TWchamtri_f(good.e, good.control.data(), good.sides.data(), good.azimuths.data(),
              good.plane.data(), 1, &p, &p, &status);
  EXPECT_EQ(status, TW_BAD_LATITUDE);
  // In mode 1 a bad origin ends the call with that word, before the shift.
  Trimetric bad = {0.08, kAmerica};
  bad.lon_c = 0.3;
  bad.lat_c = 2;
  bad.rotation = 0;
  EXPECT_EQ(bad.set_up(1), TW_BAD_LATITUDE);
  EXPECT_EQ(bad.plane[0].x, 0);
  EXPECT_EQ(bad.plane[1].y, 0);
}

TEST(Chamberlin, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const ProjPeer peer(
      "+proj=chamb +lat_1=55 +lon_1=-150 +lat_2=55 +lon_2=-35 +lat_3=10 +lon_3=-92.5 "
      "+lon_0=-92.5 +R=1");
  ASSERT_TRUE(peer.ok());
  Trimetric t = {0, kAmerica};
  ASSERT_EQ(t.set_up(0), TW_SUCCESS);
  // The planes differ in origin and turn: distances are compared.
  const auto corner = peer.forward(kAmerica[0]);
  for (double lon = -140; lon < -40; lon += 13) {
    for (double lat = 15; lat < 55; lat += 13) {
      const CoordinateTriple in = {degrees(lon), degrees(lat), 0};
      EXPECT_NEAR(between(t.forward({in})[0], t.plane[0]), between(peer.forward(in), corner), 1e-9);
    }
  }
#endif
}

}  // namespace
