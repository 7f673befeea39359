// Datum shift by multiple regression equations: powers that no model has, and the exported
// function.

#include "datum/regression_points.hpp"

#include <algorithm>
#include <array>

#include "formulas/wraps.hpp"
#include "points/portable.hpp"

using namespace tidewater::detail;

namespace {

bool tabled(const RegressionSum& s) {
  const auto is_power = [](int16_t k) { return k >= 0 && k < Regression::kPowers; };
  return std::all_of(s.terms, s.terms + std::max(s.count, 0), [&](const MreTerm& term) {
    return is_power(term.power_u) && is_power(term.power_v);
  });
}

class Powers {
 public:
  explicit Powers(double base) : base_(base) {
    power_[0] = 1;
    for (std::size_t k = 1; k < power_.size(); ++k) power_[k] = power_[k - 1] * base;
  }

  // Powers beyond the table have no place in a model; they are still answered.
  double operator[](int16_t k) const {
    return k >= 0 && k < Regression::kPowers ? power_[static_cast<std::size_t>(k)]
                                             : portable::pow(base_, k);
  }

 private:
  double base_;
  std::array<double, Regression::kPowers> power_;
};

double sum_of(const RegressionSum& s, const Powers& u, const Powers& v) {
  double sum = 0;
  for (int32_t i = 0; i < s.count; ++i) {
    sum += s.terms[i].coefficient * u[s.terms[i].power_u] * v[s.terms[i].power_v];
  }
  return sum;
}

// A point by itself, with a look at each power; the bits are those of several at once.
CoordinateTriple term_by_term(const Regression::Parameters& of, const CoordinateTriple& in) {
  constexpr double kSecondsPerRadian = kDegreesPerRadian * 3600;
  const double lon = regression_longitude(in.x * kDegreesPerRadian, of.from_zero);
  const Powers u(of.k * (in.y * kDegreesPerRadian + of.lat_offset));
  const Powers v(of.k * (lon + of.lon_offset));
  const double seconds = of.sign / kSecondsPerRadian;
  return {in.x + seconds * sum_of(of.lon, u, v), in.y + seconds * sum_of(of.lat, u, v),
          in.z + of.sign * sum_of(of.height, u, v)};
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

Next Regression::other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus*) const {
  *out = term_by_term(of_, in);
  return Next::point;
}

void TWmre(int32_t count, int16_t direction, int16_t lon_range, int32_t lon_count,
           int32_t lat_count, int32_t height_count, double k, double lon_offset, double lat_offset,
           const MreTerm* lon_terms, const MreTerm* lat_terms, const MreTerm* height_terms,
           const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  const Regression::Parameters parameters = {direction == 0 ? -1.0 : 1.0,
                                             lon_range == 1,
                                             k,
                                             lon_offset,
                                             lat_offset,
                                             {lon_terms, lon_count},
                                             {lat_terms, lat_count},
                                             {height_terms, height_count}};
  if (count <= kFew) {
    // A look through all terms beforehand would cost as much as their sum.
    *status = TW_SUCCESS;
    for (int32_t i = 0; i < count; ++i) out[i] = term_by_term(parameters, in[i]);
    return;
  }
  *status = over_points(Regression(parameters), count, in, out);
}
