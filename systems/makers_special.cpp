// Maps of satellites, of three points and of two surveys.
#include <array>
#include <vector>

#include "formulas/chamberlin.hpp"
#include "formulas/space_oblique_mercator.hpp"
#include "makers.hpp"
#include "tidewater/special.h"

namespace tidewater::detail {

namespace {

// Along the first orbit from its ascending node, or from the first row of a path.
Made space_oblique(const MethodArguments& given, double inclination, double ratio, double node,
                   double start) {
  require(ratio > 0 && ratio < 1, given, "the satellite's revolution must take less than a day");
  require(std::sin(inclination) > 1e-6, given,
          "the inclination of the orbit must lie between 0 and 180 degrees");
  // The coefficients fall below rounding long before the last.
  constexpr int kTerms = 24;
  constexpr int kGrid = 1441;
  TrackSeries track;
  for (auto* list : {&track.C, &track.S, &track.X1, &track.X2, &track.X3, &track.X4}) {
    list->resize(kTerms);
  }
  double G, a0, r1, r2, r3, r4;
  TWstatus made;
  TWsom_c(given.e, inclination, ratio, 0, 0, kTerms, kGrid, &track.Q, &track.T, &track.W, &G, &a0,
          track.C.data(), track.S.data(), track.X1.data(), track.X2.data(), track.X3.data(),
          track.X4.data(), &r1, &r2, &r3, &r4, &track.m_sin, &track.m_cos, &track.sum3, &track.sum4,
          &made);
  require(made, given);
  require(std::isfinite(track.m_sin) && std::isfinite(track.sum3), given,
          "its constants are not finite");
  const SpaceObliqueMercator map(given.e2, inclination, ratio, start, std::move(track));
  return pointwise(
      Plane{node, given.a, given.a, given(kX0), given(kY0)},
      [map](double lon, double lat) {
        PointAnswer answer{};
        answer.plain = map.forward(lon, lat, &answer.x, &answer.y);
        return answer;
      },
      [map](double x, double y) {
        PointAnswer answer{};
        answer.plain = map.inverse(x, y, &answer.x, &answer.y);
        return answer;
      });
}

}  // namespace

Made make_space_oblique(const MethodArguments& given) {
  return space_oblique(given, given(kInclination), given(kPeriodRatio), given(kAscendingNode), 0);
}

// Snyder 1987, pp. 214-219, and the rows of both reference systems: a path begins two and a half
// scenes past its northernmost point.
Made make_landsat(const MethodArguments& given) {
  const double satellite = given(kSatellite);
  const bool first_system = satellite <= 3;
  const bool known = satellite == 1 || satellite == 2 || satellite == 3 || satellite == 4 ||
                     satellite == 5 || satellite == 7;
  require(known, given, "the satellites are Landsat 1 to 5 and 7");
  const double paths = first_system ? 251 : 233;
  const double path = given(kPath);
  require(path >= 1 && path <= paths && path == std::floor(path), given,
          first_system ? "its paths are 1 to 251" : "its paths are 1 to 233");
  constexpr double kDegree = kPi / 180;
  const double node = (first_system ? 128.87 : 129.3056) * kDegree - 2 * kPi / paths * path;
  return space_oblique(given, (first_system ? 99.092 : 98.2) * kDegree,
                       (first_system ? 18.0 : 16.0) / paths, std::remainder(node, 2 * kPi),
                       kPi * (1 / 248.0 + 0.5161290322580645));
}

Made make_chamberlin(const MethodArguments& given) {
  require(given.f <= Geodesics::kLargestFlattening, given,
          "geodesics are served up to a flattening of 0.01");
  // Longitudes from the first point, where the plane's are counted from.
  const double lon0 = given(kLongitudeOfFirstPoint);
  const Chamberlin map(given.f, {Chamberlin::Position{0, given(kLatitudeOfFirstPoint)},
                                 {std::remainder(given(kLongitudeOfSecondPoint) - lon0, 2 * kPi),
                                  given(kLatitudeOfSecondPoint)},
                                 {std::remainder(given(kLongitudeOfThirdPoint) - lon0, 2 * kPi),
                                  given(kLatitudeOfThirdPoint)}});
  require(map.good(), given, "its three points make no triangle");
  return pointwise(
      Plane{lon0, given.a, given.a, given(kX0), given(kY0)},
      [map](double lon, double lat) {
        Chamberlin::Spot spot{};
        const bool plain = map.forward(lon, lat, &spot);
        return PointAnswer{spot.x, spot.y, plain};
      },
      [map](double x, double y) {
        Chamberlin::Position at{};
        const bool plain = map.inverse(x, y, &at);
        return PointAnswer{at.lon, at.lat, plain};
      });
}

// The inverse by Newton's method on the latitude.
Made make_indian_polyhedric(const MethodArguments& given) {
  const double lat0 = given(kLat0);
  std::array<double, 6> c{};
  TWstatus made;
  TWind_phed_c(given.e, lat0, &c[0], &c[1], &c[2], &c[3], &c[4], &c[5], &made);
  require(made, given);
  return formula(
      natural_plane(given, 1),
      [=](int count, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
        TWind_phed_f(0, lat0, c[0], c[1], c[2], c[3], c[4], c[5], count, in, out, status);
      },
      [=](int count, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
        for (int i = 0; i < count; ++i) {
          const double x = in[i].x;
          const double y = in[i].y;
          double p = y / c[1];
          bool rest = false;
          for (int pass = 0; pass < 50 && !rest; ++pass) {
            const double width = c[0] - p * c[2];
            const double d = x / width;
            const double off = ((p * c[5] + c[4] * c[3]) * p + c[1]) * p + d * d * c[3] - y;
            const double slope =
                (3 * p * c[5] + 2 * c[4] * c[3]) * p + c[1] + 2 * d * d * c[2] * c[3] / width;
            p -= off / slope;
            rest = std::fabs(off) < 1e-15;
          }
          if (!rest) {
            *status = TW_NOT_CONVERGED;
            continue;
          }
          out[i].x = x / (c[0] - p * c[2]);
          out[i].y = p + lat0;
        }
      });
}

// Polynomials of the survey's own ellipsoid, origin and scale; the inverse by Newton's method from
// the survey's own.
Made make_malaya(const MethodArguments& given) {
  constexpr double kAxis = 6377304.063;
  const bool own = std::fabs(given.a - kAxis) < 1 && std::fabs(1 / given.f - 300.8017) < 1e-3;
  require(own, given, "it belongs to the ellipsoid Everest 1830 Modified");
  struct Table {
    double rows[84];
  };
  auto table = std::make_shared<Table>();
  double lon0, lat0, x0, y0, k0, skew;
  TWstatus made;
  TWmalaya_param(&lon0, &lat0, &x0, &y0, &k0, &skew, &made);
  TWmalaya_c(table->rows, &made);
  require(made, given);
  const std::shared_ptr<const Table> shared = table;
  const double scale = kAxis * k0;
  const auto forward = [=](int count, const CoordinateTriple* in, CoordinateTriple* out,
                           TWstatus* status) {
    TWmalaya_f(shared->rows, 0, lat0, count, in, out, status);
  };
  return formula(
      Plane{lon0, scale, scale, x0 + given(kX0), y0 + given(kY0)}, forward,
      [=](int count, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
        for (int i = 0; i < count; ++i) {
          const CoordinateTriple wanted = in[i];
          CoordinateTriple at = {wanted.x * scale + x0, wanted.y * scale + y0, 0};
          TWmalaya_i(shared->rows, 0, lat0, 1, &at, &at, status);
          for (int pass = 0; pass < 30; ++pass) {
            constexpr double kStep = 1e-4;
            CoordinateTriple here[3] = {at, at, at};
            here[1].x += kStep;
            here[2].y += kStep;
            CoordinateTriple there[3];
            forward(3, here, there, status);
            const double xe = (there[1].x - there[0].x) / kStep;
            const double ye = (there[1].y - there[0].y) / kStep;
            const double xn = (there[2].x - there[0].x) / kStep;
            const double yn = (there[2].y - there[0].y) / kStep;
            const double dx = wanted.x - there[0].x;
            const double dy = wanted.y - there[0].y;
            const double whole = xe * yn - xn * ye;
            at.x += (dx * yn - dy * xn) / whole;
            at.y += (dy * xe - dx * ye) / whole;
            if (std::hypot(dx, dy) < 1e-15) break;
          }
          out[i].x = at.x;
          out[i].y = at.y;
        }
      });
}

}  // namespace tidewater::detail
