// Constants that all formulas share.
#pragma once

#include <numbers>

#include "points/lanes.hpp"

// Formulas speak the engine's words as their own.
namespace tidewater::detail {
using namespace points;

inline constexpr double kPi = std::numbers::pi;
inline constexpr double kHalfPi = kPi / 2;
inline constexpr double kQuarterPi = kPi / 4;
inline constexpr double kTwoPi = 2 * kPi;
inline constexpr double kRadiansPerDegree = kPi / 180;
inline constexpr double kDegreesPerRadian = 180 / kPi;

// Up to this eccentricity, above that of every ellipsoid of the earth, series serve.
inline constexpr double kSeriesEccentricity = 0.1;

}  // namespace tidewater::detail
