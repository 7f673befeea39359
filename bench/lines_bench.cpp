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
Kernel direct_kernel(const std::vector<CoordinateTriple>& points, Direct direct) {
  return [points, direct] {
    double sum = 0;
    for (const CoordinateTriple& p : points) {
      CoordinateTriple end = {};
      double back = 0;
      TWstatus word = 0;
      direct(p, azimuth_of(p), length_of(p), kA, kE, &end, &back, &word);
      sum += end.x + end.y;
    }
    keep(sum);
  };
}

template <class Inverse>
Kernel inverse_kernel(const std::vector<CoordinateTriple>& points, Inverse inverse) {
  return [points, inverse] {
    double sum = 0;
    for (std::size_t i = 0; i + 1 < points.size(); ++i) {
      double azimuth = 0;
      double back = 0;
      double distance = 0;
      TWstatus word = 0;
      inverse(points[i], points[i + 1], kA, kE, &azimuth, &back, &distance, &word);
      sum += distance;
    }
    keep(sum);
  };
}

#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
constexpr const char* kPeer = "GeographicLib";

template <class Peer>
Kernel peer_direct(const std::vector<CoordinateTriple>& points) {
  return [points, peer = Peer(kA, 1 / 298.257223563)] {
    double sum = 0;
    for (const CoordinateTriple& p : points) {
      double lat = 0;
      double lon = 0;
      peer.Direct(p.y / kDegree, p.x / kDegree, azimuth_of(p) / kDegree, length_of(p), lat, lon);
      sum += lat + lon;
    }
    keep(sum);
  };
}

template <class Peer>
Kernel peer_inverse(const std::vector<CoordinateTriple>& points) {
  return [points, peer = Peer(kA, 1 / 298.257223563)] {
    double sum = 0;
    for (std::size_t i = 0; i + 1 < points.size(); ++i) {
      double distance = 0;
      double azimuth = 0;
      if constexpr (std::is_same_v<Peer, GeographicLib::Geodesic>) {
        double back = 0;
        peer.Inverse(points[i].y / kDegree, points[i].x / kDegree, points[i + 1].y / kDegree,
                     points[i + 1].x / kDegree, distance, azimuth, back);
      } else {
        peer.Inverse(points[i].y / kDegree, points[i].x / kDegree, points[i + 1].y / kDegree,
                     points[i + 1].x / kDegree, distance, azimuth);
      }
      sum += distance;
    }
    keep(sum);
  };
}

template <class Peer>
struct Kernels {
  Kernel direct(const std::vector<CoordinateTriple>& points) { return peer_direct<Peer>(points); }
  Kernel inverse(const std::vector<CoordinateTriple>& points) { return peer_inverse<Peer>(points); }
};
using GeodesicPeer = Kernels<GeographicLib::Geodesic>;
using RhumbPeer = Kernels<GeographicLib::Rhumb>;
#else
constexpr const char* kPeer = "";

struct NoPeer {
  Kernel direct(const std::vector<CoordinateTriple>&) { return {}; }
  Kernel inverse(const std::vector<CoordinateTriple>&) { return {}; }
};
using GeodesicPeer = NoPeer;
using RhumbPeer = NoPeer;
#endif

const Suite suite([] {
  const auto points = box(-85, -70, 85, 70);
  const auto integral = floor_kernel(points, [](const CoordinateTriple& p) {
    return std::atan2(p.x, p.y) + std::atan2(p.y, p.x) + std::sqrt(p.z) + std::sqrt(p.z + 1) +
           std::sqrt(p.z + 2) + std::sqrt(p.z + 3);
  });
  add({"Geodesic direct", kPeer, direct_kernel(points, TWgeodesic_dir),
       GeodesicPeer().direct(points), integral});
  add({"Geodesic inverse", kPeer, inverse_kernel(points, TWgeodesic_inv),
       GeodesicPeer().inverse(points), integral});
  add({"Geodesic from its vertex",
       "",
       [points] {
         double sum = 0;
         for (const CoordinateTriple& p : points) {
           double arc = 0;
           double lon = 0;
           TWstatus word = 0;
           geodesic_int(0.7 * std::fabs(p.y), 0.95, 1, kA, kE * kE, kE * kE / (1 - kE * kE), &arc,
                        &lon, &word);
           sum += arc + lon;
         }
         keep(sum);
       },
       {},
       integral});
  // Short lines: rhumb lines of up to 1000 km keep off the poles.
  auto short_lines = points;
  for (auto& p : short_lines) p.z /= 10;
  add({"Rhumb direct",
       kPeer,
       direct_kernel(short_lines, TWrhmbline_dir),
       RhumbPeer().direct(short_lines),
       {}});
  add({"Rhumb inverse",
       kPeer,
       inverse_kernel(points, TWrhmbline_inv),
       RhumbPeer().inverse(points),
       {}});
});

}  // namespace
