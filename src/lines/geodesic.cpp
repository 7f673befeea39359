// Direct and inverse problem of the geodesic, described by its vertex: the point of highest reduced
// latitude on the line.
//
// With beta the reduced latitude and k its sine at the vertex, a point at arc angle theta from the
// vertex on the auxiliary sphere has sin(beta) = k cos(theta), and
//
//   s      = b * integral of sqrt(1 + e'^2 k^2 cos^2 u) du,
//   lambda = omega - cos(beta_0) * integral of
//            (1 - sqrt(1 - e^2 (1 - k^2 cos^2 u))) / (1 - k^2 cos^2 u) du,
//
// both from 0 to theta, with omega the longitude on the sphere.  The roots are expanded by the
// binomial series to five terms.  F. W. Bessel, Ueber die Berechnung der geographischen Laengen und
// Breiten aus geodaetischen Vermessungen, Astronomische Nachrichten 4 (1825), pp. 241-254.

#include <cmath>
#include <cstdint>

#include "formulas/wraps.hpp"
#include "points/portable.hpp"
#include "tidewater/ellipsoid.h"
#include "tidewater/geodesic.h"

using namespace tidewater::detail;
namespace points = tidewater::points;

namespace {

struct ArcAndLongitude {
  double arc = 0;
  double lon = 0;
};

// The two expansions for one ellipsoid.
class VertexExpansion {
 public:
  VertexExpansion(double b, double e2, double ep2) : b_(b) {
    // sqrt(1 + v) = 1 + v/2 - v^2/8 + v^3/16 - 5 v^4/128 + 7 v^5/256
    const double p2 = ep2 * ep2;
    arc_[0] = ep2 / 2;
    arc_[1] = -p2 / 8;
    arc_[2] = p2 * ep2 / 16;
    arc_[3] = -5 * p2 * p2 / 128;
    arc_[4] = 7 * p2 * p2 * ep2 / 256;
    const double q2 = e2 * e2;
    const double c1 = e2 / 2;
    const double c2 = q2 / 8;
    const double c3 = q2 * e2 / 16;
    const double c4 = 5 * q2 * q2 / 128;
    const double c5 = 7 * q2 * q2 * e2 / 256;
    // sum over n of c_n (1 - k^2 cos^2 u)^(n-1), by powers of k^2 cos^2 u
    lon_[0] = c1 + c2 + c3 + c4 + c5;
    lon_[1] = -(c2 + 2 * c3 + 3 * c4 + 4 * c5);
    lon_[2] = c3 + 3 * c4 + 6 * c5;
    lon_[3] = -(c4 + 4 * c5);
    lon_[4] = c5;
  }

  // From the vertex to the point whose sine of reduced latitude is x.
  ArcAndLongitude to(double x, double k) const {
    const Integrals i = integrate(x, k);
    return {arc(i), longitude(i, x, k)};
  }

  // As to(); a point on the vertex or beyond it gives zeros.
  ArcAndLongitude within(double x, double k) const {
    if (std::fabs(x) >= std::fabs(k)) return {};
    return to(x, k);
  }

  // The point itself, or the vertex for a point beyond it.  By contract: on the positive side
  // alone.
  static double pull_back(double x, double k) { return x >= k ? k - 1e-18 : x; }

  // As to(), with the point pulled back; and its two halves.
  ArcAndLongitude pulled_back(double x, double k) const { return to(pull_back(x, k), k); }

  // The point at an arc from the vertex, from its equator to the vertex: its arc angle by Newton's
  // method, and what follows from it.
  struct Point {
    double x;    // sine of reduced latitude
    double lon;  // from the vertex
  };
  Point at(double wanted, double k, double ep2) const {
    // Stated on x; on the angle, of which x = k cos(theta) is the cosine, a pass needs neither an
    // arc tangent nor a root of a small difference, and comes to rest at the same point.  Running
    // out of passes is not reported.
    constexpr int kMostPasses = 11;
    double theta = wanted / b_;
    for (int pass = 0; pass < kMostPasses; ++pass) {
      const auto [s, r] = points::sincos(theta);
      const double d =
          (wanted - arc(integrate(r, s, theta, k))) / (b_ * std::sqrt(1 + ep2 * square(k * r)));
      theta += d;
      // What this step leaves is of the order of its square, times the ellipsoid's ep2.
      if (std::fabs(d) <= 1e-9) break;
    }
    const auto [s, r] = points::sincos(theta);
    const double x = pull_back(k * r, k);
    return {x, longitude(integrate(r, s, theta, k), x, k)};
  }

 private:
  // Arc angle theta with cosine r, and f_j = k^(2j) * integral of cos^(2j) u du from 0 to theta.
  struct Integrals {
    double r, theta;
    double f1, f2, f3, f4, f5;
  };

  static Integrals integrate(double x, double k) {
    const double r = x / k;
    const double s = std::sqrt(1 - r * r);
    return integrate(r, s, points::atan2(s, r), k);
  }

  // With theta itself at hand.
  static Integrals integrate(double r, double s, double theta, double k) {
    // f_j = g_j k^(2j) s / (2j)
    const double r2 = r * r;
    const double k2 = k * k;
    const double r3 = r2 * r;
    const double r5 = r3 * r2;
    const double r7 = r5 * r2;
    const double g1 = s > 1e-8 ? theta / s + r : 1 / r + r;
    const double g2 = 3.0 / 2 * g1 + r3;
    const double g3 = 5.0 / 4 * g2 + r5;
    const double g4 = 7.0 / 6 * g3 + r7;
    const double g5 = 9.0 / 8 * g4 + r7 * r2;
    const double k4 = k2 * k2;
    return {r,
            theta,
            g1 * k2 * s / 2,
            g2 * k4 * s / 4,
            g3 * (k4 * k2) * s / 6,
            g4 * (k4 * k4) * s / 8,
            g5 * (k4 * k4 * k2) * s / 10};
  }

  double arc(const Integrals& i) const {
    return b_ *
           (i.theta + (arc_[0] * i.f1 +
                       (arc_[1] * i.f2 + (arc_[2] * i.f3 + (arc_[3] * i.f4 + arc_[4] * i.f5)))));
  }

  double longitude(const Integrals& i, double x, double k) const {
    const double cx = std::sqrt(1 - x * x);
    const double ck = std::sqrt(1 - k * k);
    const double q = ck * i.r / cx;
    const double sphere = q < 1 ? points::atan2(std::sqrt(1 - q * q), q) : 0;
    return sphere - ck * (lon_[0] * i.theta +
                          (lon_[1] * i.f1 + (lon_[2] * i.f2 + (lon_[3] * i.f3 + lon_[4] * i.f4))));
  }

  double b_;
  double arc_[5];
  double lon_[5];
};

struct SineCosine {
  double sin;
  double cos;
};

// Sine and cosine of the reduced latitude, from those of the latitude.
SineCosine reduced_latitude(double sin_lat, double cos_lat, double ep2, double a_over_b) {
  const double w = std::sqrt(ep2 * cos_lat * cos_lat + 1);
  return {sin_lat / w, cos_lat / w * a_over_b};
}

// The functions take the sphere below this eccentricity; a negative one falls here too.
constexpr double kSphereLimit = 1e-12;

double at_most_one(double v) { return v > 1 ? 1 : v; }
double clamp_to_one(double v) { return v < -1 ? -1 : at_most_one(v); }

double into_half_turn(double angle) {
  return angle >= 0 ? add_turns_while(angle, -kTwoPi, [](double v) { return v > kPi; })
                    : add_turns_while(angle, kTwoPi, [](double v) { return v < -kPi; });
}

// By contract: a longitude above pi by less than 1e-10 stays.
double into_shifted_half_turn(double lon) {
  return lon >= 0 ? add_turns_while(lon, -kTwoPi, [](double v) { return v - 1e-10 >= kPi; })
                  : add_turns_while(lon, kTwoPi, [](double v) { return v - 1e-10 <= -kPi; });
}

// Takes whole half-waves, two quarters long, off an arc until no more than a quarter is left, and
// counts them.  An arc of very many is brought near by a remainder instead of by steps; one that a
// half-wave does not change, and a quarter of no length, are left alone.
int64_t take_half_waves(double& arc, double quarter) {
  const double half_wave = 2 * quarter;
  int64_t count = 0;
  if (!(quarter > 0) || arc - half_wave == arc) return count;
  constexpr double kMostSteps = 65536;
  if (arc > kMostSteps * half_wave) {
    const double rest = std::fmod(arc, half_wave);
    count = std::llround((arc - rest) / half_wave);
    arc = rest;
  }
  while (quarter < arc) {
    ++count;
    arc -= half_wave;
  }
  return count;
}

// End point on the sphere: Snyder, USGS Professional Paper 1395 (1987), eq. 5-5, 5-6.
void direct_on_sphere(CoordinateTriple start, double azimuth, double angle, CoordinateTriple* end,
                      double* back_azimuth) {
  const double lon1 = start.x;
  const double lat1 = start.y;
  const double sin1 = portable::sin(lat1);
  const double cos1 = portable::cos(lat1);
  const double sin_t = portable::sin(angle);
  const double cos_t = portable::cos(angle);
  const double sin_az = portable::sin(azimuth);
  const double cos_az = portable::cos(azimuth);
  const double lat2 = portable::asin(cos1 * sin_t * cos_az + sin1 * cos_t);
  double lon2 = 0;
  if (lat1 == kHalfPi) {
    lon2 = lon1 - azimuth;
  } else if (lat1 == -kHalfPi) {
    lon2 = lon1 + azimuth;
  } else {
    lon2 = lon1 + portable::atan2(sin_az * sin_t, cos1 * cos_t - sin1 * sin_t * cos_az);
  }
  // By contract: in the range of the arc tangent, not of a full turn.
  const double d = lon1 - lon2;
  *back_azimuth =
      portable::atan2(portable::sin(d) * cos1,
                      sin1 * portable::cos(lat2) - portable::cos(d) * portable::sin(lat2) * cos1);
  end->x = lon2;
  end->y = lat2;
}

constexpr int kMostInversePasses = 30;

void inverse_on_meridian(double dl, double lat1, double lat2, double a, double e, double* azimuth,
                         double* back_azimuth, double* distance, TWstatus* status) {
  if (std::fabs(std::fabs(dl) - kPi) < 1e-14 && lat1 == -lat2) {
    // Antipodal points.  By contract: the line goes over the north pole, whichever latitudes they
    // have.
    double quarter = 0;
    TWmerid_dist_f(a, e, kHalfPi, &quarter, status);
    *distance = 2 * quarter;
    *azimuth = 0;
    *back_azimuth = 0;
    return;
  }
  double m1 = 0;
  TWmerid_dist_f(a, e, lat1, &m1, status);
  if (!TW_OK(*status)) return;
  double m2 = 0;
  TWmerid_dist_f(a, e, lat2, &m2, status);
  bool north = false;
  if ((m1 < 0) != (m2 < 0)) {
    *distance = std::fabs(m1) + std::fabs(m2);
    north = lat2 >= lat1;
  } else {
    *distance = std::fabs(m1 - m2);
    north = m2 >= m1;
  }
  *azimuth = north ? 0 : kPi;
  *back_azimuth = north ? kPi : 0;
}

// Haversine formula: Snyder 1987, eq. 5-3a, 5-4b.
void inverse_on_sphere(double dl, CoordinateTriple start, CoordinateTriple end, double a,
                       double* azimuth, double* back_azimuth, double* distance) {
  // By contract: no such step for a difference below -pi.
  dl = add_turns_while(dl, -kTwoPi, [](double v) { return v > kPi; });
  const double sin1 = portable::sin(start.y);
  const double cos1 = portable::cos(start.y);
  const double sin2 = portable::sin(end.y);
  const double cos2 = portable::cos(end.y);
  const double cos_dl = portable::cos(dl);
  const double h = std::sqrt(square(portable::sin(dl / 2)) * cos2 * cos1 +
                             square(portable::sin((start.y - end.y) / 2)));
  *distance = std::fabs(2 * a * portable::asin(clamp_to_one(h)));
  *azimuth =
      portable::atan2(portable::sin(end.x - start.x) * cos2, sin2 * cos1 - cos_dl * cos2 * sin1);
  *back_azimuth = portable::atan2(portable::sin(dl) * cos1, cos2 * sin1 - cos_dl * sin2 * cos1);
}

void inverse_on_ellipsoid(double dl, double lat1, double lat2, double a, double e, double* azimuth,
                          double* back_azimuth, double* distance, TWstatus* status) {
  const double e2 = e * e;
  const double ep2 = e2 / (1 - e2);
  const double b = std::sqrt(1 - e2) * a;
  const auto [s1, co1] = points::sincos(lat1);
  const auto [s2, co2] = points::sincos(lat2);
  auto [x1, c1] = reduced_latitude(s1, co1, ep2, a / b);
  auto [x2, c2] = reduced_latitude(s2, co2, ep2, a / b);
  x1 = at_most_one(x1);
  c1 = at_most_one(c1);
  c2 = at_most_one(c2);
  x2 = clamp_to_one(x2);

  // The point of greater latitude comes to the northern side.
  const double size1 = std::fabs(lat1);
  const double size2 = std::fabs(lat2);
  double mirror = 1;
  if ((size1 <= size2 && lat2 < 0) || (size1 >= size2 && lat1 < 0)) {
    mirror = -1;
    x1 = -x1;
    x2 = -x2;
  }
  if (std::fabs(x1) == 1 || std::fabs(x2) == 1) dl = 0;
  // From here the line goes west over dl in 0..pi, or east where west is -1.
  if (dl < 0) dl += kTwoPi;
  double west = 1;
  if (dl >= kPi) {
    west = -1;
    dl = kTwoPi - dl;
  }

  // First estimate on the auxiliary sphere.
  const auto [sl, cl] = points::sincos(dl);
  const double sin_arc =
      (sl < 0 ? -1 : 1) * std::sqrt(2 * (1 - cl) * c2 * x2 * c1 * x1 + square(c2 * x1 - x2 * c1) +
                                    square(sl * c2 * c1));
  const double cos_arc = cl * c2 * c1 + x2 * x1;
  const double sin_az1 = clamp_to_one(sl * c2 / sin_arc);
  const double cos_az1 = clamp_to_one((x2 - cos_arc * x1) / (sin_arc * c1));
  const double cos_az2 = clamp_to_one((x1 - cos_arc * x2) / (sin_arc * c2));
  // Whether the line leaves each point towards the vertex; fixed from here on.
  const double g1 = cos_az1 >= 0 ? 1 : -1;
  const double g2 = cos_az2 < 0 ? -1 : 1;
  const double m = sin_az1 * c1;
  double k = std::sqrt(1 - m * m);
  double v = points::atan2(k, m);  // reduced latitude of the vertex

  // The vertex is kept above both points.
  const double highest = x2 <= x1 ? x1 : x2;
  double pad = 2e-16;
  if (k <= highest) k = pad + highest;
  if (k > 1) k = 1;

  *distance = sin_arc * a;
  double previous = *distance;
  double floor1 = 2e-16;
  double floor2 = 2e-16;
  int count = 0;
  double arc = 0;
  double change = 0;
  const VertexExpansion expansion(b, e2, ep2);
  for (;;) {
    ++count;
    const auto to1 = expansion.within(x1, k);
    const auto to2 = expansion.within(x2, k);
    const double excess = g2 * to2.lon + g1 * to1.lon - dl;
    // Each floor halves every time it is used.
    double d1 = (k + x1) * (k - x1);
    if (d1 < floor1) {
      d1 = floor1;
      floor1 /= 2;
    }
    double d2 = (k + x2) * (k - x2);
    if (d2 < floor2) {
      d2 = floor2;
      floor2 /= 2;
    }
    const double slope = (g2 * x2 / std::sqrt(d2) + g1 * x1 / std::sqrt(d1)) / k;
    double step = 0;
    if (std::fabs(slope) <= 1e-16) {
      count = kMostInversePasses;
    } else {
      step = -excess / slope;
    }
    k = points::sincos(step + v).sin;
    if (k <= highest) {
      k = pad + highest;
      v = portable::asin(k);
      pad /= 3;
    } else {
      v += step;
    }
    k = clamp_to_one(k);
    arc = g2 * to2.arc + g1 * to1.arc;
    change = arc - previous;
    previous = arc;
    // By contract: the tolerance on the arc here is not scaled to the ellipsoid.
    if (count > 2 &&
        (std::fabs(change) <= 0.0001 || std::fabs(step) <= 1e-16 || count >= kMostInversePasses)) {
      break;
    }
  }

  const double tolerance = a * 0.0001 / 6378137.0;
  if (count < kMostInversePasses &&
      (std::fabs(change) < tolerance || std::fabs(change / *distance) < 1e-6)) {
    *distance = arc;
  } else if (std::fabs(x1 - x2) < 1e-12) {
    double radius = 0;
    TWRparal(a, e, lat1, &radius, status);
    *distance = std::fabs(radius * dl);
  }
  // By contract: in all other cases the first estimate stays, with no word about it.

  const double clairaut = std::sqrt(1 - k * k);
  double p1 = clairaut / c1 >= 1 ? -1 : -(clairaut / c1);
  if (std::fabs(p1) > 0.999999999999999) p1 = -1;
  double p2 = clairaut / c2 >= 1 ? 1 : clairaut / c2;
  if (std::fabs(p2) > 0.999999999999999) p2 = 1;
  *azimuth = points::atan2(west * p1, mirror * (g1 * std::sqrt(1 - p1 * p1)));
  *back_azimuth = points::atan2(west * p2, mirror * (g2 * std::sqrt(1 - p2 * p2)));
}

}  // namespace

void geodesic_int(double x, double k, int16_t flag, double b, double e2, double ep2, double* arc,
                  double* lon, TWstatus* status) {
  *status = TW_SUCCESS;
  const VertexExpansion expansion(b, e2, ep2);
  const auto result = flag == 0 ? expansion.within(x, k) : expansion.pulled_back(x, k);
  *arc = result.arc;
  *lon = result.lon;
}

void TWgeodesic_dir(CoordinateTriple start, double azimuth, double distance, double a, double e,
                    CoordinateTriple* end, double* back_azimuth, TWstatus* status) {
  *status = TW_SUCCESS;
  const double lon1 = start.x;
  const double lat1 = start.y;
  end->z = start.z;
  if (distance == 0) {
    end->x = lon1;
    end->y = lat1;
    *back_azimuth = kPi;
    return;
  }

  const double size = std::fabs(into_half_turn(azimuth));
  if (size < 1e-14 || size > kPi - 1e-14) {
    const double northward = size < 1e-14 ? distance : -distance;
    double arc = 0;
    TWmerid_dist_f(a, e, lat1, &arc, status);
    TWmerid_dist_i(a, e, arc + northward, &end->y, status);
    end->x = lon1;
    *back_azimuth = kPi;  // By contract: also for a line that runs south.
    return;
  }
  if (e < kSphereLimit) {
    direct_on_sphere(start, azimuth, distance / a, end, back_azimuth);
    return;
  }

  const double e2 = e * e;
  const double ep2 = e2 / (1 - e2);
  const double b = std::sqrt(1 - e2) * a;
  const auto [sin_az, cos_az] = points::sincos(azimuth);
  const double east = sin_az >= 0 ? 1 : -1;
  double ahead = cos_az >= 0 ? 1 : -1;  // whether the vertex lies ahead
  const auto [sin_lat1, cos_lat1] = points::sincos(lat1);
  const auto [sin_beta, c1] = reduced_latitude(sin_lat1, cos_lat1, ep2, a / b);
  const double x1 = std::fabs(sin_beta);
  const double m = std::fabs(c1 * sin_az);  // Clairaut's constant
  // Either form keeps k accurate where the other does not.
  const double k = m > 0.999 ? std::sqrt(square(c1 * cos_az) + x1 * x1) : std::sqrt(1 - m * m);
  if (k < 1e-15) {  // along the equator
    end->x = into_half_turn(lon1 + east * distance / a);
    end->y = 0;
    *back_azimuth = east * kHalfPi + kPi;
    return;
  }

  // A line that starts in the south is solved in the mirror.
  bool south = false;
  if (lat1 < 0 || (lat1 == 0 && cos_az < 0)) {
    south = true;
    ahead = -ahead;
  }
  const VertexExpansion expansion(b, e2, ep2);
  ArcAndLongitude from_vertex;  // zeros where the start is itself a vertex
  if (std::fabs(cos_az) >= 1e-15) from_vertex = expansion.pulled_back(x1, k);
  double arc = distance - ahead * from_vertex.arc;
  ArcAndLongitude quarter;
  int64_t half_waves = 0;
  if (arc >= 0) {
    quarter = expansion.pulled_back(0, k);
    half_waves = take_half_waves(arc, quarter.arc);
  }
  const bool before_vertex = arc < 0;
  if (before_vertex) arc = -arc;

  double w = k * points::sincos(arc / b).cos;
  double lon = arc / b * m;  // By contract: the product, and a limit in the unit of a, not scaled.
  if (!(arc < 0.01)) {
    const auto at = expansion.at(arc, k, ep2);
    w = at.x;
    lon = at.lon;
  }
  double c2 = std::sqrt(1 - w * w);
  if (c2 < m) c2 = m;

  const bool mirrored = south != (half_waves % 2 != 0);
  const double lat2 = points::atan2(w * a, c2 * b);
  end->y = mirrored ? -lat2 : lat2;
  end->x = into_shifted_half_turn(lon1 +
                                  east * (2 * static_cast<double>(half_waves) * quarter.lon +
                                          ahead * from_vertex.lon + (before_vertex ? -lon : lon)));

  const double t = m / c2;
  double u = t < 0.999999 ? std::sqrt(1 - t * t) : std::sqrt((w + k) * (k - w)) / c2;
  if (mirrored != before_vertex) u = -u;
  double back = (points::atan2(u, t) + kHalfPi) * east + kPi;
  if (back >= kTwoPi - 1e-15) back -= kTwoPi;
  *back_azimuth = back;
}

void TWgeodesic_inv(CoordinateTriple start, CoordinateTriple end, double a, double e,
                    double* azimuth, double* back_azimuth, double* distance, TWstatus* status) {
  *status = TW_SUCCESS;
  const double lat1 = start.y;
  const double lat2 = end.y;
  const double dl = start.x - end.x;
  if (std::fabs(dl) < 1e-14 && std::fabs(lat1 - lat2) < 1e-14) {
    *distance = 0;
    *azimuth = 0;
    *back_azimuth = kPi;
    return;
  }
  constexpr double kPole = kHalfPi - 1e-14;
  if (std::fabs(dl) < 1e-14 || (std::fabs(std::fabs(dl) - kPi) < 1e-14 && lat1 == -lat2) ||
      std::fabs(lat1) > kPole || std::fabs(lat2) > kPole) {
    inverse_on_meridian(dl, lat1, lat2, a, e, azimuth, back_azimuth, distance, status);
  } else if (e < kSphereLimit) {
    inverse_on_sphere(dl, start, end, a, azimuth, back_azimuth, distance);
  } else {
    inverse_on_ellipsoid(dl, lat1, lat2, a, e, azimuth, back_azimuth, distance, status);
  }
  // By contract: the azimuths are brought up also where they are still the caller's own.
  if (*azimuth < -1e-12) *azimuth += kTwoPi;
  if (*back_azimuth < -1e-12) *back_azimuth += kTwoPi;
}
