// A camera's attitude in its three sets of angles.
// P. R. Wolf, Elements of Photogrammetry, 2nd edition (1983), on omega, phi, kappa and on tilt,
// swing, azimuth.

#include <cmath>

#include "formulas/constants.hpp"
#include "points/portable.hpp"
#include "tidewater/attitude.h"

using namespace tidewater::detail;

namespace {

// Tilts below this look straight down.
constexpr double kPlumb = 1e-12;
// How close to plus or minus one the sine of an angle at the end of its range stands.
constexpr double kPoleTolerance = 1e-13;

double take_off_a_turn(double angle) { return angle >= kTwoPi ? angle - kTwoPi : angle; }

}  // namespace

void TWcalc_matrix(double omega, double phi, double kappa, double* matrix, TWstatus* status) {
  *status = TW_SUCCESS;
  double* m = matrix;
  if (omega == 0 && phi == 0 && kappa == 0) {
    for (int i = 0; i < 9; ++i) m[i] = i % 4 == 0 ? 1 : 0;
    return;
  }
  const double cw = portable::cos(omega), sw = portable::sin(omega);
  const double cp = portable::cos(phi), sp = portable::sin(phi);
  const double ck = portable::cos(kappa), sk = portable::sin(kappa);
  m[0] = ck * cp - sk * sp * sw;
  m[1] = ck * sp * sw + cp * sk;
  m[2] = -cw * sp;
  m[3] = -sk * cw;
  m[4] = ck * cw;
  m[5] = sw;
  m[6] = cp * sk * sw + ck * sp;
  m[7] = sk * sp - ck * cp * sw;
  m[8] = cp * cw;
}

void TWopk_to_tsa(double omega, double phi, double kappa, double* tilt, double* swing,
                  double* azimuth, TWstatus* status) {
  *status = TW_SUCCESS;
  const double cw = portable::cos(omega), sw = portable::sin(omega);
  const double cp = portable::cos(phi), sp = portable::sin(phi);
  const double ck = portable::cos(kappa), sk = portable::sin(kappa);
  const double t = portable::acos(cp * cw);
  *tilt = t;
  if (std::fabs(t) < kPlumb) {
    *azimuth = 0;
    *swing = take_off_a_turn(-portable::atan2(cp * sk, -(ck * cp)));
    return;
  }
  *swing = portable::atan2(ck * sp * cw - sk * sw, -(sk * sp * cw + ck * sw));
  *azimuth = portable::atan2(-sp, sw * cp);
}

void TWtsa_to_opk(double tilt, double swing, double azimuth, double* omega, double* phi,
                  double* kappa, TWstatus* status) {
  *status = TW_SUCCESS;
  const double ct = portable::cos(tilt), st = portable::sin(tilt);
  const double cs = portable::cos(swing), ss = portable::sin(swing);
  const double ca = portable::cos(azimuth), sa = portable::sin(azimuth);
  const double r = -(sa * st);
  if (std::fabs(std::fabs(r) - 1) < kPoleTolerance) {
    *phi = r > 0 ? kHalfPi : -kHalfPi;
    *kappa = 0;
    *omega = portable::atan2(-(st * cs), -(sa * ss) - ca * cs * ct);
    return;
  }
  const double w = portable::atan2(ca * st, ct);
  const double q = std::fabs(portable::cos(w)) >= kPoleTolerance ? ct / portable::cos(w)
                                                                 : ca * st / portable::sin(w);
  const double p = portable::atan2(r, q);
  const double u = (ca * ss - sa * cs * ct) / portable::cos(p);
  const double v = (-(ca * cs) - sa * ss * ct) / portable::cos(p);
  *omega = w;
  *phi = p;
  *kappa = portable::atan2(-u, v);
}

void TWWxWyWzto_tsa(double wx, double wy, double wz, double lon, double lat, double* tilt,
                    double* swing, double* azimuth, TWstatus* status) {
  *status = TW_SUCCESS;
  const double cx = portable::cos(wx), sx = portable::sin(wx);
  const double cy = portable::cos(wy), sy = portable::sin(wy);
  const double cz = portable::cos(wz), sz = portable::sin(wz);
  const double cl = portable::cos(lon), sl = portable::sin(lon);
  const double cb = portable::cos(lat), sb = portable::sin(lat);
  const double t = portable::acos(cb * cl * sy - cb * sl * cy * sx + sb * cy * cx);
  const double g1 = cz * sy * sx + sz * cx;
  const double g2 = cz * cx - sz * sy * sx;
  *tilt = t;
  if (std::fabs(t) >= kPlumb) {
    const double n1 = g1 * cb * sl + (sz * sx - cz * sy * cx) * sb + cb * cl * cz * cy;
    const double d1 = g2 * cb * sl + (sz * sy * cx + cz * sx) * sb - cy * cb * cl * sz;
    *swing = portable::atan2(-n1, -d1);
    const double n2 = -(sy * sl) - cl * cy * sx;
    const double d2 = sb * sl * cy * sx - sy * sb * cl + cb * cy * cx;
    *azimuth = portable::atan2(-n2, -d2);
    return;
  }
  *azimuth = 0;
  *swing = take_off_a_turn(-portable::atan2(-(g2 * cl + sl * sz * cy), -(g1 * cl - cy * sl * cz)));
}

void TWtsa_toWxWyWz(double tilt, double swing, double azimuth, double lon, double lat, double* wx,
                    double* wy, double* wz, TWstatus* status) {
  *status = TW_SUCCESS;
  const double c0 = portable::cos(tilt), s0 = portable::sin(tilt);
  const double c1 = portable::cos(swing), s1 = portable::sin(swing);
  const double c2 = portable::cos(azimuth), s2 = portable::sin(azimuth);
  const double c3 = portable::cos(lon), s3 = portable::sin(lon);
  const double c4 = portable::cos(lat), s4 = portable::sin(lat);
  const double w = s4 * c3 * c2 * s0 + s3 * s2 * s0 + c4 * c3 * c0;
  const double h1 = c4 * s3;
  const double h2 = c2 * c1;
  const double h3 = h2 * c0;
  const double h4 = s2 * s1;
  const double h5 = (h3 + h4) * s4;
  const double h6 = c2 * s1;
  const double h7 = s2 * c1;
  const double h8 = h6 - h7 * c0;
  if (std::fabs(std::fabs(w) - 1) < kPoleTolerance) {
    *wy = w > 0 ? kHalfPi : -kHalfPi;
    *wz = 0;
    *wx = portable::atan2((-h4 - h3) * c4 - s4 * c1 * s0, h5 * s3 + h8 * c3 - h1 * c1 * s0);
    return;
  }
  const double u = s4 * s3 * c2 * s0 - s2 * c3 * s0 + h1 * c0;
  const double v = s4 * c0 - c2 * c4 * s0;
  const double x = portable::atan2(-u, v);
  const double q =
      std::fabs(portable::cos(x)) >= kPoleTolerance ? v / portable::cos(x) : -u / portable::sin(x);
  const double y = portable::atan2(w, q);
  const double n = (h5 * c3 - h8 * s3 - c4 * c3 * c1 * s0) / portable::cos(y);
  const double d =
      (-((h7 - h6 * c0) * s4 * c3) + (h4 * c0 + h2) * s3 - c4 * c3 * s1 * s0) / portable::cos(y);
  *wx = x;
  *wy = y;
  *wz = portable::atan2(-n, d);
}
