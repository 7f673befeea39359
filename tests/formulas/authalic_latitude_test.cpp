// The series of the authalic latitude against its definition.

#include "formulas/authalic_latitude.hpp"

#include <gtest/gtest.h>

#include <cmath>

#include "formulas/radii.hpp"

using namespace tidewater::detail;

namespace {

long double q_as_defined(long double e, long double lat) {
  const long double s = std::sin(lat);
  if (e == 0) return 2 * s;
  return (1 - e * e) * (s / (1 - e * e * s * s) + std::atanh(e * s) / e);
}

TEST(AuthalicLatitude, QIsThatOfTheDefinition) {
  for (const double e : {0.0, 0.011, 0.0818191910428158, 0.1, 0.11, 0.5}) {
    for (double lat = -1.57; lat < 1.58; lat += 0.01) {
      const auto wanted = static_cast<double>(q_as_defined(e, lat));
      EXPECT_NEAR(authalic_q(e, std::sin(lat)), wanted, 3e-16 * (1 + std::fabs(wanted)))
          << e << " " << lat;
    }
  }
}

TEST(AuthalicLatitude, BelowOneHundredthTheLogarithmAsItIsPrinted) {
  // The printed form loses digits in proportion to 1 / e: it must be that form's figure.
  const double e = 1e-6, s = 0.6;
  const double printed =
      (s / (1 - e * e * s * s) - 0.5 / e * std::log((1 - e * s) / (1 + e * s))) * (1 - e * e);
  EXPECT_NEAR(authalic_q(e, s), printed, 1e-15);
  EXPECT_GT(std::fabs(printed - 1.2), 1e-12);
}

TEST(AuthalicLatitude, InverseComesBack) {
  for (const double e : {0.0, 0.02, 0.0818191910428158, 0.1}) {
    const AuthalicInverse inverse(e);
    for (double lat = -1.5; lat < 1.51; lat += 0.01) {
      const auto q = static_cast<double>(q_as_defined(e, lat));
      // Towards a pole the sine's last place is worth 1 / cos of it.
      EXPECT_NEAR(inverse.of_q(q), lat, 5e-16 + 4e-16 / std::cos(lat)) << e << " " << lat;
    }
  }
}

TEST(Radii, SeriesAndRootAgree) {
  for (const double e : {0.0, 0.0818191910428158, 0.0999999, 0.1000001, 0.3}) {
    for (double s = -1; s <= 1; s += 1.0 / 64) {
      const long double w = std::sqrt(1 - static_cast<long double>(e * e) * s * s);
      EXPECT_NEAR(normal_radius(e * e, s), static_cast<double>(1 / w), 4.5e-16) << e << " " << s;
      EXPECT_NEAR(meridian_radius(e * e, s), static_cast<double>((1 - e * e) / (w * w * w)),
                  1.2e-15);
    }
  }
}

}  // namespace
