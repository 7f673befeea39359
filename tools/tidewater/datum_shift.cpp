#include "datum_shift.hpp"

#include <array>
#include <charconv>
#include <cmath>
#include <numbers>
#include <stdexcept>
#include <string_view>

#include "tidewater/datum.h"
#include "tidewater/foundation.h"

namespace tidewater::command {

namespace {

constexpr double kPi = std::numbers::pi;
constexpr double kHalfPi = kPi / 2;
constexpr double kArcSecond = 4.84813681109536e-06;

// The formulas check nothing: parameters or heights out of all proportion give figures that are no
// positions.  Longitudes come out a little beyond 180 degrees beside that meridian.
TWstatus checked(int32_t count, CoordinateTriple* points) {
  for (int32_t i = 0; i < count; ++i) {
    CoordinateTriple& p = points[i];
    const bool usable = std::fabs(p.y) <= kHalfPi && std::isfinite(p.x) && std::isfinite(p.z);
    if (!usable) return TW_RANGE_ERROR;
    if (std::fabs(p.x) > kPi) p.x = std::remainder(p.x, 2 * kPi);
  }
  return TW_SUCCESS;
}

class MolodenskyShift : public DatumShift {
 public:
  MolodenskyShift(const std::array<double, 3>& d, const Ellipsoid& from, const Ellipsoid& to,
                  bool inverse)
      // turned round, the points come from the ellipsoid that the parameters lead to
      : d_(d), source_(inverse ? to : from), target_(inverse ? from : to), inverse_(inverse) {}

  TWstatus run(int32_t count, CoordinateTriple* points) const override {
    TWstatus status = TW_SUCCESS;
    (inverse_ ? TWmol_std_i : TWmol_std_f)(source_.a(), source_.eccentricity(),
                                           target_.a() - source_.a(),
                                           target_.flattening() - source_.flattening(), d_[0],
                                           d_[1], d_[2], count, points, points, &status);
    return status == TW_SUCCESS ? checked(count, points) : status;
  }

 private:
  std::array<double, 3> d_;
  Ellipsoid source_;
  Ellipsoid target_;
  bool inverse_;
};

// EPSG Guidance Note 7-2, method 1033: the position vector is turned, by small angles.
class HelmertShift : public DatumShift {
 public:
  HelmertShift(const std::array<double, 7>& p, const Ellipsoid& from, const Ellipsoid& to,
               bool inverse)
      : t_{p[0], p[1], p[2]}, scale_(p[6] * 1e-6), from_(from), to_(to), inverse_(inverse) {
    const double rx = p[3] * kArcSecond, ry = p[4] * kArcSecond, rz = p[5] * kArcSecond;
    rotation_ = {1, -rz, ry, rz, 1, -rx, -ry, rx, 1};
    if (!(scale_ > -1)) throw std::runtime_error("a scale of zero or less cannot be shifted by");
  }

  TWstatus run(int32_t count, CoordinateTriple* points) const override {
    TWstatus status = TW_SUCCESS;
    TWllh_to_xyz(from_.a(), from_.eccentricity(), count, points, points, &status);
    (inverse_ ? TWbw_i : TWbw_f)(count, points, scale_, rotation_.data(), t_[0], t_[1], t_[2],
                                 points, &status);
    if (status != TW_SUCCESS) return status;
    TWxyz_to_llh(to_.a(), to_.eccentricity(), count, points, points, &status);
    return checked(count, points);
  }

 private:
  std::array<double, 3> t_;
  double scale_;
  std::array<double, 9> rotation_;
  Ellipsoid from_;
  Ellipsoid to_;
  bool inverse_;
};

// As many numbers as there is room for, with commas between them; false for any other text.
template <std::size_t N>
bool parse_numbers(std::string_view text, std::array<double, N>& numbers) {
  for (std::size_t i = 0; i < N; ++i) {
    if (i > 0) {
      if (text.empty() || text[0] != ',') return false;
      text.remove_prefix(1);
    }
    const char* const end = text.data() + text.size();
    const auto [stop, error] = std::from_chars(text.data(), end, numbers[i]);
    if (error != std::errc() || !std::isfinite(numbers[i])) return false;
    text.remove_prefix(static_cast<std::size_t>(stop - text.data()));
  }
  return text.empty();
}

template <class Shift, std::size_t N>
std::unique_ptr<DatumShift> by_formulas(const ShiftRequest& request, const std::string& parameters,
                                        const char* expected) {
  std::array<double, N> numbers = {};
  if (!parse_numbers(parameters, numbers)) {
    throw std::runtime_error("not the parameters of a shift: " + request.text + " (" + expected +
                             ")");
  }
  if (!request.from || !request.to) {
    throw std::runtime_error("a shift by formulas needs --from-ellipsoid");
  }
  return std::make_unique<Shift>(numbers, *request.from, *request.to, request.inverse);
}

}  // namespace

std::unique_ptr<DatumShift> make_datum_shift(const ShiftRequest& request) {
  const std::size_t colon = request.text.find(':');
  const std::string kind = request.text.substr(0, colon);
  const std::string what = colon == std::string::npos ? "" : request.text.substr(colon + 1);
  if (kind == "molodensky") {
    return by_formulas<MolodenskyShift, 3>(request, what, "molodensky:DX,DY,DZ");
  }
  if (kind == "helmert") {
    return by_formulas<HelmertShift, 7>(request, what, "helmert:DX,DY,DZ,RX,RY,RZ,PPM");
  }
  throw std::runtime_error(
      "no such shift: " + request.text +
      " (molodensky:DX,DY,DZ or helmert:DX,DY,DZ,RX,RY,RZ,PPM; nadcon:DIR or ntv2:DIR)");
}

}  // namespace tidewater::command
