#include <cmath>

#include "harness.hpp"
#include "tidewater/lines.h"

#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
#include <GeographicLib/Geodesic.hpp>
#include <GeographicLib/Rhumb.hpp>
#endif

using namespace tidewater::bench;

namespace {

constexpr double kE = 0.0818191908426215;  // WGS 84
constexpr double kA = 6378137;
constexpr double kDegree = 3.14159265358979323846 / 180;

// One line for each point: from the point along an azimuth of its longitude's size, for a length of
// up to 10 000 km, or to the next point.
double azimuth_of(const CoordinateTriple& p) { return p.x; }
double length_of(const CoordinateTriple& p) { return 1e4 * p.z; }

template <class Direct>
std::shared_ptr<Side> direct_side(const std::vector<CoordinateTriple>& points, Direct direct) {
  return ours(points, [direct](int32_t n, const CoordinateTriple* in, CoordinateTriple* out) {
    for (int32_t i = 0; i < n; ++i) {
      TWstatus word = 0;
      direct(in[i], azimuth_of(in[i]), length_of(in[i]), kA, kE, out + i, &out[i].z, &word);
    }
  });
}

// Azimuth, azimuth back and distance of the line to the next point.
template <class Inverse>
std::shared_ptr<Side> inverse_side(const std::vector<CoordinateTriple>& points, Inverse inverse) {
  return ours(points, [inverse](int32_t n, const CoordinateTriple* in, CoordinateTriple* out) {
    for (int32_t i = 0; i < n; ++i) {
      TWstatus word = 0;
      inverse(in[i], in[(i + 1) % n], kA, kE, &out[i].x, &out[i].y, &out[i].z, &word);
    }
  });
}

double length_apart(const CoordinateTriple& ours, const CoordinateTriple& peers) {
  return std::fabs(ours.z - peers.z);
}

#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
template <class Peer>
std::shared_ptr<Side> peer_direct(const std::vector<CoordinateTriple>& points) {
  const auto out = std::make_shared<std::vector<CoordinateTriple>>(points);
  return side(
      [points, out, peer = Peer(kA, 1 / 298.257223563)] {
        for (std::size_t i = 0; i < points.size(); ++i) {
          const CoordinateTriple& p = points[i];
          double lat = 0, lon = 0;
          peer.Direct(p.y / kDegree, p.x / kDegree, azimuth_of(p) / kDegree, length_of(p), lat,
                      lon);
          (*out)[i] = {lon * kDegree, lat * kDegree, 0};
        }
      },
      [out](std::size_t i) { return (*out)[i]; });
}

template <class Peer>
std::shared_ptr<Side> peer_inverse(const std::vector<CoordinateTriple>& points) {
  const auto out = std::make_shared<std::vector<CoordinateTriple>>(points);
  return side(
      [points, out, peer = Peer(kA, 1 / 298.257223563)] {
        for (std::size_t i = 0; i < points.size(); ++i) {
          const CoordinateTriple &p = points[i], &q = points[(i + 1) % points.size()];
          double azimuth = 0, back = 0;
          if constexpr (std::is_same_v<Peer, GeographicLib::Geodesic>) {
            peer.Inverse(p.y / kDegree, p.x / kDegree, q.y / kDegree, q.x / kDegree, (*out)[i].z,
                         azimuth, back);
          } else {
            peer.Inverse(p.y / kDegree, p.x / kDegree, q.y / kDegree, q.x / kDegree, (*out)[i].z,
                         azimuth);
          }
          (*out)[i].x = azimuth * kDegree;
        }
      },
      [out](std::size_t i) { return (*out)[i]; });
}
using GeodesicPeer = GeographicLib::Geodesic;
using RhumbPeer = GeographicLib::Rhumb;
#else
struct GeodesicPeer {};
using RhumbPeer = GeodesicPeer;
template <class Peer>
std::shared_ptr<Side> peer_direct(const std::vector<CoordinateTriple>&) {
  return nullptr;
}
template <class Peer>
std::shared_ptr<Side> peer_inverse(const std::vector<CoordinateTriple>&) {
  return nullptr;
}
#endif

const Suite suite([] {
  const auto lines = box(-85, -70, 85, 70);
  add({"Geodesic direct, one call a line",
       direct_side(lines, TWgeodesic_dir),
       {"GeographicLib"},
       {peer_direct<GeodesicPeer>(lines)},
       ground_apart});
  add({"Geodesic inverse, one call a line",
       inverse_side(lines, TWgeodesic_inv),
       {"GeographicLib"},
       {peer_inverse<GeodesicPeer>(lines)},
       length_apart});
  // Short lines: rhumb lines of up to 1000 km keep off the poles.
  auto short_lines = lines;
  for (auto& p : short_lines) p.z /= 10;
  add({"Rhumb direct, one call a line",
       direct_side(short_lines, TWrhmbline_dir),
       {"GeographicLib"},
       {peer_direct<RhumbPeer>(short_lines)},
       ground_apart});
  add({"Rhumb inverse, one call a line",
       inverse_side(lines, TWrhmbline_inv),
       {"GeographicLib"},
       {peer_inverse<RhumbPeer>(lines)},
       length_apart});
});

}  // namespace
