// The magnetic field in the geodetic frame, its elements, and their change in one unit of time.
// The US/UK World Magnetic Model for 2025-2030: Technical Report, NOAA National Centers for
// Environmental Information, on elements and their rates.

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <memory>

#include "formulas/wraps.hpp"
#include "foundation/new_array.hpp"
#include "points/portable.hpp"
#include "tidewater/geocentric.h"
#include "tidewater/harmonic_synthesis.h"
#include "tidewater/magnetic_elements.h"

using namespace tidewater::detail;

namespace {

// Below this horizontal intensity, and this close to a pole, a direction has no meaning.
constexpr double kTiny = 1e-12;

// The points of a call and their geocentric positions, kept apart from the caller's arrays so that
// the field may be written over the points.
class Places {
 public:
  Places(double a, double e, int32_t count, const CoordinateTriple* points)
      : count_(static_cast<std::size_t>(std::max(count, 0))),
        triples_(new_array<CoordinateTriple>(2 * std::uint64_t{count_})) {
    if (!triples_) return;
    std::copy_n(points, count_, triples_.get() + count_);
    TWstatus always_success = TW_SUCCESS;
    TWllh_to_xyz(a, e, count, points, triples_.get(), &always_success);
  }

  bool ok() const { return triples_ != nullptr; }
  std::size_t count() const { return count_; }
  const CoordinateTriple* positions() const { return triples_.get(); }
  const CoordinateTriple& geodetic(std::size_t i) const { return triples_[count_ + i]; }

  // Turns north and down of each point from the geocentric to the geodetic latitude.
  void to_geodetic_frame(CoordinateTriple* field) const {
    for (std::size_t i = 0; i < count_; ++i) {
      const auto [x, y, z] = positions()[i];
      const double r = std::sqrt(x * x + y * y + z * z);
      const double delta = geodetic(i).y - portable::asin(z / r);
      const double s = portable::sin(delta);
      const double c = portable::cos(delta);
      const auto [north, east, down] = field[i];
      field[i] = {s * down + c * north, east, -s * north + c * down};
    }
  }

 private:
  std::size_t count_;
  std::unique_ptr<CoordinateTriple[]> triples_;
};

// Elements of a field, with the declination from the meridian of the point.
MagneticElements elements_of(const CoordinateTriple& field) {
  const auto [north, east, down] = field;
  const double horizontal = portable::hypot(north, east);
  return {horizontal > kTiny ? portable::atan2(east, north) : 0, portable::atan2(down, horizontal),
          horizontal, portable::hypot(horizontal, down)};
}

// At a pole, where north is defined by the longitude, a declination counts from Greenwich.
double at_poles_from_greenwich(double declination, const CoordinateTriple& point) {
  if (point.y > kHalfPi - kTiny) {
    declination += point.x;
  } else if (point.y < -kHalfPi + kTiny) {
    declination -= point.x;
  }
  return wrap_at_or_below_then_above(declination);
}

}  // namespace

void TWhar_mag_val(int32_t N, double radius, double** C, double** S, double** rec_a, double** rec_b,
                   double* sum_dC, double* sum_dS, double* sum_lC, double* sum_lS, double* sum_rC,
                   double* sum_rS, double* sum_C, double* sum_S, double* last_colat,
                   double* last_radius, double* last_lon, double tolerance, double* saved_tcos,
                   double* saved_tsin, double* saved_scale_theta, double* saved_scale_lambda,
                   double* saved_scale_r, double a, double e, int32_t count,
                   const CoordinateTriple* points, CoordinateTriple* field,
                   MagneticElements* elements, TWstatus* status) {
  *status = TW_SUCCESS;
  const Places places(a, e, count, points);
  if (!places.ok()) {
    *status = TW_NO_MEMORY;
    return;
  }
  TWhar_sum(0, N, radius, C, S, rec_a, rec_b, sum_dC, sum_dS, sum_lC, sum_lS, sum_rC, sum_rS, sum_C,
            sum_S, last_colat, last_radius, last_lon, tolerance, saved_tcos, saved_tsin,
            saved_scale_theta, saved_scale_lambda, saved_scale_r, a, e, 0, 0, 0, count,
            places.positions(), field, status);
  if (!TW_OK(*status)) return;
  places.to_geodetic_frame(field);
  for (std::size_t i = 0; i < places.count(); ++i) {
    elements[i] = elements_of(field[i]);
    elements[i].declination = at_poles_from_greenwich(elements[i].declination, places.geodetic(i));
  }
}

void TWhar_mag_var(int32_t N, double radius, double** C, double** S, double** rec_a, double** rec_b,
                   double* sum_dC, double* sum_dS, double* sum_lC, double* sum_lS, double* sum_rC,
                   double* sum_rS, double* sum_C, double* sum_S, double* last_colat,
                   double* last_radius, double* last_lon, double tolerance, double* saved_tcos,
                   double* saved_tsin, double* saved_scale_theta, double* saved_scale_lambda,
                   double* saved_scale_r, int32_t n_sec, double** Ct, double** St, double* sec_dC,
                   double* sec_dS, double* sec_lC, double* sec_lS, double* sec_rC, double* sec_rS,
                   double* sec_C, double* sec_S, double* sec_last_colat, double* sec_last_radius,
                   double* sec_tcos, double* sec_tsin, double* sec_scale_theta,
                   double* sec_scale_lambda, double* sec_scale_r, double a, double e, int32_t count,
                   const CoordinateTriple* points, CoordinateTriple* field,
                   MagneticElements* elements, CoordinateTriple* sec_field, MagneticElements* rates,
                   TWstatus* status) {
  *status = TW_SUCCESS;
  const Places places(a, e, count, points);
  if (!places.ok()) {
    *status = TW_NO_MEMORY;
    return;
  }
  TWhar_sum(0, N, radius, C, S, rec_a, rec_b, sum_dC, sum_dS, sum_lC, sum_lS, sum_rC, sum_rS, sum_C,
            sum_S, last_colat, last_radius, last_lon, tolerance, saved_tcos, saved_tsin,
            saved_scale_theta, saved_scale_lambda, saved_scale_r, a, e, 0, 0, 0, count,
            places.positions(), field, status);
  if (!TW_OK(*status)) return;
  // The table of sines in rec_b is shared: the series of the higher degree has to come first.
  TWhar_sum(0, n_sec, radius, Ct, St, rec_a, rec_b, sec_dC, sec_dS, sec_lC, sec_lS, sec_rC, sec_rS,
            sec_C, sec_S, sec_last_colat, sec_last_radius, last_lon, tolerance, sec_tcos, sec_tsin,
            sec_scale_theta, sec_scale_lambda, sec_scale_r, a, e, 0, 0, 0, count,
            places.positions(), sec_field, status);
  if (!TW_OK(*status)) return;
  places.to_geodetic_frame(field);
  places.to_geodetic_frame(sec_field);
  for (std::size_t i = 0; i < places.count(); ++i) {
    const auto [x, y, z] = field[i];
    const auto [dx, dy, dz] = sec_field[i];
    MagneticElements now = elements_of(field[i]);
    // Differences over one unit of time, not derivatives.
    const double horizontal = portable::hypot(x + dx, y + dy);
    // By contract: the declination to come is formed however small its horizontal intensity is.
    const double turn = portable::atan2(y + dy, x + dx) - now.declination;
    rates[i] = {wrap_at_or_below_then_above(turn),
                portable::atan2(z + dz, horizontal) - now.inclination, horizontal - now.horizontal,
                portable::hypot(horizontal, z + dz) - now.total};
    now.declination = at_poles_from_greenwich(now.declination, places.geodetic(i));
    elements[i] = now;
  }
}
