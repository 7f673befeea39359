// Formulas of the Chamberlin trimetric projection: a point is placed by its distances from the
// three corners of a triangle, and the mean of the three places is taken.
// J. P. Snyder, An Album of Map Projections, USGS Professional Paper 1453 (1989), p. 170.
#pragma once

#include "formulas/constants.hpp"
#include "points/elementary.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// The triangle: its corners, and where they and the edges between them lie on the plane.
struct ChamberlinTriangle {
  ChamberlinTriangle(double eccentricity, const CoordinateTriple* control, const double* sides,
                     const double* azimuths, const CoordinateTriple* plane);

  double e;
  CoordinateTriple corner[3], place[3];
  double side[3], azimuth[3];
  double ux[3], uy[3];  // unit vectors along the edges

  // A point by the geodesics from the corners; each sets the word anew.
  void put(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

// On the sphere, away from the corners, their meridians and the poles.
struct ChamberlinOfSphere {
  // Nearer to a corner's meridian or to a pole other() looks closely.
  static constexpr double kNear = 1e-9;

  explicit ChamberlinOfSphere(const ChamberlinTriangle& t);

  // Whether the formula serves the triangle: no corner lies at a pole.
  bool serves() const;

  ChamberlinTriangle triangle;
  double sin_corner[3], cos_corner[3];

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat, V height) const {
    const ChamberlinTriangle& t = triangle;
    const auto at = sincos(lat);
    auto plain = abs(lat) < kHalfPi - kNear;
    V d[3], azimuth[3];
    for (int j = 0; j < 3; ++j) {
      // Haversine formula: Snyder, USGS Professional Paper 1395 (1987), eq. 5-3a, 5-4b.
      const auto half = sincos(0.5 * (lon - t.corner[j].x));
      const V half_lat = sincos(0.5 * (lat - t.corner[j].y)).sin;
      const V h = square(half.sin) * (at.cos * cos_corner[j]) + square(half_lat);
      d[j] = 2.0 * asin(sqrt(lesser(h, V(1.0))));
      const V sin_dl = 2.0 * half.sin * half.cos;
      const V turn =
          atan2(sin_dl * at.cos,
                at.sin * cos_corner[j] - (1.0 - 2.0 * square(half.sin)) * (at.cos * sin_corner[j]));
      azimuth[j] = select(turn < -1e-12, turn + kTwoPi, turn);
      plain = plain & (abs(sin_dl) > kNear);
    }
    V x[3], y[3];
    for (int j = 0; j < 3; ++j) {
      // The side of the edge on which the point lies.
      const double edge = t.azimuth[j];
      const auto below = (azimuth[j] > edge - kPi) & (azimuth[j] < edge);
      const V s = select(below | (azimuth[j] > edge + kPi), V(-1.0), V(1.0));
      const V cosine =
          (square(d[j]) + square(t.side[j]) - square(d[(j + 1) % 3])) / (2.0 * t.side[j] * d[j]);
      const auto inside = abs(cosine) < 1.0;
      plain = plain & inside;
      const V c = select(inside, cosine, 0.0);
      const V q = sqrt(1.0 - square(c));
      x[j] = (s * t.uy[j] * q + t.ux[j] * c) * d[j] + t.place[j].x;
      y[j] = (c * t.uy[j] - s * t.ux[j] * q) * d[j] + t.place[j].y;
    }
    return {(x[1] + x[2] + x[0]) / 3.0, (y[1] + y[2] + y[0]) / 3.0, height, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::ChamberlinOfSphere)
