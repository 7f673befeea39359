// Grid of Malaya: its coefficients and the exported functions.

#include "projections/special/malaya_points.hpp"

#include <algorithm>
#include <iterator>

#include "tidewater/malaya.h"
#include "tidewater/skew_orthomorphic.h"

using namespace tidewater::detail;

namespace {

// Rows 0 and 1 go forward, rows 2 and 3 back.
constexpr double kTable[4 * kMalayaRow] = {
    -5070.0,   -32370.0,     -75.0,       -52440.0,  -3506.0,  -8047.3,     //
    41570.0,   -17650.0,     -34705.3,    131.22,    36030.0,  -1917.0,     //
    120624.9,  -17547.62,    189383.1095, -4200.0,   3685.0,   11456.8,     //
    6633.08,   252611.3,     0.0,                                           //
    590.0,     4180.0,       -13.0,       47100.0,   -3791.0,  30959.8,     //
    72270.0,   -1650.0,      120588.7,    174.3,     -20910.0, 14677.0,     //
    34226.7,   13210.7,      251555.3866, -7240.0,   481.0,    -40377.1,    //
    8810.64,   -190178.0524, 27490.8082,                                    //
    33.7348,   25.2917,      7.1508,      -100.8099, -53.8975, -1088.5873,  //
    38.0828,   30.5043,      -1691.0952,  -466.4008, 19.7374,  20.6693,     //
    1243.3699, 680.5524,     39399.5128,  -7.3462,   -9.9364,  -331.7415,   //
    -270.5924, 52333.9158,   0.0,                                           //
    -9.2574,   -78.9592,     -21.2579,    92.5735,   48.6088,  -236.8446,   //
    157.9184,  127.5476,     2538.6948,   691.5037,  -46.2868, -48.6088,    //
    710.5339,  397.9187,     52115.1603,  -15.7918,  -21.2579, -846.2316,   //
    -691.5037, -39234.8231,  0.0};

}  // namespace

void TWmalaya_param(double* lon_c, double* lat_c, double* false_easting, double* false_northing,
                    double* k0, double* skew, TWstatus* status) {
  // The numbers of the rectified skew orthomorphic grid, in another order.
  TWrso_param(lon_c, lat_c, skew, false_easting, false_northing, k0, status);
}

void TWmalaya_c(double* table, TWstatus* status) {
  *status = TW_SUCCESS;
  std::copy(std::begin(kTable), std::end(kTable), table);
}

void TWmalaya_f(const double* table, double lon0, double lat0, int32_t count,
                const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = over_points(MalayaForward{table, lon0, lat0}, count, in, out);
}

void TWmalaya_i(const double* table, double lon0, double lat0, int32_t count,
                const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = over_points(MalayaInverse{table, lon0, lat0}, count, in, out);
}
