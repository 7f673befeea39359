// Complex and plane polynomials, and regression.

#include "points/operations.hpp"
#include "tidewater/datum.h"

using namespace tidewater::test;

namespace {

constexpr CoordinateTriple kLow = {-1, -1, -1}, kHigh = {1, 1, 1};

constexpr double kComplex[10] = {0.1, 0.2, 1, 0.01, 0.02, 0.3, 0.01, 0.02, 0.01, 0.01};

constexpr double kPlane[20] = {0.1, 1,    0.01, 0.01, 0.02, 0.03, 1e-2, 2e-2, 3e-2, 4e-2,
                               0.2, 0.01, 1,    0.03, 0.02, 0.01, 4e-2, 3e-2, 2e-2, 1e-2};

Operation complex_inverse(const char* name, int32_t order, const double* coefs) {
  return {name, kLow, kHigh,
          [order, coefs](int32_t n, const CoordinateTriple* in, CoordinateTriple* out,
                         TWstatus* status) {
            TWcomplexpol_i(order, 0.1, 0.2, 1.1, 0.9, coefs, n, in, out, status);
          }};
}

// No linear term: most points do not end.
constexpr double kSquare[6] = {1.5, 0, 0, 0, 1, 0};

std::vector<MreTerm> terms(int16_t most) {
  std::vector<MreTerm> all;
  for (int16_t i = 0; i <= most; ++i) {
    MreTerm term = {};
    term.coefficient = 0.3 / (1 + i);
    term.power_u = i;
    term.power_v = static_cast<int16_t>((i * 7) % 10);
    all.push_back(term);
  }
  return all;
}

Operation regression(const char* name, int16_t most, int16_t direction, int16_t range) {
  return {name, geographic(-400, -90, -10), geographic(400, 90, 10),
          [=, t = terms(most)](int32_t n, const CoordinateTriple* in, CoordinateTriple* out,
                               TWstatus* status) {
            const auto count = static_cast<int32_t>(t.size());
            TWmre(n, direction, range, count, count - 3, count - 5, 0.05, -10, -38, t.data(),
                  t.data() + 3, t.data() + 2, in, out, status);
          }};
}

const Operations polynomials = {
    {"TWcomplexpol_f", kLow, kHigh,
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWcomplexpol_f(4, 0.1, 0.2, 1.1, 0.9, kComplex, n, in, out, status);
     }},
    complex_inverse("TWcomplexpol_i", 4, kComplex),
    complex_inverse("TWcomplexpol_i, without end", 2, kSquare),
    {"TWconform2_f", kLow, kHigh,
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWconform2_f(0.1, 0.2, 1.1, 0.9, 0.1, 1, 0.01, 0.2, 0.02, 0.03, n, in, out, status);
     }},
    {"TWconform2_i", kLow, kHigh,
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWconform2_i(0.1, 0.2, 1.1, 0.9, 0.1, 1, 0.01, 0.2, 0.02, 0.03, n, in, out, status);
     }},
    {"TWnpoly2d_f", kLow, kHigh,
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWnpoly2d_f(kPlane, 3, n, in, out, status);
     }},
    {"TWnpoly2d_i", kLow, kHigh,
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWnpoly2d_i(kPlane, 3, n, in, out, status);
     }},
    {"TWnpoly2d_i, constants", kLow, kHigh,
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWnpoly2d_i(kPlane, 0, n, in, out, status);
     }},
    {"TWpoly2deg_f", kLow, kHigh,
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWpoly2deg_f(0.1, 0.2, 1.1, 0.9, 0.1, 1, 0.01, 0.01, 0.02, 0.03, 0.2, 0.01, 1, 0.03, 0.02,
                    0.01, n, in, out, status);
     }},
    {"TWpoly2deg_i", kLow, kHigh,
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWpoly2deg_i(0.1, 0.2, 1.1, 0.9, 0.1, 1, 0.01, 0.01, 0.02, 0.03, 0.2, 0.01, 1, 0.03, 0.02,
                    0.01, n, in, out, status);
     }},
    regression("TWmre", 9, 1, 0),
    regression("TWmre, back, from zero", 9, 0, 1),
    regression("TWmre, powers of no model", 11, 1, 0),
};

}  // namespace
