// Datum shift by multiple regression equations.
// Defense Mapping Agency Technical Report 8350.2 (1991), appendix D.
#pragma once

#include "formulas/constants.hpp"
#include "points/over_points.hpp"
#include "tidewater/regression.h"

namespace tidewater::detail {

// Degrees brought back by whole turns: below -180 and above 180, or below 0 alone.
double regression_longitude(double lon, bool from_zero);

struct RegressionSum {
  const MreTerm* terms;
  int32_t count;
};

class Regression {
 public:
  static constexpr int kPowers = 10;

  struct Parameters {
    double sign;
    bool from_zero;  // By contract: longitudes from 0 on have no upper bound.
    double k, lon_offset, lat_offset;
    RegressionSum lon, lat, height;
  };

  explicit Regression(const Parameters& parameters);

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat, V height) const {
    V degrees = lon * kDegreesPerRadian;
    const double low = of_.from_zero ? 0.0 : -180.0;
    const Mask<V> outside = (degrees < low) | (everywhere<V>(!of_.from_zero) & (degrees > 180.0));
    mend(outside, degrees,
         [&](int i) { return regression_longitude(lane(degrees, i), of_.from_zero); });
    V u[kPowers];
    V v[kPowers];
    powers(of_.k * (lat * kDegreesPerRadian + of_.lat_offset), u);
    powers(of_.k * (degrees + of_.lon_offset), v);
    constexpr double kSecondsPerRadian = kDegreesPerRadian * 3600;
    const double seconds = of_.sign / kSecondsPerRadian;
    return {lon + seconds * sum(of_.lon, u, v), lat + seconds * sum(of_.lat, u, v),
            height + of_.sign * sum(of_.height, u, v), everywhere<V>(tabled_)};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;

 private:
  template <Number V>
  TW_INLINE static void powers(V base, V (&power)[kPowers]) {
    power[0] = 1.0;
    for (int k = 1; k < kPowers; ++k) power[k] = power[k - 1] * base;
  }

  template <Number V>
  TW_INLINE V sum(const RegressionSum& s, const V (&u)[kPowers], const V (&v)[kPowers]) const {
    V total = 0.0;
    // Where a power lies outside the table the sum is not used.
    const int32_t count = tabled_ ? s.count : 0;
    for (int32_t i = 0; i < count; ++i) {
      const MreTerm& term = s.terms[i];
      total = total + term.coefficient * u[term.power_u] * v[term.power_v];
    }
    return total;
  }

  Parameters of_;
  bool tabled_;  // all powers are those of a model, 0 to 9
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::Regression)
