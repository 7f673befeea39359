// The end of a line and the line between two points, by the functions of either kind of line.
#pragma once

#include "support/points.hpp"

namespace tidewater::test {

struct LineEnd {
  CoordinateTriple end = kUntouchedPoint;
  double back = kUntouched;
  TWstatus status = 0;
};

template <auto function>
LineEnd line_end(CoordinateTriple start, double azimuth, double distance, Ellipsoid ellipsoid) {
  LineEnd r;
  function(start, azimuth, distance, ellipsoid.a, ellipsoid.e, &r.end, &r.back, &r.status);
  return r;
}

struct LineBetween {
  double azimuth = kUntouched;
  double back = kUntouched;
  double distance = kUntouched;
  TWstatus status = 0;
};

template <auto function>
LineBetween line_between(CoordinateTriple start, CoordinateTriple end, Ellipsoid ellipsoid) {
  LineBetween r;
  function(start, end, ellipsoid.a, ellipsoid.e, &r.azimuth, &r.back, &r.distance, &r.status);
  return r;
}

}  // namespace tidewater::test
