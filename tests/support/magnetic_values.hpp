// Published values of magnetic models.
#pragma once

namespace tidewater::test {

// Test values of the WMM2025 technical report, at height 0, to the digits printed: degrees,
// nanotesla.
struct PublishedField {
  double date, lat, lon, X, Y, Z, F, I, D;
};
inline constexpr PublishedField kWmm2025Values[] = {
    {2025, 80, 0, 6521.6, 145.9, 54791.5, 55178.5, 83.21, 1.28},
    {2025, 0, 120, 39677.8, -109.6, -10580.2, 41064.3, -14.93, -0.16},
    {2025, -80, 240, 6117.5, 15751.9, -52022.5, 54698.2, -72.00, 68.78},
    {2027.5, 80, 0, 6500.8, 294.5, 54869.4, 55253.9, 83.24, 2.59},
};

}  // namespace tidewater::test
