// Parameters of the universal grids and of the British national grid.
// Defense Mapping Agency Technical Manual 8358.2, The Universal Grids (1989); Ordnance Survey, A
// Guide to Coordinate Systems in Great Britain.

#include "tidewater/universal_grids.h"
#include "formulas/constants.hpp"

using namespace tidewater::detail;

void TWrslv_utmzone(int16_t zone, double* lon0, TWstatus* status) {
  *status = TW_SUCCESS;
  if (zone < 1 || zone > 60) {
    *status = TW_BAD_ZONE;
    return;
  }
  *lon0 = (6 * zone - 183) * kPi / 180;
}

void TWrslv_utmhemi(int16_t hemisphere, double* false_northing, TWstatus* status) {
  *status = TW_SUCCESS;
  if (hemisphere == 0) {
    *false_northing = 0.0;
  } else if (hemisphere == 1) {
    *false_northing = 10000000.0;
  } else {
    *status = TW_BAD_HEMISPHERE;
  }
}

void TWups(int16_t hemisphere, double* lon0, double* lat0, double* false_easting,
           double* false_northing, double* k0, TWstatus* status) {
  *status = TW_SUCCESS;
  *lon0 = 0;
  *false_easting = 2000000.0;
  *false_northing = 2000000.0;
  *k0 = 0.994;
  if (hemisphere == 0) {
    *lat0 = kHalfPi;
  } else if (hemisphere == 1) {
    *lat0 = -kHalfPi;
  } else {
    *status = TW_BAD_HEMISPHERE;
  }
}

void TWuk_n_grid(double* lon0, double* lat0, double* false_easting, double* false_northing,
                 double* k0, TWstatus* status) {
  *status = TW_SUCCESS;
  *lon0 = -2 * kRadiansPerDegree;
  *lat0 = 49 * kRadiansPerDegree;
  *false_easting = 400000.0;
  *false_northing = -100000.0;
  *k0 = 0.9996012717;
}
