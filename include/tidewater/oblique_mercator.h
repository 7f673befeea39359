/**
 * @file oblique_mercator.h
 * Hotine oblique Mercator projection of the ellipsoid.
 *
 * Skew coordinates u along the central line and v across it, counted from the crossing of the line
 * with the equator of the aposphere, are rotated to map axes by the azimuth of the line.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Hotine oblique Mercator, lon within 10, lat -6 to 14: forward 14 nm (14 nm), inverse 15 nm
 *   (14 nm), scale 5.1e-16 (3.5e-16).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 66-75
 * and 274-278.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_OBLIQUE_MERCATOR_H
#define TIDEWATER_OBLIQUE_MERCATOR_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Constants (Snyder 1987, eq. 9-11 to 9-26).  The steps end at the first failure; all outputs are
 * written in any case, with zero for what was not reached.
 * @param mode    0 (or any value but 1 and 2): azimuth alpha at (lon_c, *lat0); 1: azimuth alpha at
 *                (lon_c, lat_c); 2: line through (lon_c, lat_c) and (lon2, lat2), origin at *lat0
 * @param e       first eccentricity
 * @param lon_c   longitude of the centre, or of the first point
 * @param lat_c   latitude of the centre (mode 1), or of the first point (mode 2)
 * @param lon2    longitude of the second point (mode 2)
 * @param lat2    latitude of the second point (mode 2)
 * @param lat0    in: latitude of the origin; out: the same, lat_c in mode 1
 * @param alpha   in: azimuth of the central line at the centre (modes 0 and 1); out: azimuth, with
 *                2 pi added where it is negative
 * @param B       constant of the aposphere
 * @param A       radius of the aposphere
 * @param E       constant of the isometric latitude
 * @param lon0    longitude where the central line crosses the equator of the aposphere
 * @param gamma0  azimuth of the central line there
 * @param status  #TW_BAD_PARAMETER for a sine beyond 1 by more than 1e-14, and in mode 2 for two
 *                equal points or a line that has no constants (a point or the origin at a pole)
 */
TW_API void TWo_merc_c(int16_t mode, double e, double lon_c, double lat_c, double lon2, double lat2,
                       double* lat0, double* alpha, double* B, double* A, double* E, double* lon0,
                       double* gamma0, TWstatus* status);

/**
 * Skew coordinates, and the scale if it is wanted (Snyder 1987, eq. 9-27 to 9-32).  Within 1e-10 of
 * a pole the formulas of the pole apply.
 * @param e       first eccentricity
 * @param alpha   not read
 * @param gamma0  constant of TWo_merc_c()
 * @param lon0    constant of TWo_merc_c()
 * @param E       constant of TWo_merc_c()
 * @param B       constant of TWo_merc_c()
 * @param A       constant of TWo_merc_c()
 * @param want_k  other than 0: k, for central scale 1, goes to element z of the output
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     u, v, and k if wanted
 * @param status  #TW_RANGE_ERROR where v is infinite: the point is written with u and v of the
 *                point before it (0 for the first), the loop goes on
 */
TW_API void TWo_merc_uv_k(double e, double alpha, double gamma0, double lon0, double E, double B,
                          double A, int16_t want_k, int32_t count, const CoordinateTriple* in,
                          CoordinateTriple* out, TWstatus* status);

/**
 * Rotates skew coordinates to map axes (Snyder 1987, eq. 9-33, 9-34).
 * @param alpha   azimuth of the central line
 * @param count   number of points
 * @param in      u, v
 * @param out     x, y
 * @param status  always #TW_SUCCESS
 */
TW_API void TWo_merc_rot(double alpha, int32_t count, const CoordinateTriple* in,
                         CoordinateTriple* out, TWstatus* status);

/**
 * Forward: TWo_merc_uv_k() and TWo_merc_rot().
 * @param e       first eccentricity
 * @param alpha   rotation from skew to map axes, constant of TWo_merc_c()
 * @param gamma0  constant of TWo_merc_c()
 * @param lon0    constant of TWo_merc_c()
 * @param E       constant of TWo_merc_c()
 * @param B       constant of TWo_merc_c()
 * @param A       constant of TWo_merc_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y; skew coordinates u, v for the WHOLE array if any point failed
 * @param status  as TWo_merc_uv_k()
 */
TW_API void TWo_merc_f(double e, double alpha, double gamma0, double lon0, double E, double B,
                       double A, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                       TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 9-35 to 9-43).  The latitude is the one at which Snyder's iteration
 * rests, found without it, so that an eccentricity near 1 takes no longer than another.  The
 * longitude is not wrapped.
 * @param e       first eccentricity
 * @param alpha   rotation from skew to map axes, constant of TWo_merc_c()
 * @param gamma0  constant of TWo_merc_c()
 * @param lon0    constant of TWo_merc_c()
 * @param E       constant of TWo_merc_c()
 * @param B       constant of TWo_merc_c()
 * @param A       constant of TWo_merc_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude
 * @param status  always #TW_SUCCESS
 */
TW_API void TWo_merc_i(double e, double alpha, double gamma0, double lon0, double E, double B,
                       double A, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                       TWstatus* status);

/**
 * Scale.  The projection is conformal.
 * @param e       first eccentricity
 * @param k0      central scale
 * @param alpha   rotation from skew to map axes, constant of TWo_merc_c()
 * @param gamma0  constant of TWo_merc_c()
 * @param lon0    constant of TWo_merc_c()
 * @param E       constant of TWo_merc_c()
 * @param B       constant of TWo_merc_c()
 * @param A       constant of TWo_merc_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     (k, k, k k); (u, v, k) for the whole array if any point failed
 * @param status  as TWo_merc_uv_k()
 */
TW_API void TWo_merc_s(double e, double k0, double alpha, double gamma0, double lon0, double E,
                       double B, double A, int32_t count, const CoordinateTriple* in,
                       CoordinateTriple* out, TWstatus* status);

/**
 * Parameters of the oblique Mercator grid of Madagascar, for mode 1 of TWo_merc_c(): 18d54'S,
 * 46d26'13.95"E of Greenwich, azimuth 18d54'.
 * @param azimuth         azimuth of the central line, radians
 * @param lon_c           longitude of the centre, radians
 * @param lat_c           latitude of the centre, radians
 * @param false_easting   metres
 * @param false_northing  metres
 * @param k0              central scale
 * @param status          always #TW_SUCCESS
 */
TW_API void TWmadagascar(double* azimuth, double* lon_c, double* lat_c, double* false_easting,
                         double* false_northing, double* k0, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
