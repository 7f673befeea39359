// The elementary functions of one number, the same to the last bit on every machine.
//
// For what stands outside the loops over points: constants, the roads of odd points, calls with one
// line or place.  Each gives the bits of its namesake in elementary.hpp and is total; the standard
// library's own differ between platforms in the last bits, and so does what is computed from them.
#pragma once

namespace tidewater::detail::portable {

double sin(double v);
double cos(double v);
double tan(double v);  // 2.1 ulp
double asin(double v);
double acos(double v);
double atan(double v);
double atan2(double y, double x);
double sinh(double v);
double cosh(double v);
double asinh(double v);
double atanh(double v);
double log(double v);
double pow(double base, double exponent);  // 0.51 ulp, by logarithms of twice the digits
double hypot(double x, double y);          // 1.2 ulp

}  // namespace tidewater::detail::portable
