// A client in C++: a round trip through the inverse.
#include <tidewater/tidewater.h>

#include <cmath>
#include <vector>

int main() {
  std::vector<CoordinateTriple> points(100, {0.5, 0.25, 10});
  TWstatus status = 0;
  TWmerc_f(0.08, 0.1, 0, 100, points.data(), points.data(), &status);
  TWmerc_i(0.08, 0.1, 0, 100, points.data(), points.data(), &status);
  return TW_OK(status) && std::fabs(points[99].y - 0.25) < 1e-13 && points[99].z == 10 ? 0 : 1;
}
