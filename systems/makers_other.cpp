// Equal-area, equidistant, perspective and other methods.
#include <algorithm>
#include <array>

#include "formulas/colombia_urban.hpp"
#include "formulas/equal_earth.hpp"
#include "formulas/latitudes.hpp"
#include "map_formula.hpp"
#include "tidewater/conformal.h"
#include "tidewater/special.h"

namespace tidewater::detail {

namespace {

#define TW_BLOCK int count, const CoordinateTriple *in, CoordinateTriple *out, TWstatus *status

// The authalic latitude, whose series serve the ellipsoids of the Earth and others up to e = 0.2.
struct Authalic {
  double radius;  // of the authalic sphere
  LatitudeSeries to_authalic, to_geodetic;

  explicit Authalic(const MethodArguments& given)
      : radius(std::sqrt(authalic_radius_squared(given.a, given.f))),
        to_authalic(
            latitude_series(Latitude::geodetic, Latitude::authalic, third_flattening(given.f))),
        to_geodetic(
            latitude_series(Latitude::authalic, Latitude::geodetic, third_flattening(given.f))) {}
};

double transverse_radius(const MethodArguments& given, double lat) {
  const double s = std::sin(lat);
  return given.a / std::sqrt(1 - given.e2 * s * s);
}

double meridional_radius(const MethodArguments& given, double lat) {
  const double s = std::sin(lat);
  const double w = 1 - given.e2 * s * s;
  return given.a * (1 - given.e2) / (w * std::sqrt(w));
}

bool within(double lat) { return std::fabs(lat) <= kHalfPi + 1e-12; }

double hold(double lat) { return std::clamp(lat, -kHalfPi, kHalfPi); }

Made azimuthal_equal_area(const MethodArguments& given, Plane plane, double e) {
  const double lat0 = given(kLat0);
  double e2 = 0, q1 = 0, qp = 0, rq = 0, m1 = 0, sin_b1 = 0, cos_b1 = 0, sin_lat0, cos_lat0, D = 0;
  TWstatus made;
  TWlam_az_eq_c(e, 0, lat0, &e2, &q1, &qp, &rq, &m1, &sin_b1, &cos_b1, &sin_lat0, &cos_lat0, &D,
                &made);
  require(made, given);
  return formula(
      plane,
      [=](TW_BLOCK) {
        TWlam_az_eq_f(in, count, e, 0, lat0, e2, q1, qp, rq, m1, sin_b1, cos_b1, sin_lat0, cos_lat0,
                      D, out, status);
      },
      [=](TW_BLOCK) {
        TWlam_az_eq_i(in, count, e, 0, lat0, e2, qp, rq, sin_b1, cos_b1, sin_lat0, cos_lat0, D, out,
                      status);
      });
}

// The polar aspect of the ellipsoid, over the whole globe.
Made polar_equal_area(const MethodArguments& given) {
  const Authalic sphere(given);
  const double pole = std::copysign(1.0, given(kLat0));
  const Plane plane = {given(kLon0), sphere.radius, sphere.radius, given(kX0), given(kY0)};
  return pointwise(
      plane,
      [=](double lon, double lat) {
        const double rho = 2 * std::sin((kHalfPi - pole * sphere.to_authalic(lat)) / 2);
        return PointAnswer{rho * std::sin(lon), -pole * rho * std::cos(lon)};
      },
      [=](double x, double y) {
        const double rho = std::hypot(x, y);
        if (!(rho <= 2)) return PointAnswer{0, 0, false};
        const double beta = pole * (kHalfPi - 2 * std::asin(rho / 2));
        return PointAnswer{rho == 0 ? 0 : std::atan2(x, -pole * y), sphere.to_geodetic(beta)};
      });
}

Made bonne(const MethodArguments& given, const Plane& plane) {
  const double e = given.e;
  double lat1 = given(kLat0), e2, c1, r0;
  TWstatus made;
  TWbonne_c(e, &lat1, &e2, &c1, &r0, &made);
  require(made, given);
  return formula(
      plane, [=](TW_BLOCK) { TWbonne_f(0, lat1, e, e2, c1, r0, count, in, out, status); },
      [=](TW_BLOCK) { TWbonne_i(0, lat1, e, e2, c1, r0, count, in, out, status); });
}

struct Orthographic {
  double e, lat0, x0, y0, z0;
  std::array<double, 9> r;

  Orthographic(double eccentricity, double lat_origin) : e(eccentricity), lat0(lat_origin) {
    TWstatus made;
    TWortho_c(e, 0, lat0, &x0, &y0, &z0, r.data(), &made);
  }
  void forward(TW_BLOCK) const {
    TWortho_f(1, e, 0, lat0, x0, y0, z0, r.data(), count, in, out, status);
  }
  void inverse(TW_BLOCK) const {
    TWortho_i(1, e, 0, lat0, x0, y0, z0, r.data(), count, in, out, status);
  }
};

// What the perspectives share: the formula reads and copies heights, which are kept from it, and
// does not see the horizon of the ellipsoid.
struct Perspective {
  double e, lat0, h, p, phi_g, sight;

  explicit Perspective(const MethodArguments& given)
      : e(given.e), lat0(given(kTopoLat)), h((given(kViewHeight) + given(kTopoHeight)) / given.a) {
    require(h > 0, given, "the height of the viewpoint must be above zero");
    TWstatus made;
    TWpersp_c(1, e, lat0, h, 0, &p, &phi_g, &made);
    require(made, given);
  }
  // A point is seen where the viewpoint lies above its tangent plane.
  bool seen(double lon, double lat) const {
    const double s = std::sin(lat);
    const double c = std::cos(lat);
    const double s0 = std::sin(lat0);
    const double w0 = std::sqrt(1 - e * e * s0 * s0);
    const double X = (1 / w0 + h) * std::cos(lat0);
    const double Z = ((1 - e * e) / w0 + h) * s0;
    return X * c * std::cos(lon) + Z * s > std::sqrt(1 - e * e * s * s);
  }
};

}  // namespace

Made make_albers(const MethodArguments& given) {
  const double e = given.e;
  double n, C, rho0;
  TWalbers_c(e, 0, given(kLatF), given(kLat1), given(kLat2), &n, &C, &rho0);
  require(std::isfinite(rho0), given, "its standard parallels make no cone");
  return formula(
      false_origin_plane(given, 1),
      [=](TW_BLOCK) { TWalbers_f(e, 0, n, C, rho0, count, in, out, status); },
      [=](TW_BLOCK) { TWalbers_i(e, 0, n, C, rho0, count, in, out, status); });
}

Made make_azimuthal_equal_area(const MethodArguments& given) {
  if (std::fabs(given(kLat0)) > kHalfPi - 1e-10 && given.e > 0) return polar_equal_area(given);
  return azimuthal_equal_area(given, natural_plane(given, 1), given.e);
}

// On an ellipsoid the sphere is the one of equal area.
Made make_azimuthal_equal_area_spherical(const MethodArguments& given) {
  const double radius = std::sqrt(authalic_radius_squared(given.a, given.f));
  return azimuthal_equal_area(given, natural_plane(given, radius / given.a), 0);
}

Made make_cylindrical_equal_area(const MethodArguments& given) {
  const Authalic sphere(given);
  const double lat1 = given(kLat1);
  require_parallel(given, lat1);
  const double parallel = transverse_radius(given, lat1) * std::cos(lat1);
  const Plane plane = {given(kLon0), parallel, sphere.radius * sphere.radius / parallel, given(kX0),
                       given(kY0)};
  return pointwise(
      plane,
      [=](double lon, double lat) {
        return PointAnswer{lon, std::sin(sphere.to_authalic(lat))};
      },
      [=](double x, double y) {
        if (!(std::fabs(y) <= 1 + 1e-12)) return PointAnswer{0, 0, false};
        return PointAnswer{x, sphere.to_geodetic(std::asin(std::clamp(y, -1.0, 1.0)))};
      });
}

Made make_cylindrical_equal_area_spherical(const MethodArguments& given) {
  require_parallel(given, given(kLat1));
  const double c = std::cos(given(kLat1));
  const Plane plane = {given(kLon0), given.a * c, given.a / c, given(kX0), given(kY0)};
  return pointwise(
      plane,
      [](double lon, double lat) {
        return PointAnswer{lon, std::sin(lat)};
      },
      [](double x, double y) {
        if (!(std::fabs(y) <= 1 + 1e-12)) return PointAnswer{0, 0, false};
        return PointAnswer{x, std::asin(std::clamp(y, -1.0, 1.0))};
      });
}

Made make_equal_earth(const MethodArguments& given) {
  const Authalic sphere(given);
  const Plane plane = {given(kLon0), sphere.radius, sphere.radius, given(kX0), given(kY0)};
  return pointwise(
      plane,
      [=](double lon, double lat) {
        PointAnswer answer{};
        EqualEarth::forward(lon, sphere.to_authalic(lat), &answer.x, &answer.y);
        answer.plain = true;
        return answer;
      },
      [=](double x, double y) {
        PointAnswer answer{};
        answer.plain = EqualEarth::inverse(x, y, &answer.x, &answer.y);
        answer.y = sphere.to_geodetic(answer.y);
        return answer;
      });
}

Made make_bonne(const MethodArguments& given) { return bonne(given, natural_plane(given, 1)); }

Made make_bonne_south(const MethodArguments& given) {
  Plane plane = natural_plane(given, -1);
  return bonne(given, plane);
}

Made make_sinusoidal(const MethodArguments& given) {
  const double e = given.e;
  double e2, m0;
  TWstatus made;
  TWsinusoidal_c(e, 0, &e2, &m0, &made);
  require(made, given);
  return formula(
      natural_plane(given, 1),
      [=](TW_BLOCK) { TWsinusoidal_f(0, 0, e, e2, m0, count, in, out, status); },
      [=](TW_BLOCK) { TWsinusoidal_i(0, 0, e, e2, m0, count, in, out, status); });
}

template <class Map>
Next MapForward<Map>::other(const CoordinateTriple&, CoordinateTriple*, TWstatus* status) const {
  *status = TW_RANGE_ERROR;
  return Next::point;
}

template <class Map>
Next MapInverse<Map>::other(const CoordinateTriple&, CoordinateTriple*, TWstatus* status) const {
  *status = TW_RANGE_ERROR;
  return Next::point;
}

// The level sources call these.
template struct MapForward<Cassini>;
template struct MapInverse<Cassini>;
template struct MapForward<Polyconic>;
template struct MapInverse<Polyconic>;
template struct MapForward<EquidistantConic>;
template struct MapInverse<EquidistantConic>;
template struct MapForward<PolarEquidistant>;
template struct MapInverse<PolarEquidistant>;
template struct MapForward<VanDerGrinten>;
template struct MapInverse<VanDerGrinten>;
template struct MapForward<Mollweide>;
template struct MapInverse<Mollweide>;
template struct MapForward<Eckert4>;
template struct MapInverse<Eckert4>;
template struct MapForward<StereographicAboutPoint>;
template struct MapInverse<StereographicAboutPoint>;

// The lines that the many do not cover, one by one.
Next GeodesicEquidistantForward::other(const CoordinateTriple& in, CoordinateTriple* out,
                                       TWstatus* status) const {
  const auto arc = lines.any_line(lat0, 0, in.y * kDegreesPerRadian, in.x * kDegreesPerRadian);
  if (!arc.plain) {
    *status = TW_BAD_LATITUDE;
    return Next::point;
  }
  out->x = arc.length * arc.azimuth1.sin;
  out->y = arc.length * arc.azimuth1.cos;
  return Next::point;
}

Next GeodesicEquidistantInverse::other(const CoordinateTriple&, CoordinateTriple*,
                                       TWstatus* status) const {
  *status = TW_RANGE_ERROR;
  return Next::point;
}

Made make_cassini(const MethodArguments& given) {
  return map_formula(metric_plane(given), Cassini(given.a, given.f, given(kLat0)));
}

// The northing less its own cube, by the radii at the point: IOGP Publication 373-7-2, method 9833;
// the inverse by Newton's method, which finds nothing beyond the greatest northing that there is.
// A point that fails ends its loop, for the block is asked again point by point.
Made make_hyperbolic_cassini(const MethodArguments& given) {
  const MapForward<Cassini> forward{Cassini(given.a, given.f, given(kLat0))};
  const MapInverse<Cassini> inverse{forward.map};
  const double a = given.a, e2 = given.e2;
  const auto cube = [a, e2](double lat) {
    const double w2 = 1 - e2 * std::sin(lat) * std::sin(lat);
    return w2 * w2 / (6 * a * a * (1 - e2));
  };
  return formula(
      Plane{given(kLon0), 1, 1, given(kX0), given(kY0)},
      [=](TW_BLOCK) {
        *status = over_points(forward, count, in, out);
        for (int i = 0; i < count; ++i) {
          out[i].y -= cube(in[i].y) * out[i].y * out[i].y * out[i].y;
        }
      },
      [=](TW_BLOCK) {
        for (int i = 0; i < count && *status == TW_SUCCESS; ++i) {
          const CoordinateTriple wanted = in[i];
          CoordinateTriple plane = wanted;
          bool rest = false;
          for (int pass = 0; pass < 30 && !rest && *status == TW_SUCCESS; ++pass) {
            *status = over_points(inverse, 1, &plane, out + i);
            const double c = cube(out[i].y);
            const double step = (plane.y - c * plane.y * plane.y * plane.y - wanted.y) /
                                (1 - 3 * c * plane.y * plane.y);
            plane.y -= step;
            // The next step would be a thousandth of this one or less, and rounding by the maximum.
            rest = std::fabs(step) < 1e-6;
          }
          if (*status != TW_SUCCESS) return;
          *status = rest ? over_points(inverse, 1, &plane, out + i) : TW_NOT_CONVERGED;
        }
      });
}

Made make_polyconic(const MethodArguments& given) {
  return map_formula(metric_plane(given), Polyconic(given.a, given.f, given(kLat0)));
}

// IOGP Publication 373-7-2, method 1028.
Made make_equidistant_cylindrical(const MethodArguments& given) {
  const ExactMeridianArc arc(given.a, given.f);
  const double lat1 = given(kLat1);
  require_parallel(given, lat1);
  const double parallel = transverse_radius(given, lat1) * std::cos(lat1);
  const double origin = arc.arc(given(kLat0));
  return pointwise(
      Plane{given(kLon0), parallel, 1, given(kX0), given(kY0) - origin},
      [=](double lon, double lat) {
        return PointAnswer{lon, arc.arc(lat)};
      },
      [=](double x, double y) {
        const double lat = arc.latitude(y);
        return PointAnswer{x, hold(lat), within(lat)};
      });
}

Made make_equidistant_cylindrical_spherical(const MethodArguments& given) {
  double cos_lat1;
  TWstatus made;
  TWcyl_eqr_c(given(kLat1), &cos_lat1, &made);
  require_parallel(given, given(kLat1));
  const double lat0 = given(kLat0);
  return formula(
      natural_plane(given, 1),
      [=](TW_BLOCK) { TWcyl_eqr_f(0, lat0, cos_lat1, count, in, out, status); },
      [=](TW_BLOCK) { TWcyl_eqr_i(0, lat0, cos_lat1, count, in, out, status); });
}

Made make_equidistant_conic(const MethodArguments& given) {
  const EquidistantConic map(given.a, given.f, given(kLatF), given(kLat1), given(kLat2));
  require(std::isfinite(map.rho0), given, "its standard parallels make no cone");
  return map_formula(Plane{given(kLonF), 1, 1, given(kXF), given(kYF)}, map);
}

Made make_modified_azimuthal_equidistant(const MethodArguments& given) {
  const double e = given.e;
  const double lat0 = given(kLat0);
  double n1, g;
  TWaz_eq_c(e, lat0, &n1, &g);
  return formula(
      natural_plane(given, 1),
      [=](TW_BLOCK) { TWaz_eq_f(e, 0, lat0, n1, g, count, in, out, status); },
      [=](TW_BLOCK) { TWaz_eq_i(e, 0, lat0, n1, count, in, out, status); });
}

Made make_azimuthal_equidistant(const MethodArguments& given) {
  const double lat0 = given(kLat0);
  if (kHalfPi - std::fabs(lat0) < 1e-12) {
    return map_formula(metric_plane(given),
                       PolarEquidistant(given.a, given.f, std::copysign(1, lat0)));
  }
  require(given.f <= Geodesics::kLargestFlattening, given,
          "geodesics are served up to a flattening of 0.01");
  const GeodesicEquidistantForward forward{Geodesics(given.a, given.f), lat0 * kDegreesPerRadian};
  const GeodesicEquidistantInverse inverse{forward.lines, forward.lat0};
  return formula(
      metric_plane(given), [=](TW_BLOCK) { *status = over_points(forward, count, in, out); },
      [=](TW_BLOCK) { *status = over_points(inverse, count, in, out); });
}

// IOGP Publication 373-7-2, method 9831; the inverse by Newton's method on the latitude.
Made make_guam(const MethodArguments& given) {
  const double a = given.a;
  const double e2 = given.e2;
  const ExactMeridianArc arc(a, given.f);
  const double origin = arc.arc(given(kLat0));
  const auto bend = [=](double x, double lat) {
    const double s = std::sin(lat);
    return x * x * std::tan(lat) * std::sqrt(1 - e2 * s * s) / (2 * a);
  };
  return pointwise(
      Plane{given(kLon0), 1, 1, given(kX0), given(kY0)},
      [=](double lon, double lat) {
        const double s = std::sin(lat);
        const double x = a * lon * std::cos(lat) / std::sqrt(1 - e2 * s * s);
        return PointAnswer{x, arc.arc(lat) - origin + bend(x, lat)};
      },
      [=](double x, double y) {
        // Bent upwards by x, so that the root lies nearer to the equator; not to begin at a pole.
        double lat = std::clamp(arc.latitude(origin + y), -1.5, 1.5);
        bool rest = false;
        for (int i = 0; i < 50 && !rest; ++i) {
          const double s = std::sin(lat);
          const double c = std::cos(lat);
          const double w2 = 1 - e2 * s * s;
          const double slope =
              a * (1 - e2) / (w2 * std::sqrt(w2)) + x * x * std::sqrt(w2) / (2 * a * c * c);
          const double next = lat - (arc.arc(lat) - origin + bend(x, lat) - y) / slope;
          rest = std::fabs(next - lat) < 1e-14;
          // Half of the way to a pole at most.
          lat = std::fabs(next) < kHalfPi ? next : (lat + std::copysign(kHalfPi, next)) / 2;
        }
        const double s = std::sin(lat);
        const double lon = x * std::sqrt(1 - e2 * s * s) / (a * std::cos(lat));
        return PointAnswer{lon, lat, rest && std::fabs(lon) <= kPi};
      });
}

Made make_colombia_urban(const MethodArguments& given) {
  require(std::fabs(given(kLat0)) < kHalfPi - 1e-10, given, "its origin lies at a pole");
  const ColombiaUrban map(given.a, given.e2, given(kLat0), given(kPlaneHeight));
  return pointwise(
      Plane{given(kLon0), 1, 1, given(kX0), given(kY0)},
      [=](double lon, double lat) {
        PointAnswer answer{};
        map.forward(lon, lat, &answer.x, &answer.y);
        answer.plain = std::isfinite(answer.y);
        return answer;
      },
      [=](double x, double y) {
        PointAnswer answer{};
        map.inverse(x, y, &answer.x, &answer.y);
        answer.plain = within(answer.y) && std::fabs(answer.x) <= kPi;
        return answer;
      });
}

// Kilometres by degrees of the centesimal division, IOGP Publication 373-7-2, method 9816.
Made make_tunisia_mining(const MethodArguments& given) {
  constexpr double kGrad = kPi / 200;
  constexpr double kEast = 0.012185 * kGrad / 1000;
  constexpr double kNorth = 0.010015 * kGrad / 1000;
  constexpr double kSouth = 0.01002 * kGrad / 1000;
  const double lat0 = given(kLatF);
  return pointwise(
      Plane{given(kLonF), 1, 1, given(kXF), given(kYF)},
      [=](double lon, double lat) {
        return PointAnswer{lon / kEast, (lat - lat0) / (lat > lat0 ? kNorth : kSouth)};
      },
      [=](double x, double y) {
        const double lat = lat0 + y * (y > 0 ? kNorth : kSouth);
        return PointAnswer{x * kEast, lat, within(lat)};
      });
}

// Lambert's conic with the arc's scale cut off after the third power: IOGP Publication 373-7-2,
// method 9817.
Made make_lambert_near_conformal(const MethodArguments& given) {
  const ExactMeridianArc arc(given.a, given.f);
  const double lat0 = given(kLat0);
  const double k0 = given(kK0, 1);
  const double s0 = std::sin(lat0);
  const double A = 1 / (6 * meridional_radius(given, lat0) * transverse_radius(given, lat0));
  const double r0 = k0 * transverse_radius(given, lat0) / std::tan(lat0);
  require(std::isfinite(r0), given, "its latitude of origin makes no cone");
  const double origin = arc.arc(lat0);
  return pointwise(
      Plane{given(kLon0), 1, 1, given(kX0), given(kY0)},
      [=](double lon, double lat) {
        const double m = arc.arc(lat) - origin;
        const double M = k0 * (m + A * m * m * m);
        const double r = r0 - M;
        const double theta = lon * s0;
        const double x = r * std::sin(theta);
        return PointAnswer{x, M + x * std::tan(theta / 2)};
      },
      [=](double x, double y) {
        const double theta = r0 < 0 ? std::atan2(-x, -(r0 - y)) : std::atan2(x, r0 - y);
        const double r = std::copysign(std::hypot(x, r0 - y), r0);
        const double M = r0 - r;
        double m = M / k0;
        for (int i = 0; i < 30; ++i) {
          const double step = (k0 * (m + A * m * m * m) - M) / (k0 * (1 + 3 * A * m * m));
          m -= step;
          if (std::fabs(step) < 1e-10) break;
        }
        const double lat = arc.latitude(origin + m);
        return PointAnswer{theta / s0, lat, within(lat)};
      });
}

Made make_robinson(const MethodArguments& given) {
  struct Table {
    double knots[19], y[76], x[76];
  };
  auto table = std::make_shared<Table>();
  double y0;
  TWstatus made;
  TWrobin_c(table->knots, table->y, table->x, &y0, 0, &made);
  require(made, given);
  const std::shared_ptr<const Table> shared = table;
  return formula(
      natural_plane(given, 1),
      [=](TW_BLOCK) {
        TWrobin_f(shared->knots, shared->y, shared->x, 0, y0, count, out, in, status);
      },
      [=](TW_BLOCK) {
        TWrobin_i(shared->knots, shared->y, shared->x, 0, y0, count, in, out, status);
      });
}

Made make_miller(const MethodArguments& given) {
  return formula(
      natural_plane(given, 1), [](TW_BLOCK) { TWmiller_cyl_f(in, count, 0, 0, out, status); },
      [](TW_BLOCK) { TWmiller_cyl_i(in, count, 0, 0, out, status); });
}

Made make_eckert4(const MethodArguments& given) {
  return map_formula(natural_plane(given, 1), Eckert4());
}

Made make_mollweide(const MethodArguments& given) {
  return map_formula(natural_plane(given, 1), Mollweide());
}

Made make_van_der_grinten(const MethodArguments& given) {
  return map_formula(natural_plane(given, 1), VanDerGrinten());
}

Made make_gnomonic(const MethodArguments& given) {
  const double lat0 = given(kLat0);
  const double c = std::cos(lat0);
  const double s = std::sin(lat0);
  return formula(
      natural_plane(given, 1), [=](TW_BLOCK) { TWgnomon_f(0, lat0, c, s, count, out, in, status); },
      [=](TW_BLOCK) { TWgnomon_i(0, lat0, c, s, count, in, out, status); });
}

Made make_orthographic(const MethodArguments& given) {
  const Orthographic map(given.e, given(kLat0));
  return formula(
      natural_plane(given, 1), [=](TW_BLOCK) { map.forward(count, in, out, status); },
      [=](TW_BLOCK) { map.inverse(count, in, out, status); });
}

// The orthographic plane turned by an azimuth and scaled: IOGP Publication 373-7-2, method 1130.
Made make_local_orthographic(const MethodArguments& given) {
  const Orthographic map(given.e, given(kLatC));
  const double scale = given.a * given(kLineScale, 1);
  const double c = std::cos(given(kAzimuth));
  const double s = std::sin(given(kAzimuth));
  return formula(
      Plane{given(kLonC), scale, scale, given(kXC), given(kYC)},
      [=](TW_BLOCK) {
        map.forward(count, in, out, status);
        for (int i = 0; i < count; ++i) {
          const double x = out[i].x;
          const double y = out[i].y;
          out[i].x = x * c - y * s;
          out[i].y = x * s + y * c;
        }
      },
      [=](TW_BLOCK) {
        for (int i = 0; i < count; ++i) {
          const double x = in[i].x;
          const double y = in[i].y;
          out[i].x = x * c + y * s;
          out[i].y = y * c - x * s;
        }
        map.inverse(count, out, out, status);
      });
}

namespace {

Made perspective(const MethodArguments& given, double azimuth, double tilt) {
  const Perspective map(given);
  const bool tilted = azimuth != 0 || tilt != 0;
  const Plane plane = {given(kTopoLon), given.a, given.a, given(kX0), given(kY0)};
  // Longitude and latitude, or plane, of one point on the ellipsoid itself.
  const auto run = [=](bool inverse, CoordinateTriple* point) {
    TWstatus made = TW_SUCCESS;
    point->z = 0;
    if (tilted) {
      (inverse ? TWpersp_i(1, map.e, 0, map.lat0, 0, map.h, map.p, map.phi_g, azimuth, tilt, kPi, 1,
                           point, point, &made)
               : TWpersp_f(1, map.e, 0, map.lat0, 0, map.h, map.p, map.phi_g, azimuth, tilt, kPi, 1,
                           point, point, &made));
    } else {
      (inverse ? TWpersp_vert_i : TWpersp_vert_f)(1, map.e, 0, map.lat0, 0, map.h, map.p, map.phi_g,
                                                  1, point, point, &made);
    }
    return made == TW_SUCCESS && std::isfinite(point->x) && std::isfinite(point->y);
  };
  return pointwise(
      plane,
      [=](double lon, double lat) {
        CoordinateTriple point = {lon, lat, 0};
        if (!map.seen(lon, lat) || !run(false, &point)) return PointAnswer{0, 0, false};
        return PointAnswer{point.x, point.y};
      },
      [=](double x, double y) {
        CoordinateTriple point = {x, y, 0};
        if (!run(true, &point) || !map.seen(point.x, point.y)) return PointAnswer{0, 0, false};
        return PointAnswer{point.x, point.y};
      });
}

}  // namespace

Made make_vertical_perspective(const MethodArguments& given) { return perspective(given, 0, 0); }

Made make_tilted_perspective(const MethodArguments& given) {
  return perspective(given, given(kAzimuth), given(kTilt));
}

Made make_imw_polyconic(const MethodArguments& given) {
  const double e = given.e;
  const double lat1 = given(kLat1);
  double r1, r2, c, p, q, s, t;
  TWstatus made;
  TWIMWmodPoly_c(e, 0, lat1, &r1, &r2, &c, &p, &q, &s, &t, &made);
  require(made, given);
  return formula(
      natural_plane(given, 1),
      [=](TW_BLOCK) { TWIMWmodPoly_f(e, 0, lat1, r1, r2, c, p, q, s, t, count, in, out, status); },
      [=](TW_BLOCK) { TWIMWmodPoly_i(e, 0, lat1, r1, r2, c, p, q, s, t, count, in, out, status); });
}

}  // namespace tidewater::detail
