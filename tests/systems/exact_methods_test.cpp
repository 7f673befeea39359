// Methods of the systems layer that stand on formulas of its own, against the peer.
#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <string>

#include "tidewater/system.hpp"

#ifdef TIDEWATER_HAVE_PROJ
#include <proj.h>
#endif

namespace tidewater {
namespace {

// Figures at 40 digits of the maps of the unit sphere, 100 degrees east of the central meridian:
// scripts/series/world_maps.py.
struct WorldFigure {
  const char* method;
  double lat, x, y;
};
constexpr WorldFigure kWorldFigures[] = {
    {"mollweide", 1e-07, 1.571348402636772275, 1.93857338878857756e-9},
    {"mollweide", 17.0, 1.528580691010658359, 0.3276999657708196005},
    {"mollweide", 45.0, 1.26636113903505478, 0.8372734721038815471},
    {"mollweide", 80.0, 0.5121557566856742735, 1.336986966848935582},
    {"mollweide", 89.5, 0.07033040676303631142, 1.412796320580741796},
    {"mollweide", 89.99, 0.005183033000974992098, 1.414205869135331283},
    {"mollweide", 89.9999, 0.0002405753424039578864, 1.4142135457985257},
    {"mollweide", 89.999999, 0.000011166518236524377, 1.414213562337386222},
    {"mollweide", 89.99999999, 5.183036475165723064e-7, 1.414213562373018117},
    {"eckert 4", 1e-07, 1.47388936464111369, 2.066759060038958477e-9},
    {"eckert 4", 17.0, 1.448041437794168197, 0.3482377579523164874},
    {"eckert 4", 45.0, 1.29274070199095017, 0.8710554102890729581},
    {"eckert 4", 80.0, 0.8964260330278685372, 1.295066117999332883},
    {"eckert 4", 89.5, 0.7455045307859639081, 1.326410942315818701},
    {"eckert 4", 89.99, 0.7371165309370698036, 1.326500392110858829},
    {"eckert 4", 89.9999, 0.7369464009389730217, 1.326500428173395153},
    {"eckert 4", 89.999999, 0.7369446995067541898, 1.326500428177001961},
    {"eckert 4", 89.99999999, 0.736944682492418713, 1.326500428177002322},
    {"van der grinten", 1e-07, 1.745329251994329577, 1.745329252293597203e-9},
    {"van der grinten", 17.0, 1.732480662739612394, 0.3080860154700040145},
    {"van der grinten", 45.0, 1.633190739799774154, 0.9040309323590097912},
    {"van der grinten", 80.0, 1.09010699765029421, 2.102250442208304052},
    {"van der grinten", 89.5, 0.3090730957805158527, 2.926729464230816907},
    {"van der grinten", 89.99, 0.04627173479819441204, 3.112324251123649208},
    {"van der grinten", 89.9999, 0.004665939344431120751, 3.138684591535991037},
    {"van der grinten", 89.999999, 0.0004669826160277242888, 3.141302038479579355},
    {"van der grinten", 89.99999999, 0.00004670213483332952904, 3.141563594002143638},
};

TEST(WorldMaps, AreRightUpToThePoles) {
  for (const WorldFigure& figure : kWorldFigures) {
    SCOPED_TRACE(std::string(figure.method) + " at " + std::to_string(figure.lat));
    const Projection map(figure.method, {}, Ellipsoid(1, 0));
    for (const double sign : {1.0, -1.0}) {
      // Next to the pole a double of degrees keeps few of the colatitude's digits.
      const double within = figure.lat > 89.9 ? 3e-11 : 1e-14;
      const Point there = map.forward({100, sign * figure.lat});
      EXPECT_NEAR(there.x, figure.x, within);
      EXPECT_NEAR(there.y, sign * figure.y, within);
      const Point back = map.inverse(there);
      // and the ordinate fewer still of the equal-area maps.
      EXPECT_NEAR(back.y, sign * figure.lat, figure.lat > 89.9 ? 1e-6 : 1e-12);
      const double off = std::remainder(back.x - 100, 360);
      EXPECT_NEAR(off * std::cos(figure.lat * 0.017453292519943295), 0, 1e-8);
    }
  }
}

// Robinson's table itself, at its nineteen parallels (Robinson 1974; Snyder and Voxland 1989):
// lengths of the parallels, and their distances from the equator in units of the farthest.
TEST(WorldMaps, RobinsonsTableStandsAtItsParallels) {
  constexpr double kLength[] = {1,      0.9986, 0.9954, 0.9900, 0.9822, 0.9730, 0.9600,
                                0.9427, 0.9216, 0.8962, 0.8679, 0.8350, 0.7986, 0.7597,
                                0.7186, 0.6732, 0.6213, 0.5722, 0.5322};
  constexpr double kDistance[] = {0,      0.0620, 0.1240, 0.1860, 0.2480, 0.3100, 0.3720,
                                  0.4340, 0.4958, 0.5571, 0.6176, 0.6769, 0.7346, 0.7903,
                                  0.8435, 0.8936, 0.9394, 0.9761, 1};
  const Projection map("robinson", {}, Ellipsoid(1, 0));
  const double farthest = map.forward({0, 90}).y;
  EXPECT_NEAR(farthest, 1.3523, 5e-5);
  for (int k = 0; k < 19; ++k) {
    const Point there = map.forward({100, 5.0 * k});
    EXPECT_NEAR(there.x, 0.8487 * kLength[k] * 100 * 0.017453292519943295, 1e-13);
    EXPECT_NEAR(there.y / farthest, kDistance[k], 1e-13);
    const Point back = map.inverse(there);
    EXPECT_NEAR(back.x, 100, 1e-10);
    EXPECT_NEAR(back.y, 5.0 * k, 1e-10);
  }
}

#ifdef TIDEWATER_HAVE_PROJ

struct Worst {
  double forward = 0, back = 0;
  int points = 0, peer_only = 0;
};

constexpr double kDegree = 0.017453292519943295;

// Forward against the peer, and back to where the point was, in metres.
Worst beside_proj(const std::string& definition, double west, double south, double east,
                  double north) {
  const Projection ours = System(definition + " +type=crs").projection().value();
  PJ_CONTEXT* context = proj_context_create();
  PJ* peer = proj_create(context, definition.c_str());
  EXPECT_NE(peer, nullptr) << definition;
  Worst worst;
  constexpr int kSteps = 41;
  for (int i = 0; i < kSteps; ++i) {
    for (int j = 0; j < kSteps; ++j) {
      const double lon = west + (east - west) * i / (kSteps - 1);
      const double lat = south + (north - south) * j / (kSteps - 1);
      const PJ_COORD at = proj_trans(peer, PJ_FWD, proj_coord(lon * kDegree, lat * kDegree, 0, 0));
      const Point to = ours.forward({lon, lat, 0});
      if (!std::isfinite(at.xy.x)) continue;
      if (!std::isfinite(to.x)) {
        ++worst.peer_only;
        continue;
      }
      ++worst.points;
      worst.forward = std::max(worst.forward, std::hypot(to.x - at.xy.x, to.y - at.xy.y));
      const Point back = ours.inverse(to);
      const double off =
          6378137 * kDegree *
          std::hypot(back.y - lat, std::remainder(back.x - lon, 360) * std::cos(lat * kDegree));
      worst.back = std::isfinite(off) ? std::max(worst.back, off) : HUGE_VAL;
    }
  }
  proj_destroy(peer);
  proj_context_destroy(context);
  std::printf("%s: %d points, forward within %.3g m, back within %.3g m, refused %d\n",
              definition.c_str(), worst.points, worst.forward, worst.back, worst.peer_only);
  return worst;
}

struct Case {
  const char* definition;
  double west, south, east, north;
  double forward, back;  // metres
};

class ExactMethods : public testing::TestWithParam<Case> {};

TEST_P(ExactMethods, AgreeWithThePeerAndComeBack) {
  const Case& c = GetParam();
  const Worst worst = beside_proj(c.definition, c.west, c.south, c.east, c.north);
  EXPECT_LT(worst.forward, c.forward);
  EXPECT_LT(worst.back, c.back);
  EXPECT_EQ(worst.peer_only, 0);
  EXPECT_GT(worst.points, 1000);
}

INSTANTIATE_TEST_SUITE_P(
    Systems, ExactMethods,
    testing::Values(
        Case{"+proj=tmerc +lon_0=9 +k=0.9996 +x_0=5e5 +ellps=GRS80", -20, -89, 38, 89, 2e-8, 2e-8},
        Case{"+proj=aeqd +lat_0=40 +lon_0=-100 +ellps=GRS80", -180, -89, 75, 89, 1e-7, 3e-8},
        Case{"+proj=aeqd +lat_0=-31 +lon_0=20 +ellps=GRS80", -150, -90, 180, 25, 1e-7, 3e-8},
        // From here on the peer's shorter series of the meridian's arc differs by some micrometres.
        Case{"+proj=aeqd +lat_0=90 +lon_0=20 +ellps=GRS80", -180, -80, 179, 90, 1e-5, 3e-8},
        Case{"+proj=aeqd +lat_0=-90 +lon_0=20 +ellps=GRS80", -180, -90, 179, 80, 1e-5, 3e-8},
        Case{"+proj=cass +lat_0=31.734 +lon_0=35.2 +ellps=clrk80", 30, 25, 40, 40, 1e-4, 3e-8},
        Case{"+proj=poly +lat_0=30 +lon_0=-96 +ellps=clrk66", -130, -70, -60, 80, 1e-4, 3e-8},
        Case{"+proj=eqdc +lat_1=29.5 +lat_2=45.5 +lat_0=23 +lon_0=-96 +ellps=GRS80", -170, -80, -10,
             85, 1e-4, 3e-8},
        Case{"+proj=eqdc +lat_1=-20 +lat_2=-50 +lat_0=-30 +lon_0=140 +ellps=GRS80", 60, -85, 179,
             70, 1e-4, 3e-8},
        Case{"+proj=omerc +lat_0=46.952 +lonc=7.44 +alpha=90 +gamma=90 +k=1 +ellps=bessel", 5, 44,
             11, 49, 1e-6, 1e-6},
        Case{"+proj=omerc +lat_0=-36 +lonc=147 +alpha=30.5 +gamma=30.5 +k=0.9998 +ellps=GRS80", 140,
             -42, 152, -30, 1e-6, 1e-6},
        Case{"+proj=omerc +lat_0=4 +lonc=115 +alpha=53.31580995 +gamma=53.13010236111111 "
             "+k=0.99984 +no_uoff +ellps=evrstSS",
             109, 0, 120, 8, 1e-6, 1e-6},
        Case{"+proj=stere +lat_0=-90 +lat_ts=-71 +lon_0=0 +ellps=WGS84", -180, -90, 179, -20, 1e-6,
             1e-6},
        // All but the neighbourhood of the antipode; where the point lies far across the map, its
        // position is fine and its coordinates are large.
        Case{"+proj=stere +lat_0=40 +lon_0=-100 +k=0.9999 +ellps=GRS80", -280, -90, 79, 90, 1e-2,
             1e-6},
        Case{"+proj=stere +lat_0=-25 +lon_0=20 +ellps=bessel", -150, -90, 190, 90, 1e-2, 1e-6},
        Case{"+proj=stere +lat_0=0 +lon_0=20 +R=6371000", -150, -90, 190, 90, 1e-2, 1e-6},
        Case{"+proj=eck4 +lon_0=11 +R=6371000", -168, -89, 190, 89, 1e-6, 6e-8},
        // The peer's iteration stops short there, too.
        Case{"+proj=eck4 +lon_0=11 +R=6371000", -168, 89.98, 190, 90, 1e3, 3e-4},
        Case{"+proj=eck4 +lon_0=11 +R=6371000", -168, -90, 190, -89.999, 1e3, 2e-3},
        Case{"+proj=moll +lon_0=11 +R=6371000", -168, -89, 190, 89, 1e-6, 3e-8},
        // Another interpolation of Robinson's table.
        Case{"+proj=robin +lon_0=11 +R=6371000", -168, -90, 190, 90, 4e3, 1e-7},
        // At the poles the peer's iteration stops a hundred metres short; the ordinate keeps few of
        // the latitude's digits there.
        Case{"+proj=moll +lon_0=11 +R=6371000", -168, 89.5, 190, 90, 150, 3e-5},
        Case{"+proj=moll +lon_0=11 +R=6371000", -168, -90, 190, -89.999, 150, 1e-3},
        Case{"+proj=robin +lon_0=11 +R=6371000", -168, 84, 190, 90, 2e4, 1e-7},
        Case{"+proj=vandg +lon_0=11 +R=6371000", -168, 88, 190, 90, 1e-6, 3e-8},
        // The peer's formula cancels close to the equator.
        Case{"+proj=vandg +lon_0=11 +R=6371000", -168, -1e-3, 190, 1e-3, 1, 3e-8},
        Case{"+proj=poly +lat_0=0 +lon_0=0 +ellps=GRS80", -90, -89.9, 90, 89.9, 1e-4, 1e-6},
        Case{"+proj=cass +lat_0=0 +lon_0=0 +ellps=GRS80", -30, -89.9, 30, 89.9, 1e-4, 1e-6},
        Case{"+proj=vandg +lon_0=11 +R=6371000", -168, -90, 190, 90, 1e-4, 3e-8}));

#endif

}  // namespace
}  // namespace tidewater
