/**
 * @file special.h
 * Oblique, pseudocylindrical and special projections, and local distortion.
 */
#ifndef TIDEWATER_SPECIAL_H
#define TIDEWATER_SPECIAL_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/** @name Hotine oblique Mercator
 *  @{ */

/** @} */

/** @name Rectified skew orthomorphic
 *  @{ */

/** @} */

/** @name Laborde
 *  @{ */

/** @} */

/** @name Malaya
 *  @{ */

/** @} */

/** @name Space oblique Mercator
 *  @{ */

/** @} */

/** @name Robinson and its spline
 *  @{ */

/** @} */

/** @name Sinusoidal
 *  @{ */

/** @} */

/** @name Mollweide
 *  @{ */

/** @} */

/** @name Eckert IV
 *  @{ */

/** @} */

/** @name Bonne
 *  @{ */

/** @} */

/** @name Van der Grinten
 *  @{ */

/** @} */

/** @name Bipolar oblique conic
 *  @{ */

/** @} */

/** @name Chamberlin trimetric
 *  @{ */

/** @} */

/** @name Modified polyconic of the International Map of the World
 *  @{ */

/** @} */

/** @name Oblique Lambert and Krovak
 *  @{ */

/** @} */

/** @name New Zealand map grid (Reilly 1973, Survey Review 22, 57-71)
 *
 *  A complex polynomial of the sixth degree over the Mercator plane of the International ellipsoid.
 *  The third double of TWn_zeal_f(), TWn_zeal_i() and TWn_zeal_s() is part of the call but not
 * read. Within New Zealand forward and inverse agree to some 1e-14.
 *  @{ */

/**
 * The fixed parameters of the grid.
 * @param lon_c           longitude of origin, 173 degrees, in radians
 * @param lat_c           latitude of origin, -41 degrees, in radians
 * @param false_easting   2510000 m
 * @param false_northing  6023150 m
 * @param k0              1
 * @param status          always #TW_SUCCESS
 */
TW_API void TWn_zeal_param(double* lon_c, double* lat_c, double* false_easting,
                           double* false_northing, double* k0, TWstatus* status);

/**
 * Mercator ordinate of the latitude of origin.
 * @param e       first eccentricity
 * @param lat0    latitude of origin, radians; the poles themselves pass
 * @param y0      isometric latitude of lat0
 * @param status  #TW_BAD_LATITUDE beyond a pole; y0 unwritten
 */
TW_API void TWn_zeal_c(double e, double lat0, double* y0, TWstatus* status);

/**
 * Forward.
 * @param e       first eccentricity
 * @param lon0    longitude of origin
 * @param unused  not read
 * @param y0      constant of TWn_zeal_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y; may be in
 * @param status  #TW_BAD_LATITUDE at a pole, as TWmerc_f(): the output of such a point is READ ALL
 * THE SAME, and replaced by the polynomial of what it held
 */
TW_API void TWn_zeal_f(double e, double lon0, double unused, double y0, int32_t count,
                       const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse.  An iteration that does not converge leaves no word.
 * @param e       first eccentricity
 * @param lon0    longitude of origin
 * @param unused  not read
 * @param y0      constant of TWn_zeal_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude; may be in
 * @param status  always #TW_SUCCESS
 */
TW_API void TWn_zeal_i(double e, double lon0, double unused, double y0, int32_t count,
                       const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Scale, the size of the polynomial's derivative times the Mercator scale.  Latitudes within 1e-10
 * of a pole are held as in TWmerc_s(), the south pole just past the NORTH pole, which gives a
 * negative k and #TW_BAD_LATITUDE.
 * @param e       first eccentricity
 * @param lon0    longitude of origin; the difference is not wrapped
 * @param unused  not read
 * @param y0      constant of TWn_zeal_c()
 * @param k0      the fill of a failing point; it has NO OTHER PART in the scale
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     (k, k, k k); may be in
 * @param status  #TW_BAD_LATITUDE beyond a pole: fill
 */
TW_API void TWn_zeal_s(double e, double lon0, double unused, double y0, double k0, int32_t count,
                       const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Value of the grid's polynomial at a complex number.  This call has no status.
 * @param re,im   isometric latitude and longitude, both from the origin
 * @param result  two doubles: real part (y) and imaginary part (x)
 */
TW_API void TWn_zeal_fpoly(double re, double im, double* result);

/**
 * Derivative of the grid's polynomial.  This call has no status.
 * @param re,im   isometric latitude and longitude, both from the origin
 * @param result  two doubles: real and imaginary part
 */
TW_API void TWn_zeal_grad(double re, double im, double* result);

/**
 * The complex number at which the grid's polynomial has a value, by Newton's rule to 1e-14.
 * @param re,im   the value: y, x
 * @param result  two doubles: isometric latitude and longitude, both from the origin
 * @param status  #TW_NOT_CONVERGED when 50 passes were used; the result is written all the same
 */
TW_API void TWn_zeal_ipoly(double re, double im, double* result, TWstatus* status);
/** @} */

/** @name Indian polyhedric (power series about an origin)
 *
 *  Two orders about a latitude of origin, for sheets of some degrees.
 *  @{ */

/**
 * Coefficients of the series.
 * @param e                  first eccentricity
 * @param lat0               latitude of origin, radians; not tested
 * @param c1,c2,c3,c4,c5,c6  coefficients
 * @param status             always #TW_SUCCESS
 */
TW_API void TWind_phed_c(double e, double lat0, double* c1, double* c2, double* c3, double* c4,
                         double* c5, double* c6, TWstatus* status);

/**
 * Forward.  The eccentricity is in the coefficients.
 * @param lon0               central meridian; a difference of exactly -pi becomes pi
 * @param lat0               latitude of origin
 * @param c1,c2,c3,c4,c5,c6  constants of TWind_phed_c()
 * @param count              number of points
 * @param in                 longitude, latitude
 * @param out                x, y in units of the semi-major axis; may be in
 * @param status             always #TW_SUCCESS
 */
TW_API void TWind_phed_f(double lon0, double lat0, double c1, double c2, double c3, double c4,
                         double c5, double c6, int32_t count, const CoordinateTriple* in,
                         CoordinateTriple* out, TWstatus* status);

/**
 * Inverse, by steps of the residual until it is 1e-9 or less.
 * @param a                  semi-major axis in METRES: it scales the steps, not the coordinates
 * @param lon0               central meridian; the longitude is not wrapped
 * @param lat0               latitude of origin
 * @param c1,c2,c3,c4,c5,c6  constants of TWind_phed_c()
 * @param count              number of points
 * @param in                 x, y in units of the semi-major axis
 * @param out                longitude, latitude; may be in
 * @param status             #TW_NOT_CONVERGED after 31 passes, or when the residual has risen three
 * times in a row; the point is written with what is at hand, and the loop goes on
 */
TW_API void TWind_phed_i(double a, double lon0, double lat0, double c1, double c2, double c3,
                         double c4, double c5, double c6, int32_t count, const CoordinateTriple* in,
                         CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Rotated graticule (Snyder 1987, pp. 29-32)
 *
 *  Longitude and latitude on the sphere as seen from another pole.  TWrotgrat_f() and TWrotgrat_i()
 *  have lat0 in their calls but do not read it.
 *  @{ */

/**
 * The longitude that the new graticule is turned by, so that the origin keeps its meridian.
 * @param lon0,lat0          origin, radians
 * @param pole_lon,pole_lat  the new pole
 * @param offset             radians; 0 where origin and pole are one
 * @param status             always #TW_SUCCESS
 */
TW_API void TWrotgrat_c(double lon0, double lat0, double pole_lon, double pole_lat, double* offset,
                        TWstatus* status);

/**
 * To the rotated graticule (Snyder 1987, eq. 5-7, 5-8b).  A pole within 1e-12 of the north pole
 * copies the points unchanged, WITHOUT the offset.
 * @param lon0               longitude of the origin
 * @param lat0               not read
 * @param pole_lon,pole_lat  the new pole
 * @param offset             constant of TWrotgrat_c()
 * @param count              number of points
 * @param in                 longitude, latitude
 * @param out                longitude in (-pi, pi], latitude; may be in.  The pole itself and its
 * antipode take the longitude lon0 + offset
 * @param status             always #TW_SUCCESS
 */
TW_API void TWrotgrat_f(double lon0, double lat0, double pole_lon, double pole_lat, double offset,
                        int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                        TWstatus* status);

/**
 * Back from the rotated graticule (Snyder 1987, eq. 5-9, 5-10b).  A north pole is no special case
 * here.
 * @param lon0               longitude of the origin; the longitude of a point that comes out at a
 * pole
 * @param lat0               not read
 * @param pole_lon,pole_lat  the new pole
 * @param offset             constant of TWrotgrat_c()
 * @param count              number of points
 * @param in                 longitude, latitude
 * @param out                longitude in (-pi, pi], latitude; may be in
 * @param status             always #TW_SUCCESS
 */
TW_API void TWrotgrat_i(double lon0, double lat0, double pole_lon, double pole_lat, double offset,
                        int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                        TWstatus* status);
/** @} */

/** @name Local distortion
 *  @{ */

/** @} */

#ifdef __cplusplus
}
#endif

#endif
