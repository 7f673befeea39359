/**
 * @file universal_grids.h
 * Parameters of the universal grids and of the British national grid.
 *
 * Accuracy: no figure; constants and parameters of families, which enter the rows of their
 * families (docs/accuracy.md).
 *
 * Source: Defense Mapping Agency Technical Manual 8358.2, The Universal Grids (1989), for the
 * universal grids; Ordnance Survey, A Guide to Coordinate Systems in Great Britain, for the British
 * grid.
 */
#ifndef TIDEWATER_UNIVERSAL_GRIDS_H
#define TIDEWATER_UNIVERSAL_GRIDS_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Central meridian of a zone of the Universal Transverse Mercator grid (Snyder 1987, p. 57).  Its
 * central scale is 0.9996 and its false easting 500000 m, which the caller supplies.
 * @param zone    1 to 60
 * @param lon0    central meridian, radians
 * @param status  #TW_BAD_ZONE for any other zone; result unwritten
 */
TW_API void TWrslv_utmzone(int16_t zone, double* lon0, TWstatus* status);

/**
 * False northing of a hemisphere of the Universal Transverse Mercator grid.
 * @param hemisphere      0 for north, 1 for south
 * @param false_northing  0 or 10000000 m
 * @param status          #TW_BAD_HEMISPHERE for any other value; result unwritten
 */
TW_API void TWrslv_utmhemi(int16_t hemisphere, double* false_northing, TWstatus* status);

/**
 * Parameters of the Universal Polar Stereographic grid, for the polar stereographic projection.
 * @param hemisphere                    0 for north, 1 for south
 * @param lon0                          0
 * @param lat0                          pi/2 or -pi/2
 * @param false_easting,false_northing  2000000 m each
 * @param k0                            0.994
 * @param status                        #TW_BAD_HEMISPHERE for any other value: lat0 unwritten, the
 *                                      others written
 */
TW_API void TWups(int16_t hemisphere, double* lon0, double* lat0, double* false_easting,
                  double* false_northing, double* k0, TWstatus* status);

/**
 * Parameters of the British national grid, for the transverse Mercator projection (Ordnance Survey,
 * A Guide to Coordinate Systems in Great Britain, appendix).
 * @param lon0                          2 degrees west, radians
 * @param lat0                          49 degrees north, radians
 * @param false_easting,false_northing  400000 m and -100000 m
 * @param k0                            0.9996012717
 * @param status                        always #TW_SUCCESS
 */
TW_API void TWuk_n_grid(double* lon0, double* lat0, double* false_easting, double* false_northing,
                        double* k0, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
