#include "points/operations.hpp"
#include "tidewater/foundation.h"

using namespace tidewater::test;

namespace {

constexpr double kA = 6378137;
constexpr double kE = 0.0818191910428158;  // GRS 80

Operation to_xyz(const char* name, double e) {
  return {name, geographic(-180, -90, -5e4), geographic(180, 90, 1e6),
          [e](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
            TWllh_to_xyz(kA, e, n, in, out, status);
          }};
}

Operation to_llh(const char* name, double a, double e, double reach) {
  return {name,
          {-reach, -reach, -reach},
          {reach, reach, reach},
          [a, e](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
            TWxyz_to_llh(a, e, n, in, out, status);
          }};
}

const Operations geocentric = {
    to_xyz("TWllh_to_xyz", kE),
    to_xyz("TWllh_to_xyz, e = 0.3", 0.3),
    to_xyz("TWllh_to_xyz, sphere", 0),
    to_llh("TWxyz_to_llh", kA, kE, 7e6),
    to_llh("TWxyz_to_llh, e = 0.3", kA, 0.3, 7e6),
    to_llh("TWxyz_to_llh, about the centre", kA, kE, 3e4),
    to_llh("TWxyz_to_llh, sphere", 1, 0, 1.1),
};

}  // namespace
