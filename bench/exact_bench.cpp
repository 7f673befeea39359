// The systems layer's lines and transverse Mercator beside their peers.
#include <cmath>
#include <cstddef>
#include <memory>
#include <string>
#include <tuple>
#include <type_traits>
#include <utility>
#include <vector>

#include "harness.hpp"
#include "tidewater/lines.hpp"
#include "tidewater/projection.hpp"

#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
#include <GeographicLib/Geodesic.hpp>
#include <GeographicLib/Rhumb.hpp>
#endif

namespace tidewater::bench {
namespace {

constexpr double kA = 6378137;
constexpr double kF = 1 / 298.257223563;
constexpr double kDegree = 0.017453292519943295;

// Lines in degrees: from each point to the next, or by an azimuth of its longitude's size for up to
// 10 000 km; and room for the results.
struct Lines {
  std::vector<double> lon1, lat1, lon2, lat2, length, a, b, c;

  Lines() {
    const auto from = box(-180, -90, 180, 90);
    const std::size_t n = from.size();
    for (std::size_t i = 0; i < n; ++i) {
      const auto& to = from[(i + 1) % n];
      lon1.push_back(from[i].x / kDegree);
      lat1.push_back(from[i].y / kDegree);
      lon2.push_back(to.x / kDegree);
      lat2.push_back(to.y / kDegree);
      length.push_back(1e4 * from[i].z);
    }
    a = b = c = std::vector<double>(n);
  }
  std::size_t size() const { return lon1.size(); }
  LinePairs pairs() const { return {lon1.data(), lat1.data(), lon2.data(), lat2.data()}; }
  LineStarts starts() const { return {lon1.data(), lat1.data(), lon2.data(), length.data()}; }
};

template <class Object>
void add_lines(const char* name, const Object& ours, Sides direct, Sides inverse) {
  const auto lines = std::make_shared<Lines>();
  std::vector<std::string> peers;
  if (!direct.empty()) peers = {"GeographicLib"};
  add({std::string(name) + " direct",
       side(
           [=] {
             ours.direct(lines->size(), lines->starts(),
                         {lines->a.data(), lines->b.data(), lines->c.data(), nullptr});
           },
           [=](std::size_t i) {
             return CoordinateTriple{lines->a[i] * kDegree, lines->b[i] * kDegree, 0};
           }),
       peers, std::move(direct), ground_apart});
  const auto pairs = std::make_shared<Lines>();
  add({std::string(name) + " inverse",
       side(
           [=] {
             ours.inverse(pairs->size(), pairs->pairs(),
                          {pairs->a.data(), pairs->b.data(), pairs->c.data(), nullptr});
           },
           [=](std::size_t i) {
             return CoordinateTriple{pairs->a[i], 0, 0};
           }),
       peers, std::move(inverse), plane_apart});
}

#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
template <class Peer>
std::pair<Sides, Sides> peers_of(const Peer& peer) {
  const auto lines = std::make_shared<Lines>();
  const auto pairs = std::make_shared<Lines>();
  const auto direct = [=] {
    for (std::size_t i = 0; i < lines->size(); ++i) {
      peer.Direct(lines->lat1[i], lines->lon1[i], lines->lon2[i], lines->length[i], lines->b[i],
                  lines->a[i]);
    }
  };
  const auto inverse = [=] {
    for (std::size_t i = 0; i < pairs->size(); ++i) {
      const auto& p = *pairs;
      if constexpr (std::is_same_v<Peer, GeographicLib::Geodesic>) {
        peer.Inverse(p.lat1[i], p.lon1[i], p.lat2[i], p.lon2[i], pairs->a[i], pairs->b[i],
                     pairs->c[i]);
      } else {
        peer.Inverse(p.lat1[i], p.lon1[i], p.lat2[i], p.lon2[i], pairs->a[i], pairs->b[i]);
      }
    }
  };
  return {{side(direct,
                [=](std::size_t i) {
                  return CoordinateTriple{lines->a[i] * kDegree, lines->b[i] * kDegree, 0};
                })},
          {side(inverse, [=](std::size_t i) {
            return CoordinateTriple{pairs->a[i], 0, 0};
          })}};
}
#endif

// Through the layer's own array calls, degrees to metres, beside PROJ from radians.
void add_transverse_mercator() {
  const tidewater::Projection map("transverse mercator",
                                  {{"lat0", 0}, {"lon0", 9}, {"k0", 0.9996}, {"x0", 500000}},
                                  Ellipsoid(kA, 1 / kF));
  const char* definition = "+proj=tmerc +lon_0=9 +k=0.9996 +x_0=500000 +ellps=WGS84";
  const auto points = box(4, -80, 14, 80);
  std::vector<double> xy;
  for (const auto& p : points) {
    xy.push_back(p.x / kDegree);
    xy.push_back(p.y / kDegree);
  }
  std::vector<double> plane(xy.size());
  map.forward(points.size(), interleaved(static_cast<const double*>(xy.data())),
              interleaved(plane.data()));
  std::vector<CoordinateTriple> plane_points;
  for (std::size_t i = 0; i < points.size(); ++i) {
    plane_points.push_back({plane[2 * i], plane[2 * i + 1], 0});
  }
  const auto one = [&](const char* name, bool forward, const std::vector<double>& from,
                       const std::vector<CoordinateTriple>& peer_points) {
    const auto in = std::make_shared<std::vector<double>>(from);
    const auto out = std::make_shared<std::vector<double>>(from.size());
    const double unit = forward ? 1 : kDegree;
    add({name,
         side(
             [=] {
               const auto given = interleaved(static_cast<const double*>(in->data()));
               const auto to = interleaved(out->data());
               if (forward) {
                 map.forward(in->size() / 2, given, to);
               } else {
                 map.inverse(in->size() / 2, given, to);
               }
             },
             [=](std::size_t i) {
               return CoordinateTriple{(*out)[2 * i] * unit, (*out)[2 * i + 1] * unit, 0};
             }),
         {"PROJ"},
         {proj(definition, forward, peer_points)},
         forward ? plane_apart : ground_apart});
  };
  one("Transverse Mercator of the systems forward", true, xy, points);
  one("Transverse Mercator of the systems inverse", false, plane, plane_points);
}

const Suite suite([] {
  Sides direct, inverse, rhumb_direct, rhumb_inverse;
#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
  std::tie(direct, inverse) = peers_of(GeographicLib::Geodesic(kA, kF));
  std::tie(rhumb_direct, rhumb_inverse) = peers_of(GeographicLib::Rhumb(kA, kF));
#endif
  add_lines("Exact geodesic", Geodesic(kA, kF), direct, inverse);
  add_lines("Exact rhumb line", Rhumb(kA, kF), rhumb_direct, rhumb_inverse);
  add_transverse_mercator();
});

}  // namespace
}  // namespace tidewater::bench
