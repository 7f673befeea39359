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
