/**
 * @file conformal.h
 * Conformal, conic and azimuthal projections, with the parameters of the universal and state plane
 * grids.
 *
 * A projection is up to four functions with one stem: _c computes constants, _f goes from longitude
 * and latitude to the plane, _i goes back, _s gives local scale factors.  The constants are the
 * caller's: _c writes them once, and they are passed by value to the others.
 *
 * - Plane coordinates are in units of the semi-major axis, with central scale 1 and no false
 * origin: TWab_to_en() applies those.
 * - _f and _i read and write elements x and y of a point; z of the output stays as it is.
 * - _s writes (k, h, h k): scale along the parallel, along the meridian, areal scale, with the
 *   caller's k0 multiplied in.
 * - Output may be the same array as input.
 * - A point that fails leaves its word, which later points do not clear, and takes one of three
 *   forms.  SKIP: its output stays as it was, the loop goes on.  STOP: the function returns, the
 * rest of the output stays as it was.  FILL: the scale falls back to k0 and is written, the loop
 * goes on.
 *
 * Formulas follow Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * where no other source is named.
 */
#ifndef TIDEWATER_CONFORMAL_H
#define TIDEWATER_CONFORMAL_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/** @name Mercator projection of the ellipsoid (Snyder 1987, pp. 38-47)
 *  @{ */

/**
 * Ordinate of the latitude of origin.
 * @param e       first eccentricity
 * @param lat0    latitude of origin, radians; the poles themselves pass
 * @param y0      isometric latitude of lat0
 * @param status  #TW_BAD_LATITUDE beyond a pole; y0 unwritten
 */
TW_API void TWmerc_c(double e, double lat0, double* y0, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 7-6, 7-7).
 * @param e       first eccentricity
 * @param lon0    central meridian, radians; a difference of exactly -pi stays -pi
 * @param y0      constant of TWmerc_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y
 * @param status  #TW_BAD_LATITUDE beyond pi/2 - 1e-14: skip
 */
TW_API void TWmerc_f(double e, double lon0, double y0, int32_t count, const CoordinateTriple* in,
                     CoordinateTriple* out, TWstatus* status);

/**
 * Inverse, to 1e-14 radians (Snyder 1987, eq. 7-9 to 7-12).
 * @param e       first eccentricity
 * @param lon0    central meridian, radians; a longitude of exactly -pi comes out as pi
 * @param y0      constant of TWmerc_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude
 * @param status  always #TW_SUCCESS
 */
TW_API void TWmerc_i(double e, double lon0, double y0, int32_t count, const CoordinateTriple* in,
                     CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, eq. 7-8).  A latitude within 1e-10 of the north pole is held there; one
 * within 1e-10 of the south pole is held just past the NORTH pole and gives a negative k.
 * @param e       first eccentricity
 * @param k0      central scale
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     (k, k, k k)
 * @param status  #TW_BAD_LATITUDE beyond a pole: fill
 */
TW_API void TWmerc_s(double e, double k0, int32_t count, const CoordinateTriple* in,
                     CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Miller cylindrical projection of the sphere (Snyder 1987, pp. 86-89)
 *
 *  The input array and the count come FIRST in these calls.
 *  @{ */

/**
 * Ordinate of the latitude of origin.
 * @param lat0    latitude of origin, radians; not tested
 * @param y0      ordinate of lat0
 * @param status  always #TW_SUCCESS
 */
TW_API void TWmiller_cyl_c(double lat0, double* y0, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 11-1, 11-2).  No latitude is tested.
 * @param in      longitude, latitude
 * @param count   number of points
 * @param lon0    central meridian; a difference of exactly -pi becomes pi
 * @param y0      constant of TWmiller_cyl_c()
 * @param out     x, y
 * @param status  always #TW_SUCCESS
 */
TW_API void TWmiller_cyl_f(const CoordinateTriple* in, int32_t count, double lon0, double y0,
                           CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 11-6, 11-7).  The longitude is not wrapped.
 * @param in      x, y
 * @param count   number of points
 * @param lon0    central meridian
 * @param y0      constant of TWmiller_cyl_c()
 * @param out     longitude, latitude
 * @param status  #TW_RANGE_ERROR for |0.8 (y + y0)| above 700: stop, with the failing point's
 *                longitude already written
 */
TW_API void TWmiller_cyl_i(const CoordinateTriple* in, int32_t count, double lon0, double y0,
                           CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, eq. 11-3, 11-4).  No latitude is tested.
 * @param in      longitude, latitude
 * @param count   number of points
 * @param k0      central scale
 * @param out     (k, h, h k)
 * @param status  always #TW_SUCCESS
 */
TW_API void TWmiller_cyl_s(const CoordinateTriple* in, int32_t count, double k0,
                           CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Equirectangular projection of the sphere (Snyder 1987, pp. 90-91)
 *  @{ */

/**
 * Cosine of the standard parallel.
 * @param lat1      standard parallel, radians, short of the poles
 * @param cos_lat1  its cosine
 * @param status    #TW_BAD_STANDARD_PARALLEL at or beyond a pole; result unwritten
 */
TW_API void TWcyl_eqr_c(double lat1, double* cos_lat1, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 12-1, 12-2).
 * @param lon0      central meridian; a difference of exactly -pi becomes pi
 * @param lat0      latitude of origin
 * @param cos_lat1  constant of TWcyl_eqr_c()
 * @param count     number of points
 * @param in        longitude, latitude
 * @param out       x, y
 * @param status    #TW_BAD_LATITUDE beyond a pole: skip
 */
TW_API void TWcyl_eqr_f(double lon0, double lat0, double cos_lat1, int32_t count,
                        const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 12-5, 12-6).  A latitude beyond a pole is not refused.
 * @param lon0      central meridian; a longitude of exactly -pi becomes pi
 * @param lat0      latitude of origin
 * @param cos_lat1  constant of TWcyl_eqr_c()
 * @param count     number of points
 * @param in        x, y
 * @param out       longitude, latitude
 * @param status    always #TW_SUCCESS
 */
TW_API void TWcyl_eqr_i(double lon0, double lat0, double cos_lat1, int32_t count,
                        const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, eq. 12-3, 12-4); h is k0.
 * @param k0        central scale
 * @param cos_lat1  constant of TWcyl_eqr_c()
 * @param count     number of points
 * @param in        longitude, latitude
 * @param out       (k, k0, k0 k)
 * @param status    #TW_NOT_CONVERGED (this projection alone) beyond a pole: fill
 */
TW_API void TWcyl_eqr_s(double k0, double cos_lat1, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Transverse Mercator and the universal grids (Snyder 1987, pp. 48-65)
 *
 *  Series about the central meridian: within 0.1 mm on the earth's ellipsoids for differences of
 *  longitude up to 3 degrees, and of some use to 50 degrees.
 *  @{ */

/**
 * Coefficients of the meridian arc, m(p) = A0 p - A2 sin 2p + A4 sin 4p - A6 sin 6p + A8 sin 8p,
 * and of the footpoint latitude, p = u + B2 sin 2u + B4 sin 4u + B6 sin 6u (Snyder 1987, eq. 3-21,
 * 3-26).
 * @param e               first eccentricity
 * @param lon0            not read
 * @param lat0            latitude of origin, radians
 * @param A0,A2,A4,A6,A8  coefficients of the arc
 * @param M0              m(lat0); exactly 0 for a latitude of 0
 * @param B2,B4,B6        coefficients of the footpoint latitude
 * @param status          always #TW_SUCCESS
 */
TW_API void TWt_merc_c(double e, double lon0, double lat0, double* A0, double* A2, double* A4,
                       double* A6, double* A8, double* M0, double* B2, double* B4, double* B6,
                       TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 8-9, 8-10, with one more term each; Thomas 1952).  A longitude (not
 * its difference from lon0) or a latitude below 1e-12 in size is taken for 0; within 1e-10 of a
 * pole x is 0 and y the meridian arc.  No latitude is refused.
 * @param e               first eccentricity
 * @param lon0            central meridian; a difference of exactly -pi becomes pi
 * @param A0,A2,A4,A6,A8  constants of TWt_merc_c()
 * @param M0              constant of TWt_merc_c()
 * @param count           number of points
 * @param in              longitude, latitude
 * @param out             x, y
 * @param status          always #TW_SUCCESS
 */
TW_API void TWt_merc_f(double e, double lon0, double A0, double A2, double A4, double A6, double A8,
                       double M0, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                       TWstatus* status);

/**
 * Inverse: the closed form on the sphere for e below 1e-12 (Snyder 1987, eq. 8-6, 8-7), otherwise
 * the series from the footpoint (eq. 8-17, 8-18).  Where the series depart by more than 0.005
 * radians from a sphere that fits midway, as they do far from the central meridian, the sphere's
 * position is given instead, without a word.  The longitude is not wrapped; a footpoint within
 * 1e-12 of a pole gives lon0 and the pole.
 * @param e         first eccentricity
 * @param lon0      central meridian
 * @param lat0      latitude of origin, for the sphere
 * @param A0,M0     constants of TWt_merc_c(), for the ellipsoid
 * @param B2,B4,B6  constants of TWt_merc_c(), for the ellipsoid
 * @param count     number of points
 * @param in        x, y
 * @param out       longitude, latitude
 * @param status    #TW_RANGE_ERROR for |x|, or |x| in units of the fitted sphere's radius, above
 *                  700: stop
 */
TW_API void TWt_merc_i(double e, double lon0, double lat0, double A0, double M0, double B2,
                       double B4, double B6, int32_t count, const CoordinateTriple* in,
                       CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, eq. 8-11), on the difference of longitude as it stands, without a wrap; k0
 * within 1e-10 of a pole.
 * @param e       first eccentricity
 * @param k0      central scale
 * @param lon0    central meridian
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     (k, k, k k)
 * @param status  #TW_I_LATITUDE_LIMITED for a point more than 50 degrees from the central meridian,
 *                whose value is written all the same
 */
TW_API void TWt_merc_s(double e, double k0, double lon0, int32_t count, const CoordinateTriple* in,
                       CoordinateTriple* out, TWstatus* status);

/**
 * Forward with point scale: x and y as TWt_merc_f() gives them, but with no snap of small values to
 * 0, and z of the OUTPUT multiplied by the scale at the point: put 1.0 there (or the scale of an
 * earlier stage) before the call.  The scale is that of TWt_merc_s(), on the difference of
 * longitude without a wrap, and k0 at the poles.
 * @param e               first eccentricity
 * @param lon0            central meridian; a difference of exactly -pi becomes pi for x and y
 * @param A0,A2,A4,A6,A8  constants of TWt_merc_c()
 * @param M0              constant of TWt_merc_c()
 * @param k0              central scale
 * @param count           number of points
 * @param in              longitude, latitude
 * @param out             x, y, and z read and multiplied
 * @param status          always #TW_SUCCESS
 */
TW_API void TWt_merc_xyk(double e, double lon0, double A0, double A2, double A4, double A6,
                         double A8, double M0, double k0, int32_t count, const CoordinateTriple* in,
                         CoordinateTriple* out, TWstatus* status);

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
/** @} */

/** @name Gauss conformal sphere
 *  @{ */

/** @} */

/** @name Lambert conformal conic
 *  @{ */

/** @} */

/** @name Albers equal-area conic
 *  @{ */

/** @} */

/** @name Equidistant conic
 *  @{ */

/** @} */

/** @name State plane zones
 *  @{ */

/** @} */

/** @name Stereographic
 *  @{ */

/** @} */

/** @name Double stereographic
 *  @{ */

/** @} */

/** @name Azimuthal equidistant
 *  @{ */

/** @} */

/** @name Lambert azimuthal equal-area
 *  @{ */

/** @} */

/** @name Gnomonic
 *  @{ */

/** @} */

/** @name Orthographic
 *  @{ */

/** @} */

/** @name Vertical and tilted perspective
 *  @{ */

/** @} */

/** @name Polyconic
 *  @{ */

/** @} */

/** @name Cassini
 *  @{ */

/** @} */

#ifdef __cplusplus
}
#endif

#endif
