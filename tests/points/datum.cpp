// Similarity transformations, Molodensky, local frames and grid units.

#include "tidewater/datum.h"
#include "points/operations.hpp"
#include "tidewater/foundation.h"

using namespace tidewater::test;

namespace {

constexpr double kA = 6378137;
constexpr double kE = 0.0818191910428158;  // GRS 80
constexpr double kRotation[9] = {1, 2e-5, -3e-5, -2e-5, 1, 1e-5, 3e-5, -1e-5, 1};
constexpr CoordinateTriple kLow = {-7e6, -7e6, -7e6}, kHigh = {7e6, 7e6, 7e6};

Operation similarity_inverse(const char* name, double s) {
  return {name, kLow, kHigh,
          [s](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
            TWbw_i(n, in, s, kRotation, 10, -20, 30, out, status);
          }};
}

Operation badekas_inverse(const char* name, double s) {
  return {name, kLow, kHigh,
          [s](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
            TWmol_bdk_i(n, in, s, kRotation, 1e6, 2e6, 5e6, 1e6 + 9, 2e6, 5e6, out, status);
          }};
}

Operation to_geodetic(const char* name, double e) {
  return {name,
          {-1e-3, -1e-3, -1e-3},
          {1e-3, 1e-3, 1e-3},
          [e](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
            double matrix[9], x0, y0, z0, azimuth = 1;
            TWlsr_c(1, kA, e, 0.3, 0.8, 100, &azimuth, &x0, &y0, &z0, 0, 0, 0, 0, 0, 0, matrix,
                    status);
            TWlsr_i(kA, e, x0, y0, z0, matrix, n, in, out, status);
          }};
}

const Operations datum = {
    {"TWbw_f", kLow, kHigh,
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWbw_f(n, in, 1e-6, kRotation, 10, -20, 30, out, status);
     }},
    similarity_inverse("TWbw_i", 1e-6),
    similarity_inverse("TWbw_i, singular", -1),
    {"TWmol_bdk_f", kLow, kHigh,
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWmol_bdk_f(n, in, 1e-6, kRotation, 1e6, 2e6, 5e6, 1e6 + 9, 2e6, 5e6, out, status);
     }},
    badekas_inverse("TWmol_bdk_i", 1e-6),
    badekas_inverse("TWmol_bdk_i, no scale", 0),
    {"TWshifts_f", kLow, kHigh,
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWshifts_f(n, in, 10, -20, 30, out, status);
     }},
    {"TWshifts_i", kLow, kHigh,
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWshifts_i(n, in, 10, -20, 30, out, status);
     }},
    {"TWmol_std_f", geographic(-180, -89.5, -100), geographic(180, 89.5, 5000),
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWmol_std_f(kA, kE, -251, -1.4e-5, -87, -98, -121, n, in, out, status);
     }},
    {"TWmol_std_i", geographic(-180, -89.5, -100), geographic(180, 89.5, 5000),
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWmol_std_i(kA, kE, -251, -1.4e-5, -87, -98, -121, n, in, out, status);
     }},
    {"TWlsr_f", geographic(-180, -90, -100), geographic(180, 90, 5000),
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWlsr_f(kA, kE, 0.5, 0.3, 0.8, kRotation, n, in, out, status);
     }},
    to_geodetic("TWlsr_i", kE),
    to_geodetic("TWlsr_i, e = 0.3", 0.3),
    {"TWllh_to_lsr", geographic(-180, -90, -100), geographic(180, 90, 5000),
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWllh_to_lsr(kA, kE, 0.9996, 0.3, 0.8, 100, n, in, out, status);
     }},
    // Writes to its input.
    {"TWlsr_to_llh",
     {-1e5, -1e5, -1e4},
     {1e5, 1e5, 1e4},
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       std::vector<CoordinateTriple> copy(in, in + (n > 0 ? n : 0));
       TWlsr_to_llh(kA, kE, 0.9996, 0.3, 0.8, 100, n, in == out ? out : copy.data(), out, status);
     }},
    {"TWab_to_en",
     {-3, -3, 0},
     {3, 3, 0},
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWab_to_en(kA, 0.9996, 5e5, 1e7, n, in, out, status);
     }},
    {"TWen_to_ab", kLow, kHigh,
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWen_to_ab(kA, 0.9996, 5e5, 1e7, n, in, out, status);
     }},
};

}  // namespace
