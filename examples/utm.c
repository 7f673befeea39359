/* An array of positions to UTM and back, in plain C. */
#include <math.h>
#include <stdio.h>
#include <tidewater/tidewater.h>

#define COUNT 3

int main(void) {
  const double degree = acos(-1.0) / 180;
  const double a = 6378137, e = 0.081819191042815791; /* GRS 80 */
  const double scale = 0.9996, false_easting = 500000;
  CoordinateTriple points[COUNT] = {{-4.4863 * degree, 48.3903 * degree, 34},
                                    {-1.6778 * degree, 48.1113 * degree, 40},
                                    {-3.3667 * degree, 47.7500 * degree, 16}};
  double lon0, false_northing, A0, A2, A4, A6, A8, M0, B2, B4, B6;
  TWstatus status;

  TWrslv_utmzone(30, &lon0, &status);
  TWrslv_utmhemi(0, &false_northing, &status);
  TWt_merc_c(e, lon0, 0, &A0, &A2, &A4, &A6, &A8, &M0, &B2, &B4, &B6, &status);

  TWt_merc_f(e, lon0, A0, A2, A4, A6, A8, M0, COUNT, points, points, &status);
  TWab_to_en(a, scale, false_easting, false_northing, COUNT, points, points, &status);
  for (int i = 0; i < COUNT; ++i) {
    printf("%.3f %.3f %.1f\n", points[i].x, points[i].y, points[i].z);
  }

  TWen_to_ab(a, scale, false_easting, false_northing, COUNT, points, points, &status);
  TWt_merc_i(e, lon0, 0, A0, M0, B2, B4, B6, COUNT, points, points, &status);
  for (int i = 0; i < COUNT; ++i) {
    printf("%.7f %.7f\n", points[i].x / degree, points[i].y / degree);
  }
  return TW_OK(status) ? 0 : 1;
}
