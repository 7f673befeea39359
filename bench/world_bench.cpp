#include <array>
#include <string>

#include "harness.hpp"
#include "tidewater/special.h"

using namespace tidewater::bench;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80
constexpr double kA = 6378137;

void world(const std::string& name, const std::string& definition, const Call& forward,
           const Call& inverse, const Call& scale) {
  add({name, -175, -80, 175, 80, kA, {definition}, forward, inverse, scale});
}

const Suite suite([] {
  TWstatus word = 0;
  double e2 = 0, m0 = 0;
  TWsinusoidal_c(kE, 0, &e2, &m0, &word);
  world("Sinusoidal", "+proj=sinu +ellps=GRS80",
        TW_CALL(TWsinusoidal_f(0, 0, kE, e2, m0, n, in, out, &status)),
        TW_CALL(TWsinusoidal_i(0, 0, kE, e2, m0, n, in, out, &status)),
        TW_CALL(TWsinusoidal_s(1, 0, e2, n, in, out, &status)));
  world("Mollweide", "+proj=moll +R=6378137", TW_CALL(TWmollweide_f(0, 0, n, in, out, &status)),
        TW_CALL(TWmollweide_i(0, 0, n, in, out, &status)), {});
  world("Eckert IV", "+proj=eck4 +R=6378137", TW_CALL(TWeckertIV_f(0, 0, n, in, out, &status)),
        TW_CALL(TWeckertIV_i(0, 0, n, in, out, &status)), {});
  std::array<double, 19> knots;
  std::array<double, 76> y_coef, x_coef;
  double y0 = 0;
  TWrobin_c(knots.data(), y_coef.data(), x_coef.data(), &y0, 0, &word);
  world("Robinson", "+proj=robin +R=6378137",
        TW_CALL(TWrobin_f(knots.data(), y_coef.data(), x_coef.data(), 0, y0, n, out, in, &status)),
        TW_CALL(TWrobin_i(knots.data(), y_coef.data(), x_coef.data(), 0, y0, n, in, out, &status)),
        {});
  world("Van der Grinten", "+proj=vandg +R=6378137", TW_CALL(TWvdg_f(0, 0, n, in, out, &status)),
        TW_CALL(TWvdg_i(0, 0, n, in, out, &status)), TW_CALL(TWvdg_s(1, 0, n, in, out, &status)));
});

}  // namespace
