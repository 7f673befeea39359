// Interpolation between nodes.
// M. Abramowitz and I. A. Stegun, Handbook of Mathematical Functions (1964), section 25.2.
#pragma once

namespace tidewater::detail {

// In a cell with the values of its origin, a step along y, a step along x and across.
inline double bilinear(double p00, double p01, double p10, double p11, double fx, double fy) {
  return (p11 - p10 - p01 + p00) * fy * fx + (p01 - p00) * fy + (p10 - p00) * fx + p00;
}

// On three equally spaced values, at t spacings from the first; Newton's forward formula.
inline float quadratic(float t, float f0, float f1, float f2) {
  const float d1 = f1 - f0;
  const float d2 = f2 - f1;
  const float dd = d2 - d1;
  const double p = static_cast<double>(t);
  return static_cast<float>((p - 1) * p * static_cast<double>(dd) * 0.5 +
                            p * static_cast<double>(d1) + static_cast<double>(f0));
}

}  // namespace tidewater::detail
