// Van der Grinten projection of the sphere.

#include <cmath>

#include "formulas/wraps.hpp"
#include "projections/special/cycle_watch.hpp"
#include "tidewater/special.h"

using namespace tidewater::detail;

namespace {

// Nearer than this to an axis, the formulas are those of the axis.
constexpr double kAxisMargin = 0.0003;
constexpr double kPiSquared = 9.869604401089358;
// The scale has no value this close to a pole.
constexpr double kScaleLatLimit = kHalfPi - 1e-14;

// cos(asin(s)); a not-a-number for a sine beyond 1.
double cosine_of_sine(double s) { return std::sqrt((1 - s) * (1 + s)); }

// Ordinate of the latitude on the central meridian: pi tan(theta / 2) with sin(theta) = 2 |lat| /
// pi.
double axis_ordinate(double lat) {
  const double s = 2 * std::fabs(lat / kPi);
  const double y = s / (1 + cosine_of_sine(s)) * kPi;
  return lat < 0 ? -y : y;
}

// Latitude of (X, Y) in units of pi, by Newton; Y is the size of the ordinate.
double latitude_of(double X, double Y, TWstatus* status) {
  double p = 2 * std::atan(Y);
  double previous = p + 1;
  CycleWatch watch;
  while (std::fabs(p - previous) > 1e-12) {
    previous = p;
    const double s = 2 * p / kPi;  // the sine of theta
    if (std::fabs(s) > 1) {
      *status = TW_I_LATITUDE_LIMITED;
      break;
    }
    const double c = cosine_of_sine(s);
    const double t = s / (1 + c);  // tan(theta / 2)
    const double G = c / (c + s - 1);
    const double B = Y / s - 1 / (c + 1);
    const double f = 2 - s;
    const double F = (X * X + Y * Y - 2 * f * G * B - t * t) * c * kQuarterPi;
    const double D = ((2 * c * c + 1) / c + (c - s) * f / (c + s - 1)) * G * B +
                     (c * Y / (1 - c) + t) * f * G / (c + 1) - (t * t - 1) * t;
    p -= F / D;
    if (watch.seen(p)) break;
  }
  return previous;  // By contract: the last step is not applied
}

struct Partials {
  double x_lon = 1, x_lat = 0, y_lon = 0, y_lat = 1;
};

// Derivatives of x and y by longitude difference d and latitude p.
Partials partials(double d, double p) {
  Partials j;
  if (std::fabs(p) < kAxisMargin) return j;
  constexpr double R = kPiSquared;
  const double S = std::sqrt(R - 4 * p * p);
  const double A = (kPi - S) * kPi / (2 * p);
  const double t = kPi - std::fabs(p);
  const double B = p * kPi / t;
  const double N = R - A * A;
  const double Dn = B - A;
  const double G = N / (2 * Dn);
  const double H = G - A;
  const double E = R / (t * t);
  const double dA = ((S - kPi) / (2 * p * p) + 2 / S) * kPi;
  const double dG = (H * dA - E * G) / Dn;
  const double sg = G >= 0 ? 1 : -1;
  const double W = (dG - dA) * sg;
  if (std::fabs(d) <= kAxisMargin) {
    j.x_lon = 1 - A * A / R;
    j.y_lat = dG - sg * W;
    return j;
  }
  const double d2 = d * d;
  const double J = (d2 - R) / (2 * d);
  const double K = (R + d2) / (2 * std::fabs(d));
  const double L = (R + d2) / (2 * d2);
  const double V = (d2 - R) / (2 * d) / std::fabs(d);
  const double f1 = W * std::fabs(H);
  const double f2 = 2 * dG * G - 2 * f1;
  const double f3 = 2 * dG * G + 2 * f1;
  const double H2 = H * H;
  const double G2 = G * G;
  const double KJ = K * K + J * J;
  const double C = std::sqrt(2 * H2 * KJ + 2 * R * G2 - square(G2 - H2) - R * R);
  const double sp = p * d >= 0 ? 1 : -1;
  const double den = 2 * (G2 + J * J);
  const double M = G2 + H2;
  const double X = (sp * G * C + (M - R) * J) / den;
  j.x_lat = ((sp * (2 * R * G2 / C + C) - 4 * G * X) * dG +
             (2 * f1 * KJ - f2 * (G2 - H2)) * (G / C) * sp + f3 * J) /
            den;
  j.x_lon = (H2 * G / C * sp * (2 * L * J + 2 * V * K) + (M - R - 4 * X * J) * L) / den;
  j.y_lon = (j.x_lon * J + X * L) / G;
  j.y_lat = (f2 * G - (2 * X * J + R + G2 - H2) * dG + 2 * j.x_lat * G * J) / (2 * G2);
  return j;
}

}  // namespace

void TWvdg_c(double lat0, double* y0) { *y0 = axis_ordinate(lat0); }

void TWvdg_f(double lon0, double y0, int32_t count, const CoordinateTriple* in,
             CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const double lat = in[i].y;
    const double d = wrap_below_then_above(in[i].x - lon0);
    if (std::fabs(lat) == kHalfPi) {
      out[i].x = 0;
      out[i].y = axis_ordinate(lat) - y0;
    } else if (std::fabs(d) >= kAxisMargin && std::fabs(lat) >= kAxisMargin) {
      const double s = 2 * std::fabs(lat / kPi);
      const double c = cosine_of_sine(s);
      const double A = std::fabs(kPi / d - d / kPi) / 2;
      const double G = c / (s + c - 1);
      const double P = (2 / s - 1) * G;
      const double q = A * A + P * P;
      const double u = (G - P * P) * A / q;
      const double X = std::sqrt(u * u - (G * G - P * P) / q) + u;
      const double Y = kPi * std::sqrt(1 - X * X - 2 * A * std::fabs(X));
      out[i].x = d < 0 ? -(X * kPi) : X * kPi;
      out[i].y = (lat < 0 ? -Y : Y) - y0;
    } else {
      out[i].x = d;
      out[i].y = axis_ordinate(lat) - y0;
    }
  }
}

void TWvdg_i(double lon0, double y0, int32_t count, const CoordinateTriple* in,
             CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double yy = in[i].y + y0;
    double lon = lon0 + x;
    double lat = 0;
    if (std::fabs(x) >= kAxisMargin && std::fabs(yy) >= kAxisMargin) {
      const double X = x / kPi;
      const double Y = yy / kPi;
      const double Q = (1 - X * X - Y * Y) / (2 * std::fabs(X));
      const double d = (std::sqrt(Q * Q + 1) - Q) * kPi;
      lon = x < 0 ? lon0 - d : lon0 + d;
      lat = latitude_of(X, std::fabs(Y), status);
    } else {
      lat = std::sin(2 * std::atan(std::fabs(yy / kPi))) * kHalfPi;
    }
    out[i].x = lon;
    out[i].y = yy < 0 ? -lat : lat;
  }
}

void TWvdg_s(double k0, double lon0, int32_t count, const CoordinateTriple* in,
             CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const double lat = in[i].y;
    if (lat >= kScaleLatLimit || lat <= -kScaleLatLimit) {
      *status = TW_BAD_LATITUDE;
      out[i] = {k0, k0, k0 * k0};
      continue;
    }
    const Partials j = partials(wrap_above_then_at_or_below(in[i].x - lon0), lat);
    const double m1 = std::sqrt(j.x_lon * j.x_lon + j.y_lon * j.y_lon);
    const double m2 = std::sqrt(j.x_lat * j.x_lat + j.y_lat * j.y_lat);
    const double k = k0 * m1 / std::cos(lat);
    const double h = k0 * m2;
    const double c = std::fabs(j.x_lon * j.x_lat + j.y_lat * j.y_lon) / (m2 * m1);
    out[i] = {k, h, std::sqrt(1 - c * c) * h * k};
  }
}
