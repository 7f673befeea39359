// Datum shift by multiple regression equations.

#include <array>
#include <cmath>

#include "formulas/wraps.hpp"
#include "tidewater/datum.h"

using namespace tidewater::detail;

namespace {

constexpr int kPowers = 10;

class Powers {
 public:
  explicit Powers(double base) : base_(base) {
    power_[0] = 1;
    for (std::size_t k = 1; k < kPowers; ++k) power_[k] = power_[k - 1] * base;
  }

  // Powers beyond the table have no place in a model; they are still answered.
  double operator[](int16_t k) const {
    return k >= 0 && k < kPowers ? power_[static_cast<std::size_t>(k)] : std::pow(base_, k);
  }

 private:
  double base_;
  std::array<double, kPowers> power_;
};

double sum_of(const MreTerm* terms, int32_t count, const Powers& u, const Powers& v) {
  double sum = 0;
  for (int32_t i = 0; i < count; ++i) {
    sum += terms[i].coefficient * u[terms[i].power_u] * v[terms[i].power_v];
  }
  return sum;
}

}  // namespace

void TWmre(int32_t count, int16_t direction, int16_t lon_range, int32_t lon_count,
           int32_t lat_count, int32_t height_count, double k, double lon_offset, double lat_offset,
           const MreTerm* lon_terms, const MreTerm* lat_terms, const MreTerm* height_terms,
           const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  constexpr double kSecondsPerRadian = kDegreesPerRadian * 3600;
  const double sign = direction == 0 ? -1 : 1;
  for (int32_t i = 0; i < count; ++i) {
    const CoordinateTriple p = in[i];
    double lon = p.x * kDegreesPerRadian;
    const double lat = p.y * kDegreesPerRadian;
    if (lon_range == 1) {
      // By contract: no upper bound.
      lon = add_turns_while(lon, 360, [](double v) { return v < 0; });
    } else {
      lon = add_turns_while(lon, 360, [](double v) { return v < -180; });
      lon = add_turns_while(lon, -360, [](double v) { return v > 180; });
    }
    const Powers u(k * (lat + lat_offset));
    const Powers v(k * (lon + lon_offset));
    const double dlon = sum_of(lon_terms, lon_count, u, v) / kSecondsPerRadian;
    const double dlat = sum_of(lat_terms, lat_count, u, v) / kSecondsPerRadian;
    const double dheight = sum_of(height_terms, height_count, u, v);
    out[i] = {p.x + sign * dlon, p.y + sign * dlat, p.z + sign * dheight};
  }
}
