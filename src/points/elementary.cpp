#include "points/elementary.hpp"

#include <cmath>

namespace tidewater::points {

double standard_sin(double v) { return std::sin(v); }
double standard_cos(double v) { return std::cos(v); }
double standard_log(double v) { return std::log(v); }
double standard_exp(double v) { return std::exp(v); }
double standard_atan2(double y, double x) { return std::atan2(y, x); }

}  // namespace tidewater::points
