// Formulas of the orthographic projection of the unit ellipsoid by way of geocentric space.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp.
// 145-153; the ellipsoid as in EPSG Guidance Note 7-2 (2019), orthographic.
#pragma once

#include "formulas/constants.hpp"
#include "formulas/pole_hold.hpp"
#include "formulas/radii.hpp"
#include "points/elementary.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// The arc cosine of what is less than this is more than the double of pi/2.
inline constexpr double kBeyondQuarter = -(0x1p-53 - 0x1.1a62633145c07p-54);
// A plane point this close to the centre is the origin.
inline constexpr double kOrthographicCentre = 1e-9;
// The sine of the angle at which the line of sight must meet the surface for its equation to be
// solved at once; towards the rim the passes of the stated iteration set the result and the word.
inline constexpr double kSteepSight = 0.05;

struct Vector3 {
  double x, y, z;
};

// The origin on the unit ellipsoid, and the local axes there.
struct OrthographicFrame {
  double e2;
  Vector3 origin, east, north, up;
};

struct OrthographicForward {
  OrthographicFrame frame;
  double lon0, lat0;
  SinCos<double> at_lon0, at_lat0;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const auto d = sincos(lon - lon0);
    const V sin_lon = d.sin * at_lon0.cos + d.cos * at_lon0.sin;
    const V cos_lon = d.cos * at_lon0.cos - d.sin * at_lon0.sin;
    const auto p = sincos(lat);
    // By contract: the arc cosine of the distance decides; a hair beyond the antipode it is not a
    // number, and does not.
    const V cosine = p.cos * d.cos * at_lat0.cos + p.sin * at_lat0.sin;
    const auto centre = (abs(lon - lon0) < 1e-12) & (abs(lat - lat0) < 1e-12);
    const auto beyond = (cosine < kBeyondQuarter) & (cosine >= -1.0);
    const Mask<V> plain = centre | !beyond;
    const V nu = normal_radius(frame.e2, p.sin);
    const V x = nu * p.cos * cos_lon - frame.origin.x;
    const V y = nu * p.cos * sin_lon - frame.origin.y;
    const V z = (1.0 - frame.e2) * nu * p.sin - frame.origin.z;
    return {select(centre, 0.0, frame.east.x * x + frame.east.y * y + frame.east.z * z),
            select(centre, 0.0, frame.north.x * x + frame.north.y * y + frame.north.z * z), plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct OrthographicInverse {
  OrthographicFrame frame;
  double e, lon0, lat0;
  double limit;      // 1 - f: from here on a point lies outside the disc
  double up_square;  // of the upward axis in the ellipsoid's measure x^2 + y^2 + z^2 / (1 - e^2)
  bool* stopped;     // set where a point outside the disc ends the array

  // The point of the surface below or above a plane point lies at the height z over the origin's
  // tangent plane that solves up_square z^2 + 2 b z + c = 0.
  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const double flat = 1.0 / (1.0 - frame.e2);
    const V r2 = x * x + y * y;
    const V r = sqrt(r2);
    const auto centre = r < kOrthographicCentre;
    const V px = frame.origin.x + frame.east.x * x + frame.north.x * y;
    const V py = frame.origin.y + frame.east.y * x + frame.north.y * y;
    const V pz = frame.origin.z + frame.east.z * x + frame.north.z * y;
    const V b = frame.up.x * px + frame.up.y * py + frame.up.z * flat * pz;
    const V c = px * px + py * py + flat * (pz * pz) - 1.0;
    const V discriminant = b * b - up_square * c;
    const Mask<V> steep = (discriminant > kSteepSight * kSteepSight) & (b > 0.0) & (r < limit);
    const V z = -c / (b + sqrt(select(steep, discriminant, 1.0)));
    const V gx = px + z * frame.up.x;
    const V gy = py + z * frame.up.y;
    const V gz = pz + z * frame.up.z;
    const V rho = sqrt(gx * gx + gy * gy);
    // On the axis the longitude is 0, as TWxyz_to_llh has it.
    const auto axis = rho < 1e-9;
    const V lon = select(axis, 0.0, atan2(gy, gx));
    const V lat = select(axis, copysign(kHalfPi, gz), atan2(flat * gz, rho));
    const Mask<V> plain = centre | (everywhere<V>(abs(e) <= kSeriesEccentricity) & steep);
    return {select(centre, lon0, lon), select(centre, lat0, lat), plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct OrthographicScale {
  double lon0, sin_lat0, cos_lat0;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat) const {
    const Mask<V> plain = !((lat > kHalfPi) | (lat < -kHalfPi));
    const auto p = sincos(hold_off_poles(select(plain, lat, 0.0), 1e-10));
    const V h = sincos(lon - lon0).cos * p.cos * cos_lat0 + p.sin * sin_lat0;
    return {V(1.0), h, h, plain};  // By contract: k0 has no part in it
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::OrthographicForward)
TIDEWATER_INSTANCE(tidewater::detail::OrthographicInverse)
TIDEWATER_INSTANCE(tidewater::detail::OrthographicScale)
