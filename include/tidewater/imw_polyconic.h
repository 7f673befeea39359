/**
 * @file imw_polyconic.h
 * Modified polyconic projection of the International Map of the World.
 *
 * A sheet spans 4 degrees of latitude, and 4 degrees of longitude; 8 from 60 degrees of latitude
 * on, 16 from 76 degrees on.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Modified polyconic (IMW), a sheet, lat 40 to 44, lon within 3: forward 20 nm (18 nm), inverse
 *   710 nm (496 nm).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 131-137.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_IMW_POLYCONIC_H
#define TIDEWATER_IMW_POLYCONIC_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * The bounds of a sheet.
 * @param lon0         central meridian, radians
 * @param lat          southern edge, from -pi/2 to pi/2 less 4 degrees
 * @param lon_w,lon_e  western and eastern edge
 * @param lat1,lat2    southern and northern edge
 * @param status       #TW_BAD_LATITUDE outside that range; nothing written
 */
TW_API void TWIMWmodP_stp(double lon0, double lat, double* lon_w, double* lon_e, double* lat1,
                          double* lat2, TWstatus* status);

/**
 * Constants of a sheet (Snyder 1987, eq. 18-23 to 18-35).
 * @param e       first eccentricity
 * @param lon0    not read
 * @param lat1    southern edge, as in TWIMWmodP_stp()
 * @param r1,r2   radii of the edges' arcs; 0 on the equator
 * @param c       ordinate of the northern edge on the central meridian
 * @param p,q     how the ordinate of the eastern meridian's image goes with the meridian arc
 * @param s,t     how its abscissa does
 * @param status  #TW_BAD_LATITUDE as in TWIMWmodP_stp(), nothing written; the status of
 *                TWmerid_dist_f()
 */
TW_API void TWIMWmodPoly_c(double e, double lon0, double lat1, double* r1, double* r2, double* c,
                           double* p, double* q, double* s, double* t, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 18-36 to 18-51).
 * @param e          first eccentricity
 * @param lon0       central meridian; a difference beyond two pi is refused
 * @param lat1       southern edge of the sheet
 * @param r1,r2      constants of TWIMWmodPoly_c()
 * @param c,p,q,s,t  constants of TWIMWmodPoly_c()
 * @param count      number of points
 * @param in         longitude, latitude
 * @param out        x, y; the origin is the southern edge on the central meridian
 * @param status     #TW_BAD_LATITUDE beyond a pole by more than 1e-9, #TW_BAD_LONGITUDE,
 *                   #TW_RANGE_ERROR for a point too far from the sheet, and the status of
 *                   TWmerid_dist_f(): stop.  #TW_I_LATITUDE_LIMITED for a latitude clamped to a
 *                   pole
 */
TW_API void TWIMWmodPoly_f(double e, double lon0, double lat1, double r1, double r2, double c,
                           double p, double q, double s, double t, int32_t count,
                           const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse, by proportion, until both coordinates are within 1e-13, at most 15 passes.
 * @param e          first eccentricity
 * @param lon0       central meridian
 * @param lat1       southern edge of the sheet
 * @param r1,r2      constants of TWIMWmodPoly_c()
 * @param c,p,q,s,t  constants of TWIMWmodPoly_c()
 * @param count      number of points
 * @param in         x, y
 * @param out        longitude, latitude
 * @param status     #TW_I_LATITUDE_LIMITED where the passes ran out, the forward function failed or
 *                   the latitude was clamped to a pole; the point is written all the same
 */
TW_API void TWIMWmodPoly_i(double e, double lon0, double lat1, double r1, double r2, double c,
                           double p, double q, double s, double t, int32_t count,
                           const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
