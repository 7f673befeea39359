// Space oblique Mercator, the New Zealand map grid, the Indian polyhedric.
#include <memory>

#include "points/operations.hpp"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80

using Points = const CoordinateTriple*;

struct Space {
  double eps;
  double Q, T, W, G, a0, C[5], S[5], X1[5], X2[5], X3[5], X4[5], R1 = 0, R2 = 0, R3 = 0, R4 = 0;
  double m_sin, m_cos, sum3, sum4;
  static constexpr double kInc = 1.729, kP = 0.0717;
  explicit Space(double eccentricity) : eps(eccentricity) {
    TWstatus word = 0;
    TWsom_c(kE, kInc, kP, eps, 1.2, 5, 65, &Q, &T, &W, &G, &a0, C, S, X1, X2, X3, X4, &R1, &R2, &R3,
            &R4, &m_sin, &m_cos, &sum3, &sum4, &word);
  }
};

void add_space(const std::string& which, double eps, int32_t axes) {
  const auto s = std::make_shared<const Space>(eps);
  operations().push_back({"TWsom_f, " + which, geographic(-180, -70), geographic(180, 70),
                          [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
                            TWsom_f(0, 1, 5, 0.3, kE, Space::kInc, Space::kP, s->eps, 1.2, s->Q,
                                    s->T, s->W, s->G, s->a0, s->C, s->S, s->X1, s->X2, s->X3, s->X4,
                                    s->R1, s->R2, s->R3, s->R4, s->m_sin, s->m_cos, s->sum3,
                                    s->sum4, n, in, out, axes, status);
                          }});
  operations().push_back({"TWsom_i, " + which,
                          {-0.5, -0.5, 0},
                          {0.5, 5, 0},
                          [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
                            TWsom_i(5, 0.3, kE, Space::kInc, Space::kP, s->eps, 1.2, s->Q, s->T,
                                    s->W, s->G, s->a0, s->C, s->S, s->X1, s->X2, s->X3, s->X4,
                                    s->R1, s->R2, s->R3, s->R4, s->m_sin, s->m_cos, s->sum3,
                                    s->sum4, n, in, out, axes, status);
                          }});
}

[[maybe_unused]] const bool added = [] {
  add_space("circular", 0, 1);
  add_space("elliptical", 0.05, 2);
  return true;
}();

const Operations sheets = {
    {"TWn_zeal_f", geographic(165, -48), geographic(180, -33),
     [](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWn_zeal_f(kE, 3.0194196, 0, -0.7821, n, in, out, status);
     }},
    {"TWn_zeal_i",
     {-0.1, -0.1, 0},
     {0.1, 0.1, 0},
     [](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWn_zeal_i(kE, 3.0194196, 0, -0.7821, n, in, out, status);
     }},
    {"TWn_zeal_s", geographic(165, -48), geographic(180, -33),
     [](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWn_zeal_s(kE, 3.0194196, 0, -0.7821, 0.9, n, in, out, status);
     }},
    {"TWind_phed_f", geographic(65, 5), geographic(95, 35),
     [](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWind_phed_f(1.4, 0.3, 0.95, 0.99, 0.3, 0.14, 0.02, 0.17, n, in, out, status);
     }},
    {"TWind_phed_i",
     {-0.3, -0.3, 0},
     {0.3, 0.3, 0},
     [](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWind_phed_i(6377301, 1.4, 0.3, 0.95, 0.99, 0.3, 0.14, 0.02, 0.17, n, in, out, status);
     }},
};

}  // namespace
