// The space oblique Mercator projection of a satellite on a circular orbit, over a whole orbit:
// J. P. Snyder, Space Oblique Mercator Projection: Mathematical Development, USGS Bulletin 1518
// (1981); Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), section 27.
//
// L is the satellite's angle from the ascending node.  Scan lines are found by Newton's method on
// L, positions on them from the ellipsoid itself, so that nothing is lost where the track turns at
// its northernmost and southernmost points.
#pragma once

#include <algorithm>
#include <cmath>
#include <utility>
#include <vector>

#include "formulas/constants.hpp"

namespace tidewater::detail {

// Fourier coefficients of a track, as TWsom_c() works them out.
struct TrackSeries {
  double Q, T, W;
  std::vector<double> C, S, X1, X2, X3, X4;
  double m_sin, m_cos, sum3, sum4;
};

// Longitudes from the ascending node, latitudes; x along the track, y to its left, in units of a.
struct SpaceObliqueMercator {
  double G, sin_inc, cos_inc, ratio, first;
  TrackSeries track;

  // The ratio is that of the satellite's revolution to the Earth's rotation; the map begins at the
  // angle `start` and goes on for one orbit.
  SpaceObliqueMercator(double e2, double inclination, double period_ratio, double start,
                       TrackSeries series)
      : G(1 - e2),
        sin_inc(std::sin(inclination)),
        cos_inc(std::cos(inclination)),
        ratio(period_ratio),
        first(start),
        track(std::move(series)),
        length_(std::hypot(track.m_sin, track.m_cos)) {}

  // Where the maps of two orbits meet, the ground lies on both or on neither; the map is read so
  // far beyond its ends, as the Earth turns by less in one orbit.
  static constexpr double kBeyond = 0.5;

  bool forward(double lon, double lat, double* x, double* y) const {
    const double s = std::sin(lat);
    const double w = std::sqrt(1 - (1 - G) * s * s);
    const double across = std::cos(lat) / w;
    const double up = G * s / w;
    double L = 0;
    if (!angle(lon, across, up, first + kPi, &L)) return false;
    double sine = across_track(lon, across, up, L);
    // Next to the ends there may be two scan lines through a point: on this orbit, or the nearer.
    const double from_middle = L - (first + kPi);
    double other = 0;
    if (std::fabs(from_middle) > kPi - kBeyond &&
        angle(lon, across, up, L - std::copysign(2 * kPi, from_middle), &other)) {
      const double other_sine = across_track(lon, across, up, other);
      const bool here = L >= first && L <= first + 2 * kPi;
      const bool there = other >= first && other <= first + 2 * kPi;
      if (there && (!here || std::fabs(other_sine) < std::fabs(sine))) {
        L = other;
        sine = other_sine;
      }
    }
    const double v = std::atanh(sine);
    const Place at = place(L);
    const double X = at.X - v * at.cx;
    const double Y = at.Y + v * at.cy;
    *x = (X * track.m_sin + Y * track.m_cos) / length_;
    *y = (Y * track.m_sin - X * track.m_cos) / length_;
    return std::isfinite(*x) && std::isfinite(*y);
  }

  bool inverse(double x, double y, double* lon, double* lat) const {
    const double X = (track.m_sin * x - track.m_cos * y) / length_;
    const double Y = (track.m_sin * y + track.m_cos * x) / length_;
    // The scan line through the point: its distance from there grows with the mean speed.
    double L = x / length_;
    Place at = place(L);
    for (int i = 0;; ++i) {
      if (i == 100) return false;
      const double step =
          ((X - at.X) * at.cy + (Y - at.Y) * at.cx) / (at.cy * track.m_sin + at.cx * track.m_cos);
      L += step;
      at = place(L);
      if (std::fabs(step) < 1e-15 * (1 + std::fabs(L))) break;
    }
    if (!(L >= first - kBeyond && L <= first + 2 * kPi + kBeyond)) return false;
    const double z = std::tanh((Y - at.Y) * at.cy - (X - at.X) * at.cx);
    // The point of the ellipsoid x^2 + y^2 + z^2 / G = 1 on this scan line.
    const double c = std::cos(L);
    const double s = std::sin(L);
    const double a = c * c + s * s * (cos_inc * cos_inc + sin_inc * sin_inc / G);
    const double b = s * z * cos_inc * sin_inc * (1 / G - 1);
    const double d = z * z * (sin_inc * sin_inc + cos_inc * cos_inc / G) - 1;
    const double root = b * b - a * d;
    if (!(root >= 0)) return false;
    const double rho = (std::sqrt(root) - b) / a;
    const double px = rho * c;
    const double py = rho * s * cos_inc - z * sin_inc;
    const double pz = rho * s * sin_inc + z * cos_inc;
    *lon = std::remainder(std::atan2(py, px) - ratio * L, 2 * kPi);
    *lat = std::atan2(pz, G * std::hypot(px, py));
    return std::isfinite(*lon) && std::isfinite(*lat);
  }

 private:
  // A place on the track and the direction of the scan line there, (-cx, cy).
  struct Place {
    double X, Y, cx, cy;
  };

  Place place(double L) const {
    double theta = 0;
    double t1 = 0;
    double t2 = 0;
    for (std::size_t n = 1; n <= track.C.size(); ++n) {
      const double c = std::cos(static_cast<double>(n) * L);
      const double s = std::sin(static_cast<double>(n) * L);
      theta += (1 - c) * track.S[n - 1] + s * track.C[n - 1];
      t1 += s * track.X1[n - 1] - c * track.X4[n - 1];
      t2 += s * track.X2[n - 1] - c * track.X3[n - 1];
    }
    const double s2 = std::sin(L) * std::sin(L);
    const double a1 = 1 + track.Q * s2;
    const double a2 = 1 + track.W * s2;
    const double b1 = (a2 / (a1 * a1) - ratio * cos_inc) * std::sqrt(a1 / a2);
    const double b4 = std::sqrt((1 + track.T * s2) / (a2 * a1)) * std::cos(L) * ratio * sin_inc;
    const double by = 1 / std::hypot(b1, b4);
    const double c = std::cos(theta);
    const double s = std::sin(theta);
    return {track.m_sin * L + t1 + track.sum4, track.m_cos * L + t2 + track.sum3,
            (c * b1 - s * b4) * by, (c * b4 + s * b1) * by};
  }

  // Sine of the angle at the earth's middle between a point and the track.
  double across_track(double lon, double across, double up, double L) const {
    return up * cos_inc - across * std::sin(lon + ratio * L) * sin_inc;
  }

  // The angle of the scan line through a point, next to where the search begins.
  bool angle(double lon, double across, double up, double from, double* L) const {
    *L = from;
    for (int i = 0; i < 100; ++i) {
      const double lt = lon + ratio * *L;
      const double x = across * std::cos(lt);
      const double s = across * std::sin(lt);
      const double y = s * cos_inc + up * sin_inc;
      const double slope = (x * x * cos_inc + y * s) / (x * x + y * y);
      const double gap = std::remainder(std::atan2(y, x) - *L, 2 * kPi);
      // Far off the track, next to its pole, Newton's step is too long.
      const double step = std::clamp(gap / (1 - ratio * slope), -1.0, 1.0);
      *L += step;
      if (std::fabs(step) < 1e-14) return true;
    }
    return false;
  }

  double length_;  // of the mean speed
};

}  // namespace tidewater::detail
