// From a satellite's path and row to plane coordinates of the space oblique Mercator projection.
//   example_landsat STORE [NAME PATH ROW LON LAT]

#include <tidewater/tidewater.h>

#include <cstdio>
#include <cstdlib>
#include <vector>

int main(int argc, char** argv) {
  constexpr double kDegree = 0.017453292519943295;
  if (argc != 2 && argc != 7) {
    std::fprintf(stderr, "example_landsat STORE [NAME PATH ROW LON LAT]\n");
    return 2;
  }
  // Clarke 1866, as in the published example of the projection.
  const double a = 6378206.4;
  const double e = 0.0822718542230;

  const char* store = argv[1];
  const char* name = argc == 7 ? argv[2] : "Landsat 2";
  const int path = argc == 7 ? std::atoi(argv[3]) : 16;
  const int row = argc == 7 ? std::atoi(argv[4]) : 26;
  const CoordinateTriple point = {(argc == 7 ? std::atof(argv[5]) : -73.0) * kDegree,
                                  (argc == 7 ? std::atof(argv[6]) : 40.0) * kDegree, 0};

  TWstatus status = TW_SUCCESS;
  int16_t id = 0;
  SatelliteRecord satellite;
  TWsomps_name2id(store, name, &id, &status);
  if (TW_OK(status)) TWsomps_get_sat(store, id, &satellite, &status);
  if (!TW_OK(status)) {
    std::fprintf(stderr, "%s: 0x%08X\n", name, static_cast<unsigned>(status));
    return 1;
  }

  // What the store's columns hold is told at SatelliteRecord.
  const double inclination = satellite.angle1;
  const double perigee = satellite.angle2;
  const double lon_ref = satellite.angle3;
  const double period_ratio = satellite.real1;
  const double eccentricity = satellite.real2;
  double lon_n = 0;
  int16_t side = 0, orbit = 0;
  TWsomps(satellite.count1, lon_ref, static_cast<int16_t>(row), static_cast<int16_t>(path),
          satellite.short1, satellite.short2, satellite.short3, &lon_n, &side, &orbit, &status);

  constexpr int16_t kTerms = 6;
  constexpr int16_t kGrid = 721;
  std::vector<double> C(kTerms), S(kTerms), X1(kTerms), X2(kTerms), X3(kTerms), X4(kTerms);
  double Q = 0, T = 0, W = 0, G = 0, a0 = 0, R1 = 0, R2 = 0, R3 = 0, R4 = 0;
  double m_sin = 0, m_cos = 0, sum3 = 0, sum4 = 0;
  TWsom_c(e, inclination, period_ratio, eccentricity, perigee, kTerms, kGrid, &Q, &T, &W, &G, &a0,
          C.data(), S.data(), X1.data(), X2.data(), X3.data(), X4.data(), &R1, &R2, &R3, &R4,
          &m_sin, &m_cos, &sum3, &sum4, &status);

  CoordinateTriple plane = point;
  TWsom_f(orbit, side, kTerms, lon_n, e, inclination, period_ratio, eccentricity, perigee, Q, T, W,
          G, a0, C.data(), S.data(), X1.data(), X2.data(), X3.data(), X4.data(), R1, R2, R3, R4,
          m_sin, m_cos, sum3, sum4, 1, &point, &plane, 1, &status);
  std::printf("%s, path %d, row %d: x %.3f, y %.3f metres\n", name, path, row, plane.x * a,
              plane.y * a);

  CoordinateTriple back = plane;
  TWsom_i(kTerms, lon_n, e, inclination, period_ratio, eccentricity, perigee, Q, T, W, G, a0,
          C.data(), S.data(), X1.data(), X2.data(), X3.data(), X4.data(), R1, R2, R3, R4, m_sin,
          m_cos, sum3, sum4, 1, &plane, &back, 1, &status);
  std::printf("and back: %.7f %.7f\n", back.x / kDegree, back.y / kDegree);
  return TW_OK(status) ? 0 : 1;
}
