// The native library's figures that the tests of the WebAssembly package and of the explorer are
// held against: a line for each, numbers in hexadecimal so that no digit is lost.

#include <cstdio>
#include <string>

#include "tidewater/lines.hpp"
#include "tidewater/projection.hpp"
#include "tidewater/system.hpp"
#include "tidewater/transformation.hpp"

using namespace tidewater;

namespace {

constexpr double kPoints[][2] = {{2.35, 48.85}, {-3.7, 40.4}, {7.44, 46.95}, {12.5, 41.9}};

}  // namespace

int main() {
  for (const char* target : {"EPSG:2154", "EPSG:3857", "EPSG:25831", "EPSG:3035", "EPSG:2056",
                             "EPSG:3034", "EPSG:4258"}) {
    const Transformation transformation(System("EPSG:4326"), System(target));
    for (const auto& p : kPoints) {
      const Point at = transformation.forward(Point{p[0], p[1]});
      std::printf("transform %s %.17g %.17g %a %a\n", target, p[0], p[1], at.x, at.y);
    }
  }
  for (const char* method : {"robinson", "mollweide", "equal earth", "azimuthal equal area",
                             "mercator", "lambert conformal"}) {
    const Projection projection(
        method,
        std::string(method) == "lambert conformal"
            ? std::vector<std::pair<std::string, double>>{{"lat1", 30}, {"lat2", 60}, {"lat0", 45}}
            : std::vector<std::pair<std::string, double>>{},
        Ellipsoid("WGS 84"));
    for (const auto& p : kPoints) {
      const Point at = projection.forward(Point{p[0], p[1]});
      const Factors f = projection.factors(Point{p[0], p[1]});
      std::printf("project %s|%.17g %.17g %a %a %a %a %a\n", method, p[0], p[1], at.x, at.y,
                  f.areal, f.convergence, f.angular);
    }
  }
  return 0;
}
