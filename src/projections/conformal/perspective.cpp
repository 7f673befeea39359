// Vertical and tilted perspective projections of the sphere and the ellipsoid.

#include <cmath>

#include "formulas/wraps.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::detail;

namespace {

constexpr int kMostPasses = 10;

// The image is turned by rot less half a turn: by nothing for half a turn either way.
bool turns(double rot) { return std::fabs(std::fabs(rot) - kPi) > 1e-12; }

// Turns points clockwise by w, written over themselves.
void rotate(double w, int32_t count, CoordinateTriple* points) {
  const double s = std::sin(w);
  const double c = std::cos(w);
  for (int32_t i = 0; i < count; ++i) {
    const double x = points[i].x;
    const double y = points[i].y;
    points[i].x = s * y + c * x;
    points[i].y = -s * x + c * y;
  }
}

struct LonLat {
  double lon, lat;
  bool done;
};

// The line of sight through a plane point, met with an ellipsoid that is grown until it passes
// through the height of the point.
class EllipsoidSight {
 public:
  EllipsoidSight(double a, double e, double lon0, double lat0, double h, double p, double phi_g)
      : a_(a),
        lon0_(lon0),
        h_(h),
        e2_(e * e),
        sin0_(std::sin(lat0)),
        cos0_(std::cos(lat0)),
        b_(std::cos(lat0 - phi_g) * p),
        d_(std::sin(lat0 - phi_g) * p),
        a1_(1 - cos0_ * cos0_ * e2_),
        a2_(1 - sin0_ * sin0_ * e2_),
        a3_(2 * cos0_ * sin0_ * e2_),
        a4_(1 - e2_),
        from_center_((1 - square(std::cos(phi_g)) * e2_) * p * p) {}

  LonLat meet(double x, double y, double height) const {
    const double f = -2 * b_ * a1_ * h_ - 2 * d_ * a2_ * y + d_ * h_ * a3_ + b_ * a3_ * y;
    const double quadratic = a2_ * y * y + a1_ * h_ * h_ - h_ * a3_ * y + a4_ * x * x;
    double grown = 1.0;
    double t = 0;
    double v = 0;
    LonLat at = {0, 0, false};
    for (int pass = 0; pass < kMostPasses && !at.done; ++pass) {
      const double g = from_center_ - a4_ * grown;
      t = (std::sqrt(f * f - 4 * g * quadratic) - f) / (2 * g);
      v = y / t - d_;
      const double u = (b_ - h_ / t) * sin0_ + v * cos0_;
      if (pass == 0) {
        if (height == 0) {
          at.lat = std::atan(u / std::sqrt((a4_ - u * u) * a4_));
          at.done = true;
          break;
        }
        at.lat = std::asin(u);
      }
      const double previous = at.lat;
      const double s2 = square(std::sin(previous));
      const double w = 1 - s2 * e2_;
      at.lat = std::asin(u / (a4_ / std::sqrt(w) + height / a_));
      at.done = std::fabs(at.lat - previous) < 1e-12;
      grown = square(1 / std::sqrt(w) + height / a_) -
              (1 / w - height * height / (a_ * a_ - a_ * a_ * e2_)) * s2 * e2_;
    }
    at.lon = std::atan2(a_ * x / t, ((b_ - h_ / t) * cos0_ - v * sin0_) * a_) + lon0_;
    return at;
  }

 private:
  double a_, lon0_, h_, e2_, sin0_, cos0_, b_, d_, a1_, a2_, a3_, a4_, from_center_;
};

// The same with a sphere.
class SphereSight {
 public:
  SphereSight(double a, double lon0, double lat0, double h, double p)
      : a_(a), lon0_(lon0), h_(h), sin0_(std::sin(lat0)), cos0_(std::cos(lat0)), p_(p) {}

  LonLat meet(double x, double y, double height) const {
    const double f = -2 * p_ * h_;
    const double quadratic = y * y + x * x + h_ * h_;
    double grown = 1.0;
    double t = 0;
    double v = 0;
    LonLat at = {0, 0, false};
    for (int pass = 0; pass < kMostPasses && !at.done; ++pass) {
      const double g = p_ * p_ - grown;
      t = (std::sqrt(f * f - 4 * g * quadratic) - f) / (2 * g);
      v = y / t;
      const double u = (p_ - h_ / t) * sin0_ + v * cos0_;
      if (pass == 0) {
        if (height == 0) {
          at.lat = std::atan(u / std::sqrt(1 - u * u));
          at.done = true;
          break;
        }
        at.lat = std::asin(u);
      }
      const double previous = at.lat;
      at.lat = std::asin(u / (height / a_ + 1));
      at.done = std::fabs(at.lat - previous) < 1e-12;
      grown = square(height / a_ + 1);
    }
    at.lon = std::atan2(a_ * x / t, ((p_ - h_ / t) * cos0_ - v * sin0_) * a_) + lon0_;
    return at;
  }

 private:
  double a_, lon0_, h_, sin0_, cos0_, p_;
};

template <class Sight>
void meet_all(const Sight& sight, double a, int32_t count, const CoordinateTriple* in,
              CoordinateTriple* out, TWstatus* status) {
  for (int32_t i = 0; i < count; ++i) {
    const auto [x, y, height] = in[i];
    const LonLat at = sight.meet(x * a, y * a, height);
    if (!at.done) *status = TW_I_LATITUDE_LIMITED;
    out[i] = {at.lon, at.lat, height};
  }
}

}  // namespace

void TWpersp_c(double a, double e, double lat0, double h, double h0, double* p, double* phi_g,
               TWstatus* status) {
  *status = TW_SUCCESS;
  const double height = h + h0;
  if (e == 0) {
    *phi_g = lat0;
    *p = height / a + 1;
    return;
  }
  const double e2 = e * e;
  const double sin0 = std::sin(lat0);
  const double cos0 = std::cos(lat0);
  const double n1 = a / std::sqrt(1 - sin0 * sin0 * e2);
  double latitude = lat0;
  double distance = 0;
  double latitude_step = 0;
  double distance_step = 0;
  for (int pass = 0; pass < kMostPasses; ++pass) {
    const double previous_latitude = latitude;
    const double previous_distance = distance;
    distance = cos0 / std::cos(latitude) * (height + n1) / a;
    latitude = lat0 - std::asin(sin0 * n1 * e2 * cos0 / (distance * a));
    latitude_step = std::fabs(latitude - previous_latitude);
    distance_step = std::fabs(distance - previous_distance);
    if (latitude_step < 1e-15 && distance_step < 1e-15) break;
  }
  if (latitude_step > 1e-12 || distance_step > 1e-12) *status = TW_BAD_PARAMETER;
  *p = distance;
  *phi_g = latitude;
}

void TWpersp_vert_f(double a, double e, double lon0, double lat0, double /*h0*/, double h, double p,
                    double phi_g, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                    TWstatus* status) {
  *status = TW_SUCCESS;
  const bool sphere = e == 0;
  const double e2 = e * e;
  const double sin0 = std::sin(lat0);
  const double cos0 = std::cos(lat0);
  // On the sphere the geocentric latitude is the geodetic one.
  const double along = sphere ? p : std::cos(lat0 - phi_g) * p;
  const double across = sphere ? 0 : std::sin(lat0 - phi_g) * p;
  for (int32_t i = 0; i < count; ++i) {
    const auto [lon, lat, height] = in[i];
    const double sin_lat = std::sin(lat);
    const double cos_lat = std::cos(lat);
    const double sin_d = std::sin(lon - lon0);
    const double cos_d = std::cos(lon - lon0);
    double nu = a;
    if (sphere) {
      const double cc = cos_d * cos0 * cos_lat + sin0 * sin_lat;
      if (1 / p > cc) {  // beyond the horizon; wanted on the sphere alone
        *status = TW_NOT_CONVERGED;
        return;
      }
    } else {
      nu = a / std::sqrt(1 - sin_lat * sin_lat * e2);
    }
    const double c = (nu + height) / a * cos_lat;
    const double s = ((1 - e2) * nu + height) / a * sin_lat;
    const double k = h / (along - sin0 * s - cos_d * cos0 * c);
    out[i] = {sin_d * c * k / a, (across + cos0 * s - cos_d * c * sin0) * k / a, height};
  }
}

void TWpersp_vert_i(double a, double e, double lon0, double lat0, double /*h0*/, double h, double p,
                    double phi_g, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                    TWstatus* status) {
  *status = TW_SUCCESS;
  if (e == 0) {
    meet_all(SphereSight(a, lon0, lat0, h, p), a, count, in, out, status);
  } else {
    meet_all(EllipsoidSight(a, e, lon0, lat0, h, p, phi_g), a, count, in, out, status);
  }
}

void TWpersp_f(double a, double e, double lon0, double lat0, double h0, double h, double p,
               double phi_g, double tilt_a, double tilt_b, double rot, int32_t count,
               const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  TWpersp_vert_f(a, e, lon0, lat0, h0, h, p, phi_g, count, in, out, status);
  if (!TW_OK(*status)) return;
  if (tilt_a != 0 || tilt_b != 0) {
    const double sa = std::sin(tilt_a);
    const double ca = std::cos(tilt_a);
    const double sb = std::sin(tilt_b);
    const double cb = std::cos(tilt_b);
    for (int32_t i = 0; i < count; ++i) {
      const double x = out[i].x;
      const double y = out[i].y;
      const double t = x * sa + y * ca;
      const double dn = t * a * sb / h + cb;
      out[i].x = (x * ca - y * sa) * cb / dn;
      out[i].y = t / dn;
    }
  }
  if (turns(rot)) rotate(rot - kPi, count, out);
}

void TWpersp_i(double a, double e, double lon0, double lat0, double h0, double h, double p,
               double phi_g, double tilt_a, double tilt_b, double rot, int32_t count,
               CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  // By contract: the rotation is undone in the caller's input array.
  if (turns(rot)) rotate(-(rot - kPi), count, in);
  const CoordinateTriple* upright = in;
  if (tilt_a != 0 || tilt_b != 0) {
    const double sa = std::sin(tilt_a);
    const double ca = std::cos(tilt_a);
    const double sb = std::sin(tilt_b);
    const double cb = std::cos(tilt_b);
    for (int32_t i = 0; i < count; ++i) {
      const auto [x, y, height] = in[i];
      const double dn = h - a * y * sb;
      const double u = x * h / dn;
      const double v = y * h * cb / dn;
      out[i] = {u * ca + sa * v, v * ca - sa * u, height};
    }
    upright = out;
  }
  TWpersp_vert_i(a, e, lon0, lat0, h0, h, p, phi_g, count, upright, out, status);
}
