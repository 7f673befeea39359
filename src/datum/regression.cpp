// Datum shift by multiple regression equations: powers that no model has, and the exported
// function.

#include "datum/regression_points.hpp"

#include <algorithm>
#include <cmath>

#include "formulas/wraps.hpp"

using namespace tidewater::detail;

namespace {

bool tabled(const RegressionSum& s) {
  const auto is_power = [](int16_t k) { return k >= 0 && k < Regression::kPowers; };
  return std::all_of(s.terms, s.terms + std::max(s.count, 0), [&](const MreTerm& term) {
    return is_power(term.power_u) && is_power(term.power_v);
  });
}

double sum_of(const RegressionSum& s, double u, double v) {
  double sum = 0;
  for (int32_t i = 0; i < s.count; ++i) {
    sum +=
        s.terms[i].coefficient * std::pow(u, s.terms[i].power_u) * std::pow(v, s.terms[i].power_v);
  }
  return sum;
}

}  // namespace

double tidewater::detail::regression_longitude(double lon, bool from_zero) {
  if (from_zero) return add_turns_while(lon, 360, [](double v) { return v < 0; });
  lon = add_turns_while(lon, 360, [](double v) { return v < -180; });
  return add_turns_while(lon, -360, [](double v) { return v > 180; });
}

Regression::Regression(const Parameters& parameters)
    : of_(parameters),
      tabled_(tabled(parameters.lon) && tabled(parameters.lat) && tabled(parameters.height)) {}

// Powers beyond the table have no place in a model; they are still answered.
Next Regression::other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus*) const {
  constexpr double kSecondsPerRadian = kDegreesPerRadian * 3600;
  const double lon = regression_longitude(in.x * kDegreesPerRadian, of_.from_zero);
  const double u = of_.k * (in.y * kDegreesPerRadian + of_.lat_offset);
  const double v = of_.k * (lon + of_.lon_offset);
  const double seconds = of_.sign / kSecondsPerRadian;
  *out = {in.x + seconds * sum_of(of_.lon, u, v), in.y + seconds * sum_of(of_.lat, u, v),
          in.z + of_.sign * sum_of(of_.height, u, v)};
  return Next::point;
}

void TWmre(int32_t count, int16_t direction, int16_t lon_range, int32_t lon_count,
           int32_t lat_count, int32_t height_count, double k, double lon_offset, double lat_offset,
           const MreTerm* lon_terms, const MreTerm* lat_terms, const MreTerm* height_terms,
           const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  const Regression regression({direction == 0 ? -1.0 : 1.0,
                               lon_range == 1,
                               k,
                               lon_offset,
                               lat_offset,
                               {lon_terms, lon_count},
                               {lat_terms, lat_count},
                               {height_terms, height_count}});
  *status = over_points(regression, count, in, out);
}
