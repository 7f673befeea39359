// Conformal methods.
#include <optional>
#include "formulas/isometric_latitude.hpp"
#include "formulas/krovak.hpp"
#include "formulas/oblique_mercator.hpp"

#include "map_formula.hpp"
#include "tidewater/conformal.h"
#include "tidewater/special.h"

namespace tidewater::detail {

namespace {

// Mercator, transverse Mercator and the rest take these arguments last.
#define TW_BLOCK int count, const CoordinateTriple *in, CoordinateTriple *out, TWstatus *status

// By series: within 5 nm to 3,900 km from the central meridian, a refusal beyond.
struct TransverseMercatorMap {
  TransverseMercatorForward to_plane;
  TransverseMercatorInverse to_ellipsoid;

  TransverseMercatorMap(const MethodArguments& given, double scale)
      : to_plane{TransverseMercator(given.a, given.f, scale), 0}, to_ellipsoid{to_plane.map, 0} {
    require(given.f <= TransverseMercator::kLargestFlattening, given,
            "the series do not reach a flattening above 1/150");
    to_plane.y0 = to_plane.map.forward(0.0, given(kLat0)).y;
    to_ellipsoid.y0 = to_plane.y0;
  }
  void forward(TW_BLOCK) const { *status = over_points(to_plane, count, in, out); }
  void inverse(TW_BLOCK) const { *status = over_points(to_ellipsoid, count, in, out); }
};

// The block functions of a value that has forward() and inverse().
template <class T>
Made block_formula(const Plane& plane, const T& map) {
  return formula(
      plane, [map](TW_BLOCK) { map.forward(count, in, out, status); },
      [map](TW_BLOCK) { map.inverse(count, in, out, status); });
}

Made lambert(const MethodArguments& given, const Plane& plane, double lat0, double lat1,
             double lat2) {
  const double e = given.e;
  double C, n, rho0;
  TWstatus made;
  TWlam_c(e, 0, lat0, lat1, lat2, &C, &n, &rho0, &made);
  require(made, given);
  return formula(
      plane, [=](TW_BLOCK) { TWlam_f(e, 0, C, n, rho0, count, in, out, status); },
      [=](TW_BLOCK) { TWlam_i(e, 0, C, n, rho0, count, out, in, status); });
}

Made mercator(const MethodArguments& given, const Plane& plane, double e, double lat0) {
  double y0;
  TWstatus made;
  TWmerc_c(e, lat0, &y0, &made);
  require(made, given);
  return formula(
      plane, [=](TW_BLOCK) { TWmerc_f(e, 0, y0, count, in, out, status); },
      [=](TW_BLOCK) { TWmerc_i(e, 0, y0, count, in, out, status); });
}

// Radius of the parallel of a latitude, in units of a.
double parallel_radius(double e2, double lat) {
  const double s = std::sin(lat);
  return std::cos(lat) / std::sqrt(1 - e2 * s * s);
}

Made polar_stereographic(const MethodArguments& given, const Plane& plane, double pole) {
  const double e = given.e;
  double C, m0 = 0, chi0 = 0;
  TWstatus made;
  TWstereo_c(e, pole, &C, &m0, &chi0, &made);
  require(made, given);
  return formula(
      plane, [=](TW_BLOCK) { TWstereo_f(e, 0, pole, C, m0, chi0, count, in, out, status); },
      [=](TW_BLOCK) { TWstereo_i(e, 0, pole, C, m0, chi0, count, in, out, status); });
}

// Scale at the pole that makes a parallel true (Snyder 1987, eq. 15-9, 21-33, 21-34).
double polar_scale(double e, double lat) {
  const double s = std::sin(std::fabs(lat));
  const double t =
      std::tan(kPi / 4 - std::fabs(lat) / 2) * std::pow((1 + e * s) / (1 - e * s), e / 2);
  const double whole = std::sqrt(std::pow(1 + e, 1 + e) * std::pow(1 - e, 1 - e));
  if (t < 1e-12) return 1;
  return parallel_radius(e * e, lat) * whole / (2 * t);
}

Made krovak(const MethodArguments& given, bool modified, double sign) {
  // Southing and westing are the second and first axis of the registry's grid.
  const Krovak map(given.a, given.e, given(kLatC), given(kColatitude), given(kPseudoParallel),
                   given(kPseudoScale, 1), modified);
  const Plane plane = {given(kLonOrigin), sign, sign, sign * given(kX0), sign * given(kY0)};
  require(std::isfinite(map.r0) && std::isfinite(map.t0), given, "its constants are not finite");
  return pointwise(
      plane,
      [map](double lon, double lat) {
        const auto grid = map.forward(lon, lat);
        return PointAnswer{grid.westing, grid.southing, std::isfinite(grid.westing)};
      },
      [map](double x, double y) {
        const auto at = map.inverse({y, x});
        return PointAnswer{at.lon, at.lat, std::isfinite(at.lat)};
      });
}

}  // namespace

Next TransverseMercatorForward::other(const CoordinateTriple&, CoordinateTriple*,
                                      TWstatus* status) const {
  *status = TW_RANGE_ERROR;  // too far from the central meridian
  return Next::point;
}

Next TransverseMercatorInverse::other(const CoordinateTriple&, CoordinateTriple*,
                                      TWstatus* status) const {
  *status = TW_RANGE_ERROR;
  return Next::point;
}

Made make_transverse_mercator(const MethodArguments& given) {
  return block_formula(Plane{given(kLon0), 1, 1, given(kX0), given(kY0)},
                       TransverseMercatorMap(given, given(kK0, 1)));
}

Made make_transverse_mercator_south(const MethodArguments& given) {
  return block_formula(Plane{given(kLon0), -1, -1, given(kX0), given(kY0)},
                       TransverseMercatorMap(given, given(kK0, 1)));
}

// Each zone's million is put before its easting.  A point that fails ends the loops: the word is
// the last call's, and the block is asked again point by point.
Made make_zoned_transverse_mercator(const MethodArguments& given) {
  const TransverseMercatorMap map(given, given(kK0, 1));
  const double first = given(kInitialLon);
  const double width = given(kZoneWidth);
  require(width > 0, given, "the zone width must be above zero");
  const double x0 = given(kX0);
  const double y0 = given(kY0);
  const auto centre = [=](double zone) { return first + (zone - 0.5) * width; };
  return formula(
      Plane{},
      [=](TW_BLOCK) {
        for (int i = 0; i < count && *status == TW_SUCCESS; ++i) {
          double from = in[i].x - first;
          if (from < 0) from += 2 * kPi;
          const double zone = 1 + std::floor(from / width);
          CoordinateTriple point = {std::remainder(in[i].x - centre(zone), 2 * kPi), in[i].y, 0};
          map.forward(1, &point, &point, status);
          out[i].x = zone * 1e6 + x0 + point.x;
          out[i].y = y0 + point.y;
        }
      },
      [=](TW_BLOCK) {
        const double zones = std::floor(2 * kPi / width + 0.5);
        for (int i = 0; i < count && *status == TW_SUCCESS; ++i) {
          const double zone = std::floor(in[i].x / 1e6);
          if (!(zone >= 1 && zone <= zones)) {
            *status = TW_BAD_ZONE;
            return;
          }
          CoordinateTriple point = {in[i].x - zone * 1e6 - x0, in[i].y - y0, 0};
          map.inverse(1, &point, &point, status);
          out[i].x = point.x + centre(zone);
          out[i].y = point.y;
        }
      });
}

Made make_lambert_1sp(const MethodArguments& given) {
  const double lat0 = given(kLat0);
  return lambert(given, natural_plane(given, given(kK0, 1)), lat0, lat0, lat0);
}

Made make_lambert_1sp_variant_b(const MethodArguments& given) {
  const double lat1 = given(kLat0);
  return lambert(given, false_origin_plane(given, given(kK0, 1)), given(kLatF), lat1, lat1);
}

Made make_lambert_west(const MethodArguments& given) {
  const double lat0 = given(kLat0);
  Plane plane = natural_plane(given, given(kK0, 1));
  plane.sx = -plane.sx;
  return lambert(given, plane, lat0, lat0, lat0);
}

Made make_lambert_2sp(const MethodArguments& given) {
  return lambert(given, false_origin_plane(given, given(kEllipsoidScaling, 1)), given(kLatF),
                 given(kLat1), given(kLat2));
}

Made make_lambert_michigan(const MethodArguments& given) { return make_lambert_2sp(given); }

// The cone is turned by 29.2985 seconds.
Made make_lambert_belgium(const MethodArguments& given) {
  double C, n, rho0;
  TWstatus made;
  TWlam_c(given.e, 0, given(kLatF), given(kLat1), given(kLat2), &C, &n, &rho0, &made);
  require(made, given);
  Plane plane = false_origin_plane(given, 1);
  plane.lon0 += 29.2985 / 3600 * (kPi / 180) / n;
  return lambert(given, plane, given(kLatF), given(kLat1), given(kLat2));
}

Made make_mercator_a(const MethodArguments& given) {
  // The natural origin lies on the equator, whatever latitude is named for it.
  return mercator(given, natural_plane(given, given(kK0, 1)), given.e, 0);
}

Made make_mercator_b(const MethodArguments& given) {
  require_parallel(given, given(kLat1));
  return mercator(given, natural_plane(given, parallel_radius(given.e2, given(kLat1))), given.e, 0);
}

Made make_mercator_c(const MethodArguments& given) {
  require_parallel(given, given(kLat1));
  Plane plane = natural_plane(given, parallel_radius(given.e2, given(kLat1)));
  plane.x0 = given(kXF);
  plane.y0 = given(kYF);
  return mercator(given, plane, given.e, given(kLatF));
}

Made make_pseudo_mercator(const MethodArguments& given) {
  return mercator(given, natural_plane(given, 1), 0, 0);
}

namespace {

// The skew coordinates turned to the grid; from the line's crossing or from the centre.
Made hotine(const MethodArguments& given, double x0, double y0, double azimuth, double turn,
            bool from_centre) {
  const double lat = given(kLatC);
  require(std::fabs(lat) < kHalfPi - 1e-10, given, "its centre lies at a pole");
  const ObliqueMercator map(given.e, lat, azimuth);
  const double scale = given.a * given(kLineScale, 1);
  const double c = std::cos(turn);
  const double s = std::sin(turn);
  const double u0 = from_centre ? map.centre_u : 0;
  return pointwise(
      Plane{given(kLonC), scale, scale, x0, y0},
      [=](double lon, double lat_of_point) {
        double u, v;
        const bool plain = map.forward(lon, lat_of_point, &u, &v);
        u -= u0;
        return PointAnswer{v * c + u * s, u * c - v * s, plain};
      },
      [=](double x, double y) {
        PointAnswer answer{};
        map.inverse(y * c + x * s + u0, x * c - y * s, &answer.x, &answer.y);
        answer.plain = std::isfinite(answer.x) && std::isfinite(answer.y);
        return answer;
      });
}

}  // namespace

Made make_oblique_mercator_a(const MethodArguments& given) {
  const double azimuth = given(kAzimuth);
  return hotine(given, given(kX0), given(kY0), azimuth, given(kRectifiedAngle, azimuth), false);
}

Made make_oblique_mercator_b(const MethodArguments& given) {
  const double azimuth = given(kAzimuth);
  return hotine(given, given(kXC), given(kYC), azimuth, given(kRectifiedAngle, azimuth), true);
}

Made make_swiss_oblique(const MethodArguments& given) {
  return hotine(given, given(kXC), given(kYC), kHalfPi, kHalfPi, true);
}

Made make_two_point_oblique(const MethodArguments& given) {
  const double e = given.e;
  const double lon1 = given(kLongitudeOfFirstPoint);
  double lat0 = given(kLatC);
  double alpha = 0;
  double B, A, E, crossing, gamma0;
  TWstatus made;
  TWo_merc_c(2, e, 0, given(kLatitudeOfFirstPoint),
             std::remainder(given(kLongitudeOfSecondPoint) - lon1, 2 * kPi),
             given(kLatitudeOfSecondPoint), &lat0, &alpha, &B, &A, &E, &crossing, &gamma0, &made);
  require(made, given);
  const double scale = given.a * given(kLineScale, 1);
  return formula(
      Plane{lon1, scale, scale, given(kX0), given(kY0)},
      [=](TW_BLOCK) { TWo_merc_f(e, alpha, gamma0, crossing, E, B, A, count, in, out, status); },
      [=](TW_BLOCK) { TWo_merc_i(e, alpha, gamma0, crossing, E, B, A, count, in, out, status); });
}

Made make_laborde(const MethodArguments& given) {
  const double e = given.e;
  double chi0, c, t, R, A0, A2, A4, A6, A8, M0, B2, B4, B6, A, B, C, D;
  TWstatus made;
  TWlaborde_c(e, 0, given(kLatC), given(kAzimuth), &chi0, &c, &t, &R, &A0, &A2, &A4, &A6, &A8, &M0,
              &B2, &B4, &B6, &A, &B, &C, &D, &made);
  require(made, given);
  const double scale = given.a * R * given(kLineScale, 1);
  return formula(
      Plane{given(kLonC), scale, scale, given(kX0), given(kY0)},
      [=](TW_BLOCK) {
        TWlaborde_f(e, 0, c, t, A0, A2, A4, A6, A8, M0, A, B, count, in, out, status);
      },
      [=](TW_BLOCK) {
        TWlaborde_i(e, 0, chi0, c, t, A0, M0, B2, B4, B6, 1, A, B, C, D, count, in, out, status);
      });
}

Made make_krovak(const MethodArguments& given) { return krovak(given, false, 1); }
Made make_krovak_north(const MethodArguments& given) { return krovak(given, false, -1); }
Made make_krovak_modified(const MethodArguments& given) { return krovak(given, true, 1); }
Made make_krovak_modified_north(const MethodArguments& given) { return krovak(given, true, -1); }

Made make_oblique_stereographic(const MethodArguments& given) {
  const double e = given.e;
  const double lat0 = given(kLat0);
  double chi, c, t, C, m0 = 0, chi0 = 0, sphere_lat, R;
  TWstatus made;
  TWstereo3_c(e, lat0, &chi, &c, &t, &C, &m0, &chi0, &made);
  require(made, given);
  double c_again, t_again;
  TWgaussII_c(e, lat0, &sphere_lat, &c_again, &t_again, &R, &made);
  return formula(
      natural_plane(given, R * given(kK0, 1)),
      [=](TW_BLOCK) { TWstereo3_f(e, 0, chi, c, t, C, m0, chi0, count, in, out, status); },
      [=](TW_BLOCK) { TWstereo3_i(e, 0, chi, c, t, C, m0, chi0, count, in, out, status); });
}

Made make_polar_stereographic_a(const MethodArguments& given) {
  return polar_stereographic(given, natural_plane(given, given(kK0, 1)),
                             std::copysign(kHalfPi, given(kLat0)));
}

Made make_polar_stereographic_b(const MethodArguments& given) {
  const double lat = given(kLatTrue);
  const double scale = given.a * polar_scale(given.e, lat);
  return polar_stereographic(given, {given(kLonOrigin), scale, scale, given(kX0), given(kY0)},
                             std::copysign(kHalfPi, lat));
}

// The false origin lies on the true parallel.
Made make_polar_stereographic_c(const MethodArguments& given) {
  const double lat = given(kLatTrue);
  const double scale = given.a * polar_scale(given.e, lat);
  const double rho = given.a * parallel_radius(given.e2, lat);
  return polar_stereographic(
      given, {given(kLonOrigin), scale, scale, given(kXF), given(kYF) + std::copysign(rho, lat)},
      std::copysign(kHalfPi, lat));
}

Made make_stereographic(const MethodArguments& given) {
  const Plane plane = natural_plane(given, given(kK0, 1));
  const double lat0 = given(kLat0);
  if (kHalfPi - std::fabs(lat0) < 1e-10) {
    return polar_stereographic(given, plane, std::copysign(kHalfPi, lat0));
  }
  return map_formula(plane, StereographicAboutPoint(given.e, lat0));
}

Made make_new_zealand(const MethodArguments& given) {
  const double e = given.e;
  double y0;
  TWstatus made;
  TWn_zeal_c(e, given(kLat0), &y0, &made);
  require(made, given);
  return formula(
      natural_plane(given, 1), [=](TW_BLOCK) { TWn_zeal_f(e, 0, 0, y0, count, in, out, status); },
      [=](TW_BLOCK) { TWn_zeal_i(e, 0, 0, y0, count, in, out, status); });
}

Made make_rectified_skew(const MethodArguments& given) {
  const double e = given.e;
  const double skew = given(kAzimuth);
  double A, B, C, crossing;
  TWstatus made;
  TWrso_c(e, 0, given(kLatC), skew, &A, &B, &C, &crossing, &made);
  require(made, given);
  const double scale = given.a * given(kLineScale, 1);
  return formula(
      Plane{given(kLonC), scale, scale, given(kX0), given(kY0)},
      [=](TW_BLOCK) { TWrso_f(crossing, skew, A, B, C, e, count, in, out, status); },
      [=](TW_BLOCK) { TWrso_i(crossing, skew, A, B, C, e, count, in, out, status); });
}

Made make_oblique_lambert(const MethodArguments& given) {
  const double e = given.e;
  const double lat0 = given(kLatC);
  const double d1 = given(kLat1);
  const double d2 = given(kLat2);
  double pole_lon, pole_lat, lat_r, s_lon, s_lat, offset, C, n, rho0, c, t, R;
  TWstatus made;
  TWo_lam_c(e, 0, lat0, d1, d2, given(kAzimuth), 1, &pole_lon, &pole_lat, &lat_r, &s_lon, &s_lat,
            &offset, &C, &n, &rho0, &c, &t, &made);
  require(made, given);
  TWgaussian_R(1, e, lat0 + (d1 + d2) / 2, &R, &made);
  require(made, given);
  const double scale = given.a * R * given(kLineScale, 1);
  return formula(
      Plane{given(kLonC), scale, scale, given(kX0), given(kY0)},
      [=](TW_BLOCK) {
        TWo_lam_f(e, 0, lat_r, C, n, rho0, s_lon, s_lat, 0, offset, c, t, count, in, out, status);
      },
      [=](TW_BLOCK) {
        CoordinateTriple point;
        for (int i = 0; i < count; ++i) {
          point = in[i];  // the call may change its input
          TWo_lam_i(e, 0, lat_r, C, n, rho0, s_lon, s_lat, 0, offset, c, t, 1, &point, &point,
                    status);
          out[i].x = point.x;
          out[i].y = point.y;
          if (*status != TW_SUCCESS) return;
        }
      });
}

// The one case in use: the map of the Americas.
Made make_bipolar_conic(const MethodArguments& given) {
  double lon_a, lat_a, lat_b, ab, z1, z2, fe, fn, lon_c, lat_c;
  double lon_b, n, k, f, az_ab, az_ba, t, rho_c, z_c, az_c;
  TWstatus made;
  TWbipocc_param(&lon_a, &lat_a, &lat_b, &ab, &z1, &z2, &fe, &fn, &lon_c, &lat_c, &made);
  TWbipocc_c(lon_a, lat_a, lat_b, ab, z1, z2, &lon_b, &n, &k, &f, &az_ab, &az_ba, &t, &rho_c, &z_c,
             &az_c, &made);
  require(made, given);
  // The map of the Americas carries its central scale; the library's functions leave it to the
  // caller.
  const double size = k * given.a;
  return formula(
      Plane{0, size, size, given(kX0), given(kY0)},
      [=](TW_BLOCK) {
        TWbipocc_f(lon_a, lat_a, lon_b, lat_b, az_ab, az_ba, az_c, n, 0, 0, t, rho_c, ab, f, count,
                   out, in, status);
      },
      [=](TW_BLOCK) {
        TWbipocc_i(lon_a, lat_a, lon_b, lat_b, az_ab, az_ba, az_c, n, t, rho_c, ab, f, lon_c, count,
                   in, out, status);
      });
}

}  // namespace tidewater::detail
