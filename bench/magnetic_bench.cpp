#include <cmath>
#include <memory>
#include <random>
#include <string>
#include <vector>

#include "harness.hpp"
#include "support/harmonics.hpp"

using namespace tidewater::bench;
using tidewater::test::Coefficients;
using tidewater::test::Synthesis;

namespace {

constexpr double kPi = 3.14159265358979323846;
constexpr double kRadius = 6371200;

using Points = std::vector<CoordinateTriple>;

CoordinateTriple geocentric(double colat, double lon) {
  return {kRadius * std::sin(colat) * std::cos(lon), kRadius * std::sin(colat) * std::sin(lon),
          kRadius * std::cos(colat)};
}

// The gradient by fully normalised Legendre functions, columns of constant order built upward over
// the degree (Holmes and Featherstone 2002, eq. 11): each point on its own, with no cache.
class DirectLegendre {
 public:
  DirectLegendre(const Coefficients& c, const Synthesis& constants)
      : c_(c), a_(constants.rec_a), b_(constants.rec_b) {}

  CoordinateTriple gradient(const CoordinateTriple& p) const {
    const double r = std::sqrt(p.x * p.x + p.y * p.y + p.z * p.z);
    const double across = std::sqrt(p.x * p.x + p.y * p.y);
    const double t = p.z / r, s = across / r, q = kRadius / r;
    const double cos_lon = p.x / across, sin_lon = p.y / across;
    double cos_m = 1, sin_m = 0, sector = 1, q_m = q * q;
    double north = 0, east = 0, down = 0;
    for (int32_t m = 0; m <= c_.C.degree(); ++m) {
      double P = sector, P_below = 0, q_n = q_m;
      for (int32_t n = m; n <= c_.C.degree(); ++n) {
        if (n > m) {
          const double next = a_(n, m) * t * P + (n > m + 1 ? b_(n, m) * P_below : 0);
          P_below = P;
          P = next;
        }
        // dP / dtheta = (n t P[n] - f P[n - 1]) / s with f^2 = (n^2 - m^2)(2n + 1) / (2n - 1)
        const double f = n > m ? (2.0 * n + 1) / a_(n, m) : 0;
        const double dP = (n * t * P - f * P_below) / s;
        const double along = c_.C(n, m) * cos_m + c_.S(n, m) * sin_m;
        north += q_n * along * dP;
        east += q_n * m * (c_.C(n, m) * sin_m - c_.S(n, m) * cos_m) * P;
        down -= q_n * (n + 1) * along * P;
        q_n *= q;
      }
      const double turned = cos_m * cos_lon - sin_m * sin_lon;
      sin_m = sin_m * cos_lon + cos_m * sin_lon;
      cos_m = turned;
      q_m *= q;
      if (m < c_.C.degree()) sector *= a_(m + 1, m + 1) * s;
    }
    return {north, east / s, down};
  }

 private:
  const Coefficients& c_;
  const tidewater::test::Triangle& a_;
  const tidewater::test::Triangle& b_;
};

void add_rows(int32_t degree, const std::string& where, double tolerance, const Points& points) {
  const auto coefficients = std::make_shared<Coefficients>(degree);
  Coefficients::fill(*coefficients, 1);
  const auto synthesis = std::make_shared<Synthesis>(degree, kRadius);
  synthesis->tolerance = tolerance;
  // Constants of its own: the synthesis keeps its sines among them.
  const auto constants = std::make_shared<Synthesis>(degree, kRadius);
  const auto legendre = std::make_shared<Points>(points);
  add({"Harmonic field of degree " + std::to_string(degree) + ", " + where,
       ours(points, [=](int32_t n, const CoordinateTriple* in,
                        CoordinateTriple* out) { synthesis->sum(0, *coefficients, n, in, out); }),
       {"direct Legendre"},
       {side(
           [=] {
             const DirectLegendre direct(*coefficients, *constants);
             for (std::size_t i = 0; i < points.size(); ++i) {
               (*legendre)[i] = direct.gradient(points[i]);
             }
           },
           [legendre](std::size_t i) { return (*legendre)[i]; })},
       space_apart,
       "nT"});
}

const Suite suite([] {
  std::mt19937 random(8);
  std::uniform_real_distribution<double> colat(0.05, kPi - 0.05), lon(-kPi, kPi);
  Points parallel, meridian, scattered;
  for (int32_t i = 0; i < points(); ++i) {
    const double step = (i + 0.5) / points();
    parallel.push_back(geocentric(0.7, kPi * (2 * step - 1)));
    meridian.push_back(geocentric(0.05 + (kPi - 0.1) * step, 0.3));
    scattered.push_back(geocentric(colat(random), lon(random)));
  }
  for (const int32_t degree : {12, 13}) {
    // A millimetre: along a line, X, Y and Z hold the colatitude and the longitude to rounding
    // only.
    add_rows(degree, "along a parallel", 1e-3, parallel);
    add_rows(degree, "along a meridian", 1e-3, meridian);
    add_rows(degree, "scattered", 1e-3, scattered);
  }
});

}  // namespace
