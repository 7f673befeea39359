// The Chamberlin trimetric projection: A. H. J. Christensen, The Chamberlin trimetric projection,
// Cartography and Geographic Information Systems 19 (1992), 88-100; J. P. Snyder and P. M. Voxland,
// An Album of Map Projections, USGS Professional Paper 1453 (1989).  Each side of the triangle of
// control points places a point by its distances from the two ends; the map takes the mean of the
// three.
#pragma once

#include <algorithm>
#include <array>
#include <cmath>

#include "formulas/constants.hpp"
#include "formulas/geodesic.hpp"

namespace tidewater::detail {

// Positions in radians; the plane in units of a.  The first two control points lie on a parallel to
// the abscissa, the origin half-way between them and level with the third.
struct Chamberlin {
  struct Position {
    double lon, lat;
  };
  struct Spot {
    double x, y;
  };

  Geodesics lines;
  std::array<Position, 3> control;
  std::array<Spot, 3> corner;
  std::array<SinCos<double>, 3> azimuth;  // of the sides, each from its point to the next
  std::array<double, 3> side;

  Chamberlin(double f, const std::array<Position, 3>& points) : lines(1, f), control(points) {
    for (std::size_t j = 0; j < 3; ++j) {
      const auto arc = line(control[j], control[(j + 1) % 3]);
      azimuth[j] = arc.azimuth1;
      side[j] = arc.length;
    }
    // The third point lies to the right of the way from the first to the second, or to the left.
    const auto to_third = line(control[0], control[2]);
    const double turn =
        to_third.azimuth1.sin * azimuth[0].cos - to_third.azimuth1.cos * azimuth[0].sin;
    const double c =
        (side[0] * side[0] + side[2] * side[2] - side[1] * side[1]) / (2 * side[0] * side[2]);
    const double height =
        std::copysign(side[2] * std::sqrt(std::max(0.0, (1 - c) * (1 + c))), turn);
    corner = {Spot{-side[0] / 2, height}, Spot{side[0] / 2, height},
              Spot{side[2] * c - side[0] / 2, 0}};
  }

  // Do the points make a triangle?
  bool good() const {
    const double longest = std::max({side[0], side[1], side[2]});
    return longest < 3 && std::fabs(corner[0].y) > 1e-6 * longest;
  }

  // False where a distance has no answer.
  bool forward(double lon, double lat, Spot* spot) const {
    std::array<GeodesicArc<double>, 3> from;
    for (std::size_t j = 0; j < 3; ++j) {
      from[j] = line(control[j], {lon, lat});
      if (!from[j].plain) return false;
      if (from[j].length == 0) {
        *spot = corner[j];
        return true;
      }
    }
    *spot = {0, 0};
    for (std::size_t j = 0; j < 3; ++j) {
      const std::size_t next = (j + 1) % 3;
      const double d = from[j].length;
      const double away = from[next].length;
      const double c =
          std::clamp((d * d + side[j] * side[j] - away * away) / (2 * side[j] * d), -1.0, 1.0);
      const SinCos<double> to = from[j].azimuth1;
      const double right = to.sin * azimuth[j].cos - to.cos * azimuth[j].sin;
      const double s = std::copysign(std::sqrt((1 - c) * (1 + c)), right);
      const double ux = (corner[next].x - corner[j].x) / side[j];
      const double uy = (corner[next].y - corner[j].y) / side[j];
      spot->x += corner[j].x + d * (c * ux + s * uy);
      spot->y += corner[j].y + d * (c * uy - s * ux);
    }
    spot->x /= 3;
    spot->y /= 3;
    return true;
  }

  // By Newton's method from the triangle's own coordinates.  False where that finds nothing.
  bool inverse(double x, double y, Position* position) const {
    Position at = start({x, y});
    constexpr double kStep = 1e-6;
    double least = 1e300;
    for (int i = 0; i < 50; ++i) {
      Spot here;
      if (!forward(at, &here)) return false;
      const double dx = x - here.x;
      const double dy = y - here.y;
      const double off = std::hypot(dx, dy);
      if (off < least) {
        *position = at;
        least = off;
      } else if (least < kNear) {
        break;  // nothing is left but rounding
      }
      if (off < 1e-16) break;
      Spot e;
      Spot n;
      if (!forward(moved(at, kStep, 0), &e) || !forward(moved(at, 0, kStep), &n)) return false;
      const double xe = (e.x - here.x) / kStep;
      const double ye = (e.y - here.y) / kStep;
      const double xn = (n.x - here.x) / kStep;
      const double yn = (n.y - here.y) / kStep;
      const double whole = xe * yn - xn * ye;
      if (!(std::fabs(whole) > 1e-6)) return false;
      double east = (dx * yn - dy * xn) / whole;
      double up = (dy * xe - dx * ye) / whole;
      const double shorter = std::min(1.0, 0.5 / std::hypot(east, up));
      east *= shorter;
      up *= shorter;
      at = moved(at, east, up);
    }
    return least < kNear;
  }

 private:
  // Next to the sides, where the distances hardly tell how far off a point lies.
  static constexpr double kNear = 1e-9;

  GeodesicArc<double> line(const Position& from, const Position& to) const {
    return lines.any_line(from.lat * kDegreesPerRadian, from.lon * kDegreesPerRadian,
                          to.lat * kDegreesPerRadian, to.lon * kDegreesPerRadian);
  }

  bool forward(const Position& at, Spot* spot) const { return forward(at.lon, at.lat, spot); }

  // A small way east and north along the great circle, so that it may pass a pole.
  static Position moved(const Position& at, double east, double north) {
    const double s = std::sin(at.lat);
    const double c = std::cos(at.lat);
    const double out = c - north * s;
    return {std::remainder(at.lon + std::atan2(east, out), 2 * kPi),
            std::atan2(s + north * c, std::hypot(out, east))};
  }

  Position start(const Spot& spot) const {
    const auto cross = [](const Spot& a, const Spot& b, const Spot& c) {
      return (b.x - a.x) * (c.y - a.y) - (b.y - a.y) * (c.x - a.x);
    };
    const double whole = cross(corner[0], corner[1], corner[2]);
    double sum[3] = {0, 0, 0};
    for (std::size_t j = 0; j < 3; ++j) {
      const double weight = cross(spot, corner[(j + 1) % 3], corner[(j + 2) % 3]) / whole;
      const double c = std::cos(control[j].lat);
      sum[0] += weight * c * std::cos(control[j].lon);
      sum[1] += weight * c * std::sin(control[j].lon);
      sum[2] += weight * std::sin(control[j].lat);
    }
    return {std::atan2(sum[1], sum[0]), std::atan2(sum[2], std::hypot(sum[0], sum[1]))};
  }
};

}  // namespace tidewater::detail
