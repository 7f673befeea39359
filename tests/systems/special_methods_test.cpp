// Maps of satellites, of three points and of two surveys, against what does not stand on them.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdio>
#include <string>
#include <vector>

#include "tidewater/lines.hpp"
#include "tidewater/special.h"
#include "tidewater/system.hpp"

#ifdef TIDEWATER_HAVE_PROJ
#include <proj.h>
#endif

namespace tidewater::test {

namespace {

constexpr double kDegree = 0.017453292519943295;
constexpr double kPi = 3.14159265358979324;

// Clarke 1866 and the orbit of Landsat 1 (Snyder 1987, p. 218).
constexpr double kA = 6378206.4;
constexpr double kB = 6356583.8;
constexpr double kInclination = 99.092 * kDegree;
constexpr double kRatio = 18.0 / 251;
constexpr double kFirst = 93.63;  // degrees from the node where a path begins

Projection landsat(int path) {
  return Projection("space oblique mercator landsat",
                    {{"satellite", 1}, {"path", static_cast<double>(path)}},
                    Ellipsoid(kA, kA / (kA - kB)));
}

// Where the satellite of a path stands, by the geometry of the orbit: above the geocentric
// direction (L, inclination), with the earth turned by its share.
Point track(int path, double L) {
  const double node = 128.87 * kDegree - 2 * kPi / 251 * path;
  const double geocentric = std::asin(std::sin(L) * std::sin(kInclination));
  const double right = std::atan2(std::sin(L) * std::cos(kInclination), std::cos(L));
  const double lon = std::remainder(right + node - kRatio * L, 2 * kPi);
  return {lon / kDegree, std::atan(std::tan(geocentric) * kA * kA / (kB * kB)) / kDegree};
}

TEST(SpaceOblique, WholeOrbitIsOneMapThatIsTrueAlongItsTrack) {
  const Projection map = landsat(15);
  const Geodesic lines(map.ellipsoid());
  double before = -1e300;
  double worst_scale = 0;
  double worst_angle = 0;
  double worst_back = 0;
  for (double degrees = kFirst + 1; degrees < kFirst + 359; degrees += 0.5) {
    const Point here = track(15, degrees * kDegree);
    const Point there = map.forward(here);
    ASSERT_TRUE(std::isfinite(there.x)) << degrees;
    // The map goes on without a seam, and the track swings about its axis.
    ASSERT_GT(there.x, before);
    ASSERT_LT(std::fabs(there.y), 1.1e6) << degrees;
    before = there.x;
    // Scenes that follow each other keep their distance.
    const Point one = track(15, (degrees - 0.005) * kDegree);
    const Point other = track(15, (degrees + 0.005) * kDegree);
    const double true_length = lines.inverse(one.x, one.y, other.x, other.y).length;
    const Point a = map.forward(one);
    const Point b = map.forward(other);
    worst_scale =
        std::max(worst_scale, std::fabs(std::hypot(b.x - a.x, b.y - a.y) / true_length - 1));
    if (std::fabs(here.y) < 80) worst_angle = std::max(worst_angle, map.factors(here).angular);
    // Within a scene's width either way.
    for (const double off : {-90e3, -5e3, 0.0, 40e3, 90e3}) {
      const Point aside = {there.x, there.y + off};
      const Point ground = map.inverse(aside);
      const Point again = map.forward(ground);
      // Where the ends of the orbit lie on each other, the ground is on both.
      if (std::fabs(again.x - aside.x) > 1e7) continue;
      worst_back = std::max(worst_back, std::hypot(again.x - aside.x, again.y - aside.y));
    }
  }
  EXPECT_LT(worst_scale, 2e-6);
  EXPECT_LT(worst_angle, 2e-3);
  EXPECT_LT(worst_back, 1e-7);
  std::printf(
      "along the track: scale within %.2g, angles within %.2g degrees, back within %.2g m\n",
      worst_scale, worst_angle, worst_back);
}

TEST(SpaceOblique, AgreesWithTheFunctionsOfTheInterfaceInC) {
  // Those count the earth's turn within half a revolution of the node: on the southern half of the
  // orbit their node is the next one.
  const double e2 = 1 - kB * kB / (kA * kA);
  const double e = std::sqrt(e2);
  constexpr int kTerms = 20;
  std::vector<double> C(kTerms), S(kTerms), X1(kTerms), X2(kTerms), X3(kTerms), X4(kTerms);
  double Q, T, W, G, a0, R1 = 0, R2 = 0, R3 = 0, R4 = 0, m_sin, m_cos, sum3, sum4;
  TWstatus word;
  TWsom_c(e, kInclination, kRatio, 0, 0, kTerms, 2001, &Q, &T, &W, &G, &a0, C.data(), S.data(),
          X1.data(), X2.data(), X3.data(), X4.data(), &R1, &R2, &R3, &R4, &m_sin, &m_cos, &sum3,
          &sum4, &word);
  ASSERT_EQ(word, TW_SUCCESS);
  const Projection map = landsat(15);
  const double node = 128.87 * kDegree - 2 * kPi / 251 * 15;
  for (double degrees = 100; degrees < 255; degrees += 3.7) {
    if (degrees > 165 && degrees < 215) continue;  // where they go from one to the other
    const bool south = degrees > 180;
    Point here = track(15, degrees * kDegree);
    here.x += 0.7;
    here.y -= 0.3;
    const CoordinateTriple in = {here.x * kDegree, here.y * kDegree, 0};
    CoordinateTriple out = {0, 0, 0};
    TWsom_f(0, south ? 1 : -1, kTerms, south ? node - 2 * kPi * kRatio : node, e, kInclination,
            kRatio, 0, 0, Q, T, W, G, a0, C.data(), S.data(), X1.data(), X2.data(), X3.data(),
            X4.data(), R1, R2, R3, R4, m_sin, m_cos, sum3, sum4, 1, &in, &out, 1, &word);
    ASSERT_TRUE(TW_OK(word));
    const Point there = map.forward(here);
    EXPECT_NEAR(there.x, out.x * kA, 1e-3) << degrees;
    EXPECT_NEAR(there.y, out.y * kA, 1e-3) << degrees;
  }
}

TEST(SpaceOblique, GeneralOrbitBeginsAtItsNode) {
  const double node = 128.87 - 360.0 / 251 * 15;
  const Projection general("space oblique mercator",
                           {{"inclination", 99.092}, {"days", kRatio}, {"lon0", node}},
                           Ellipsoid(kA, kA / (kA - kB)));
  const Projection path = landsat(15);
  // On the descending half they are the same map; before that the path counts a whole orbit more.
  const Point descending = {-70, 20};
  EXPECT_NEAR(general.forward(descending).x, path.forward(descending).x, 1e-6);
  const Point ascending = track(15, 30 * kDegree);
  EXPECT_GT(path.forward(ascending).x, 40e6);
  EXPECT_GT(general.forward(ascending).x, 0);
  EXPECT_LT(general.forward(ascending).x, 5e6);
}

TEST(SpaceOblique, RefusesWhatIsNoOrbit) {
  const Ellipsoid wgs84("WGS 84");
  EXPECT_THROW(Projection("som", {{"inclination", 0}, {"days", 0.07}}, wgs84), Error);
  EXPECT_THROW(Projection("som", {{"inclination", 98}, {"days", 1.5}}, wgs84), Error);
  EXPECT_THROW(Projection("som", {{"inclination", 98}}, wgs84), Error);
  EXPECT_THROW(Projection("landsat", {{"satellite", 6}, {"path", 1}}, wgs84), Error);
  EXPECT_THROW(Projection("landsat", {{"satellite", 4}, {"path", 234}}, wgs84), Error);
  EXPECT_THROW(Projection("landsat", {{"satellite", 1}, {"path", 1.5}}, wgs84), Error);
  // A plane point beyond the orbit's ends.
  EXPECT_TRUE(std::isnan(landsat(15).inverse({0, 0}).x));
  EXPECT_TRUE(std::isnan(landsat(15).inverse({60e6, 0}).x));
  EXPECT_EQ(System("+proj=lsat +lsat=5 +path=28 +ellps=GRS80").method(),
            "Space Oblique Mercator (Landsat)");
}

// --- Chamberlin ------------------------------------------------------------------------------

constexpr const char* kNorthAmerica =
    "chamberlin lat1=55 lon1=-150 lat2=55 lon2=-35 lat3=-10 lon3=-92.5 ellps=GRS80";

TEST(Chamberlin, ControlPointsKeepTheirDistances) {
  const Projection map = System(kNorthAmerica).projection().value();
  const Geodesic lines(map.ellipsoid());
  const Point control[] = {{-150, 55}, {-35, 55}, {-92.5, -10}};
  for (int j = 0; j < 3; ++j) {
    const Point a = control[j];
    const Point b = control[(j + 1) % 3];
    const Point there = map.forward(a);
    const Point other = map.forward(b);
    EXPECT_NEAR(std::hypot(other.x - there.x, other.y - there.y),
                lines.inverse(a.x, a.y, b.x, b.y).length, 1e-6);
    const Point back = map.inverse(there);
    EXPECT_NEAR(back.x, a.x, 1e-7);
    EXPECT_NEAR(back.y, a.y, 1e-7);
  }
}

TEST(Chamberlin, ComesBackOverTheContinentAndBeyond) {
  const Projection map = System(kNorthAmerica).projection().value();
  double worst = 0;
  for (double lon = -170; lon <= -20; lon += 3.1) {
    for (double lat = -25; lat <= 89; lat += 2.9) {
      const Point there = map.forward({lon, lat});
      ASSERT_TRUE(std::isfinite(there.x));
      const Point back = map.inverse(there);
      const double off =
          6378137 * kDegree *
          std::hypot(back.y - lat, std::remainder(back.x - lon, 360) * std::cos(lat * kDegree));
      worst = std::isfinite(off) ? std::max(worst, off) : HUGE_VAL;
    }
  }
  std::printf("back within %.2g m\n", worst);
  EXPECT_LT(worst, 0.05);
}

TEST(Chamberlin, TurnsNothingOver) {
  // The same triangle the other way round: the map stands on its head and is not mirrored.
  const System system(
      "chamberlin lat1=55 lon1=-35 lat2=55 lon2=-150 lat3=-10 lon3=-92.5 ellps=GRS80");
  const auto map = system.projection().value();
  const Point here = map.forward({-95, 40});
  const Point east = map.forward({-94, 40});
  const Point north = map.forward({-95, 41});
  EXPECT_GT((east.x - here.x) * (north.y - here.y) - (east.y - here.y) * (north.x - here.x), 0);
  EXPECT_THROW(System("chamberlin lat1=0 lon1=0 lat2=0 lon2=10 lat3=0 lon3=20 ellps=GRS80"), Error);
}

// --- surveys ---------------------------------------------------------------------------------

// The polynomials of Malaya stand for the rectified skew orthomorphic grid of the same survey.
TEST(Malaya, PolynomialsStandForTheRegistrysGrid) {
  const Projection map("malaya grid", {}, Ellipsoid(6377304.063, 300.8017));
  const Projection peer = System("3168").projection().value();
  double worst = 0;
  for (double lon = 100.5; lon <= 104; lon += 0.5) {
    for (double lat = 1.5; lat <= 6.5; lat += 0.5) {
      const Point one = map.forward({lon, lat});
      const Point other = peer.forward({lon, lat});
      worst = std::max(worst, std::hypot(one.x - other.x, one.y - other.y));
    }
  }
  std::printf("Malaya beside EPSG:3168: within %.3g m\n", worst);
  EXPECT_LT(worst, 2);
  EXPECT_THROW(Projection("malaya grid", {}, Ellipsoid("GRS80")), Error);
}

// Scale one at the origin; meridians as they lie between its parallels.
TEST(IndianPolyhedric, IsTrueAtItsOrigin) {
  const System system("indian polyhedric lat0=24 lon0=80 x0=1000 y0=2000 ellps=evrst30");
  const Projection map = system.projection().value();
  const Point origin = map.forward({80, 24});
  EXPECT_NEAR(origin.x, 1000, 1e-9);
  EXPECT_NEAR(origin.y, 2000, 1e-9);
  const Factors at = map.factors({80, 24});
  EXPECT_NEAR(at.meridional, 1, 1e-9);
  EXPECT_NEAR(at.parallel, 1, 1e-9);
  double worst = 0;
  for (double lon = 77; lon <= 83; lon += 0.5) {
    for (double lat = 21; lat <= 27; lat += 0.5) {
      const Point back = map.inverse(map.forward({lon, lat}));
      worst = std::max({worst, std::fabs(back.x - lon), std::fabs(back.y - lat)});
    }
  }
  EXPECT_LT(worst, 1e-12);
  const System again(system.to_wkt());
  EXPECT_EQ(again.projection()->forward({79, 25}).x, map.forward({79, 25}).x);
}

#ifdef TIDEWATER_HAVE_PROJ

// The greatest distance from the peer's figures on a lattice of positions.
double apart(const std::string& definition, double west, double south, double east, double north) {
  const Projection ours = System(definition + " +type=crs").projection().value();
  PJ_CONTEXT* context = proj_context_create();
  PJ* peer = proj_create(context, definition.c_str());
  EXPECT_NE(peer, nullptr);
  double worst = 0;
  for (int i = 0; i <= 40; ++i) {
    for (int j = 0; j <= 40; ++j) {
      const double lon = west + (east - west) * i / 40;
      const double lat = south + (north - south) * j / 40;
      const PJ_COORD at = proj_trans(peer, PJ_FWD, proj_coord(lon * kDegree, lat * kDegree, 0, 0));
      const Point to = ours.forward({lon, lat});
      worst = std::max(worst, std::hypot(to.x - at.xy.x, to.y - at.xy.y));
    }
  }
  proj_destroy(peer);
  proj_context_destroy(context);
  std::printf("%s: within %.3g m\n", definition.c_str(), worst);
  return worst;
}

TEST(Chamberlin, AgreesWithThePeerOnTheSphere) {
  EXPECT_LT(apart("+proj=chamb +lat_1=55 +lon_1=-150 +lat_2=55 +lon_2=-35 +lat_3=-10 +lon_3=-92.5 "
                  "+R=6371000",
                  -170, -25, -20, 89),
            1e-3);
  EXPECT_LT(apart("+proj=chamb +lat_1=55 +lon_1=0 +lat_2=55 +lon_2=60 +lat_3=20 +lon_3=40 "
                  "+R=6371000",
                  -10, 0, 80, 75),
            1e-3);
}

// The peer's series are those of a track without the ellipsoid's turn: they keep some hundred
// metres apart, over the whole orbit.
TEST(SpaceOblique, StaysBesideThePeerOverTheWholeOrbit) {
  const std::string definition = "+proj=lsat +lsat=1 +path=15 +ellps=clrk66";
  const Projection ours = System(definition + " +type=crs").projection().value();
  PJ_CONTEXT* context = proj_context_create();
  PJ* peer = proj_create(context, definition.c_str());
  double worst = 0;
  for (double degrees = kFirst + 2; degrees < kFirst + 358; degrees += 1.3) {
    const Point here = track(15, degrees * kDegree);
    const PJ_COORD at =
        proj_trans(peer, PJ_FWD, proj_coord(here.x * kDegree, here.y * kDegree, 0, 0));
    const Point to = ours.forward(here);
    // Where the ends of the orbit lie on each other, the peer may take the other one.
    const bool end = degrees < kFirst + 30 || degrees > kFirst + 330;
    if (end && std::fabs(to.x - at.xy.x) > 1e7) continue;
    worst = std::max(worst, std::hypot(to.x - at.xy.x, to.y - at.xy.y));
  }
  proj_destroy(peer);
  proj_context_destroy(context);
  std::printf("Landsat beside the peer: within %.3g m\n", worst);
  EXPECT_LT(worst, 1500);
}

#endif

}  // namespace
}  // namespace tidewater::test
