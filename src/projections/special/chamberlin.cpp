// Chamberlin trimetric projection of the ellipsoid: a point is placed by its geodesic distances
// from the three corners of a triangle.
// A. H. J. Christensen, The Chamberlin trimetric projection, Cartography and Geographic Information
// Systems 19 (1992), pp. 88-100.

#include "projections/special/chamberlin_points.hpp"

#include <cmath>

#include "points/portable.hpp"
#include "projections/turn_points.hpp"
#include "tidewater/chamberlin.h"
#include "tidewater/generic_inverse.h"
#include "tidewater/geodesic.h"

using namespace tidewater::detail;

namespace {

// All geodesics are solved on this semi-major axis and divided by it.
constexpr double kAxis = 6000000.0;

// Half the distance between the two points that tell where north is.
constexpr double kNorthProbe = 0.0001;

int next_corner(int j) { return (j + 1) % 3; }

// The side of a triangle's edge on which an azimuth at its first corner points.
double side_of(double edge_azimuth, double azimuth) {
  if (edge_azimuth - kPi < azimuth && azimuth < edge_azimuth) return -1;
  return edge_azimuth + kPi >= azimuth ? 1 : -1;
}

// The angle whose cosine is c; a cosine out of range is rounded, not clamped.
double angle_of(double c) {
  if (c > -1 && c < 1) return portable::acos(c);
  return std::floor(c + 0.5) <= -1 ? kPi : 0;
}

double geodesic(const CoordinateTriple& from, const CoordinateTriple& to, double e, double* azimuth,
                double* back_azimuth, TWstatus* status) {
  double distance = 0;
  TWgeodesic_inv(from, to, kAxis, e, azimuth, back_azimuth, &distance, status);
  return distance / kAxis;
}

// Turns the corners about the origin so that north at a point lies at an angle to the x axis.
void turn_to_north(double e, const CoordinateTriple* control, const double* sides,
                   const double* azimuths, CoordinateTriple* plane, double lon, double lat,
                   double north, TWstatus* status) {
  const CoordinateTriple probes[2] = {{lon, lat - kNorthProbe, 0}, {lon, lat + kNorthProbe, 0}};
  CoordinateTriple image[2] = {};
  TWchamtri_f(e, control, sides, azimuths, plane, 2, probes, image, status);
  if (!TW_OK(*status)) return;
  const double angle = north - portable::atan2(image[1].y - image[0].y, image[1].x - image[0].x);
  turn_points(angle, 3, plane);
}

}  // namespace

void TWchamtri_c(TWtransform forward, TWcontext context, int16_t mode, double e,
                 const CoordinateTriple* control, double* sides, double* azimuths,
                 CoordinateTriple* plane, double* lon_c, double* lat_c, double* rotation,
                 TWstatus* status) {
  *status = TW_SUCCESS;
  double back = 0;
  for (int j = 0; j < 3; ++j) {
    sides[j] = geodesic(control[j], control[next_corner(j)], e, &azimuths[j], &back, status);
  }
  // back is now the azimuth from corner 0 to corner 2.
  const double s = side_of(azimuths[0], back);
  const double a = sides[0];
  const double b = sides[1];
  const double c = sides[2];
  if (mode == 0) {
    // The median from corner 0 lies along the x axis, two thirds of it west of the centroid.
    const double m = std::sqrt(std::fabs(2 * c * c + 2 * a * a - b * b) / 4);
    plane[0].x = -2 * m / 3;
    plane[0].y = 0;
    const double a0 = angle_of((a * a + m * m - b * b / 4) / (2 * a * m));
    const double a2 = angle_of((c * c + m * m - b * b / 4) / (2 * c * m));
    plane[1].x = portable::cos(a0) * a + plane[0].x;
    plane[1].y = portable::sin(a0) * a * s;
    plane[2].x = portable::cos(a2) * c + plane[0].x;
    plane[2].y = -s * portable::sin(a2) * c;
    const CoordinateTriple origin = {};
    CoordinateTriple place = {};
    TWgeneric_i(forward, context, 0, 0, 0, 1, &origin, &place, status);
    if (!TW_OK(*status)) return;
    *lon_c = place.x;
    *lat_c = place.y;
    turn_to_north(e, control, sides, azimuths, plane, place.x, place.y, kHalfPi, status);
    if (!TW_OK(*status)) return;
    *rotation = kHalfPi;
  } else if (mode == 1) {
    const double cos_0 = (c * c + a * a - b * b) / (2 * c * a);
    const double sin_0 = std::sqrt(1 - cos_0 * cos_0);
    plane[0].x = 0;
    plane[0].y = 0;
    plane[1].x = a;
    plane[1].y = 0;
    plane[2].x = c * cos_0;
    plane[2].y = -s * c * sin_0;
    const CoordinateTriple centre = {*lon_c, *lat_c, 0};
    CoordinateTriple image = {};
    TWchamtri_f(e, control, sides, azimuths, plane, 1, &centre, &image, status);
    if (!TW_OK(*status)) return;
    for (int j = 0; j < 3; ++j) {
      plane[j].x -= image.x;
      plane[j].y -= image.y;
    }
    turn_to_north(e, control, sides, azimuths, plane, *lon_c, *lat_c, *rotation, status);
  } else {
    *status = TW_BAD_INPUT;
  }
}

namespace tidewater::detail {

ChamberlinTriangle::ChamberlinTriangle(double eccentricity, const CoordinateTriple* control,
                                       const double* sides, const double* azimuths,
                                       const CoordinateTriple* plane)
    : e(eccentricity) {
  for (int j = 0; j < 3; ++j) {
    corner[j] = control[j];
    place[j] = plane[j];
    side[j] = sides[j];
    azimuth[j] = azimuths[j];
    const auto& to = plane[next_corner(j)];
    ux[j] = (to.x - plane[j].x) / sides[j];
    uy[j] = (to.y - plane[j].y) / sides[j];
  }
}

void ChamberlinTriangle::put(const CoordinateTriple& in, CoordinateTriple* out,
                             TWstatus* status) const {
  const CoordinateTriple p = in;
  double turn[3] = {};
  double d[3];
  for (int j = 0; j < 3; ++j) {
    double ignored = 0;
    d[j] = geodesic(corner[j], p, e, &turn[j], &ignored, status);
  }
  double x[3];
  double y[3];
  for (int j = 0; j < 3; ++j) {
    if (d[j] == 0) {  // a corner: the mean of three equal values, without its rounding
      *out = {place[j].x, place[j].y, p.z};
      return;
    }
    const double s = side_of(azimuth[j], turn[j]);
    double c = (square(d[j]) + square(side[j]) - square(d[next_corner(j)])) / (2 * side[j] * d[j]);
    double q = 0;
    if (c > -1 && c < 1) {
      q = std::sqrt(1 - c * c);
    } else {
      c = std::floor(c + 0.5);
    }
    x[j] = (s * uy[j] * q + ux[j] * c) * d[j] + place[j].x;
    y[j] = (c * uy[j] - s * ux[j] * q) * d[j] + place[j].y;
  }
  *out = {(x[1] + x[2] + x[0]) / 3, (y[1] + y[2] + y[0]) / 3, p.z};
}

ChamberlinOfSphere::ChamberlinOfSphere(const ChamberlinTriangle& t) : triangle(t) {
  for (int j = 0; j < 3; ++j) {
    sin_corner[j] = portable::sin(t.corner[j].y);
    cos_corner[j] = portable::cos(t.corner[j].y);
  }
}

bool ChamberlinOfSphere::serves() const {
  constexpr double kSphereLimit = 1e-12;  // of the geodesic's functions
  for (const auto& corner : triangle.corner) {
    if (!(std::fabs(corner.y) < kHalfPi - kNear)) return false;
  }
  return triangle.e < kSphereLimit;
}

Next ChamberlinOfSphere::other(const CoordinateTriple& in, CoordinateTriple* out,
                               TWstatus* status) const {
  triangle.put(in, out, status);
  return Next::point;
}

}  // namespace tidewater::detail

void TWchamtri_f(double e, const CoordinateTriple* control, const double* sides,
                 const double* azimuths, const CoordinateTriple* plane, int32_t count,
                 const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  if (count <= 0) return;
  const ChamberlinTriangle triangle(e, control, sides, azimuths, plane);
  const ChamberlinOfSphere sphere(triangle);
  if (sphere.serves()) {
    const CoordinateTriple last = in[count - 1];
    over_points(sphere, count, in, out);
    // Each of a point's three geodesics sets the caller's word anew: that of the last one stays.
    double ignored = 0, back = 0;
    geodesic(control[2], last, e, &ignored, &back, status);
    return;
  }
  // One by one: on the ellipsoid each geodesic is an iteration of its own.
  for (int32_t i = 0; i < count; ++i) triangle.put(in[i], out + i, status);
}
