#include "points/operations.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80

Operation forward(const char* name, double e) {
  return {name, geographic(-180, -85), geographic(180, 85),
          [e](int32_t count, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
            double n, C, rho0;
            TWalbers_c(e, 0, 0.4, 0.5, 0.8, &n, &C, &rho0);
            TWalbers_f(e, -1.7, n, C, rho0, count, in, out, status);
          }};
}

Operation inverse(const char* name, double e, double lat1, double lat2, CoordinateTriple low,
                  CoordinateTriple high) {
  return {name, low, high,
          [e, lat1, lat2](int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                          TWstatus* status) {
            double n, C, rho0;
            TWalbers_c(e, 0, 0.4, lat1, lat2, &n, &C, &rho0);
            TWalbers_i(e, -1.7, n, C, rho0, count, in, out, status);
          }};
}

Operation scale(const char* name, double e, double lat1) {
  return {name, geographic(-180, -89), geographic(180, 89),
          [e, lat1](int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                    TWstatus* status) {
            double n, C, rho0;
            TWalbers_c(e, 0, 0.4, lat1, 0.8, &n, &C, &rho0);
            TWalbers_s(e, 0.9996, C, n, count, in, out, status);
          }};
}

const Operations albers = {
    forward("TWalbers_f", kE),
    forward("TWalbers_f, sphere", 0),
    forward("TWalbers_f, e = 0.3", 0.3),
    forward("TWalbers_f, e = 0.005", 0.005),
    inverse("TWalbers_i", kE, 0.5, 0.8, {-1, -0.4, 0}, {1, 0.5, 0}),
    inverse("TWalbers_i, southern", kE, -0.5, -0.8, {-1, -0.5, 0}, {1, 0.4, 0}),
    inverse("TWalbers_i, towards the pole", kE, 0.5, 1.3, {-0.3, 0.8, 0}, {0.3, 1.1, 0}),
    inverse("TWalbers_i, sphere", 0, 0.5, 0.8, {-1, -0.4, 0}, {1, 0.5, 0}),
    inverse("TWalbers_i, e = 0.3", 0.3, 0.5, 0.8, {-1, -0.4, 0}, {1, 0.5, 0}),
    scale("TWalbers_s", kE, 0.5),
    scale("TWalbers_s, sphere", 0, 0.5),
    scale("TWalbers_s, polar", kE, 0.8),
};

}  // namespace
