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
 *  Series about the central meridian.  For differences of longitude up to 3 degrees on the earth's
 *  ellipsoids x is within 0.01 mm and y, whose meridian arc is a series too, within 2 mm; so is a
 *  round trip.  Some use remains to 50 degrees.
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
 * Forward (Snyder 1987, eq. 8-9, 8-10, carried one term further as in Defense Mapping Agency
 * Technical Manual 8358.2, The Universal Grids, 1989, chapter 2).  A longitude (not
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

/** @name Gauss conformal sphere (IOGP Publication 373-7-2, oblique stereographic)
 *
 *  The ellipsoid is mapped conformally onto a sphere that touches it at the latitude of origin.
 *  The results are longitude and latitude on that sphere, in radians, not plane coordinates: it is
 *  the first stage of other projections.
 *  @{ */

/**
 * The sphere that fits a latitude.  An e below 1e-12 gives c = -1, which tells the other functions
 * to change nothing but the longitude's origin; an origin within 2e-6 of a pole gives c = 1, with
 * t and R taken at 2e-6 from the pole.
 * @param e       first eccentricity
 * @param lat0    latitude of origin, radians; beyond a pole t is a not-a-number
 * @param chi0    latitude of origin on the sphere
 * @param c       ratio of longitudes, sphere over ellipsoid
 * @param t       shift of the isometric latitude between ellipsoid and sphere
 * @param R       radius of the sphere, in units of the semi-major axis
 * @param status  #TW_BAD_ECCENTRICITY for e^2 of one or more: R unwritten, the others written
 */
TW_API void TWgaussII_c(double e, double lat0, double* chi0, double* c, double* t, double* R,
                        TWstatus* status);

/**
 * Ellipsoid to sphere.  A latitude above pi/2 - 1e-12 in size passes as it is, with lon - lon0.
 * @param e       first eccentricity
 * @param lon0    central meridian
 * @param c,t     constants of TWgaussII_c()
 * @param count   number of points
 * @param in      longitude, latitude on the ellipsoid
 * @param out     longitude from lon0 and latitude, on the sphere
 * @param status  always #TW_SUCCESS
 */
TW_API void TWgaussII_f(double e, double lon0, double c, double t, int32_t count,
                        const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Sphere to ellipsoid.  A latitude above pi/2 - 1e-13 in size (not the bound of TWgaussII_f())
 * passes as it is, with its longitude plus lon0.
 * @param e       first eccentricity
 * @param lon0    central meridian
 * @param c,t     constants of TWgaussII_c()
 * @param count   number of points
 * @param in      longitude from lon0 and latitude, on the sphere
 * @param out     longitude, latitude on the ellipsoid
 * @param status  always #TW_SUCCESS
 */
TW_API void TWgaussII_i(double e, double lon0, double c, double t, int32_t count,
                        const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Ellipsoid to sphere with the scale of the mapping.  It works IN PLACE only: in and out must be
 * the same array, and z is overwritten.  (With two arrays z of in is lost to the latitude, and the
 * scale is formed with whatever latitude z of out held.)
 * @param e       first eccentricity
 * @param lon0    central meridian
 * @param c,t,R   constants of TWgaussII_c()
 * @param k0      factor of the scale
 * @param count   number of points
 * @param in      longitude, latitude; z CHANGED by the call
 * @param out     longitude and latitude on the sphere as from TWgaussII_f(), z the scale
 * @param status  #TW_BAD_LATITUDE for a latitude beyond a pole: its scale is k0, the loop goes on
 */
TW_API void TWgaussII_s(double e, double lon0, double c, double t, double R, double k0,
                        int32_t count, CoordinateTriple* in, CoordinateTriple* out,
                        TWstatus* status);

/**
 * Gauss-Schreiber projection with point scale: the conformal sphere by TWgaussII_s(), then the
 * transverse Mercator projection of that sphere by TWt_merc_xyk() with e = 0.  It works IN PLACE
 * only, as TWgaussII_s() does.
 * @param e               first eccentricity
 * @param lon0            central meridian
 * @param c,t,R           constants of TWgaussII_c()
 * @param A0,A2,A4,A6,A8  constants of TWt_merc_c() for the sphere, e = 0
 * @param M0              constant of TWt_merc_c() at the latitude of origin on the sphere
 * @param k0              central scale
 * @param count           number of points
 * @param in              longitude, latitude; z CHANGED by the call
 * @param out             x, y in units of the sphere's radius, z the scale of both stages
 * @param status          #TW_BAD_LATITUDE for a latitude beyond a pole: the array holds the first
 *                        stage only
 */
TW_API void TWg_schreiber(double e, double lon0, double c, double t, double R, double A0, double A2,
                          double A4, double A6, double A8, double M0, double k0, int32_t count,
                          CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * The step between the two Mercator planes: c x and c (y + t).
 * @param c,t     constants of TWgaussII_c()
 * @param count   number of points
 * @param in      x, y in the Mercator plane of the ellipsoid
 * @param out     x, y in the Mercator plane of the sphere
 * @param status  always #TW_SUCCESS
 */
TW_API void TWgauII_f(double c, double t, int32_t count, const CoordinateTriple* in,
                      CoordinateTriple* out, TWstatus* status);

/**
 * The inverse of TWgauII_f(): x / c and y / c - t.
 * @param c,t     constants of TWgaussII_c()
 * @param count   number of points
 * @param in      x, y in the Mercator plane of the sphere
 * @param out     x, y in the Mercator plane of the ellipsoid
 * @param status  always #TW_SUCCESS
 */
TW_API void TWgauII_i(double c, double t, int32_t count, const CoordinateTriple* in,
                      CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Lambert conformal conic (Snyder 1987, pp. 104-110)
 *
 *  TWlam_i() takes its OUTPUT array before its input array.
 *  @{ */

/**
 * Constants of a cone with one or two standard parallels (Snyder 1987, eq. 14-15, 15-8 to 15-10).
 * @param e          first eccentricity
 * @param lon0       not read
 * @param lat0       latitude of origin, radians
 * @param lat1,lat2  standard parallels; equal for a single one, which may be a pole
 * @param C          the cone's F: rho = C t^n
 * @param n          cone constant, negative for an apex in the south
 * @param rho0       rho at lat0; 0 at the apex pole
 * @param status     #TW_BAD_LATITUDE for lat0 beyond a pole, nothing written, or at the pole away
 *                   from the apex, n and C written; #TW_BAD_PARAMETER for a single parallel on the
 *                   equator or parallels that cannot be told apart, nothing written, and for
 *                   parallels symmetric about the equator, n written
 */
TW_API void TWlam_c(double e, double lon0, double lat0, double lat1, double lat2, double* C,
                    double* n, double* rho0, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 14-1 to 14-4, 15-7).  A point within 1e-14 of the apex pole gives x = 0
 * and y = rho0.
 * @param e       first eccentricity
 * @param lon0    central meridian; a difference of exactly -pi becomes pi
 * @param C       constant of TWlam_c()
 * @param n       constant of TWlam_c()
 * @param rho0    constant of TWlam_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y
 * @param status  #TW_BAD_LATITUDE beyond a pole, or at the pole away from the apex: stop
 */
TW_API void TWlam_f(double e, double lon0, double C, double n, double rho0, int32_t count,
                    const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse, to 1e-14 radians (Snyder 1987, eq. 14-9 to 14-11, 15-11, 7-9).  Mind the order of the
 * arrays: OUT comes before in.  A point within 1e-13 of a pole gets lon0 as it was given.
 * @param e       first eccentricity
 * @param lon0    central meridian; a longitude of exactly -pi comes out as pi
 * @param C       constant of TWlam_c()
 * @param n       constant of TWlam_c()
 * @param rho0    constant of TWlam_c()
 * @param count   number of points
 * @param out     longitude, latitude
 * @param in      x, y
 * @param status  #TW_I_LATITUDE_LIMITED when a latitude took all 15 passes; it is written
 */
TW_API void TWlam_i(double e, double lon0, double C, double n, double rho0, int32_t count,
                    CoordinateTriple* out, const CoordinateTriple* in, TWstatus* status);

/**
 * Scale (Snyder 1987, eq. 15-7, 14-16).  A latitude within 1e-10 of the north pole is held there;
 * one within 1e-10 of the south pole is held just past the NORTH pole, where the formula gives a
 * not-a-number unless n is a whole number.
 * @param e       first eccentricity
 * @param k0      central scale
 * @param C       constant of TWlam_c()
 * @param n       constant of TWlam_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     (k, k, k k)
 * @param status  #TW_BAD_LATITUDE beyond a pole, or where the parallel's radius is below 1e-10:
 *                fill
 */
TW_API void TWlam_s(double e, double k0, double C, double n, int32_t count,
                    const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Albers equal-area conic (Snyder 1987, pp. 98-103)
 *
 *  TWalbers_c() has NO status argument, and TWalbers_s() takes C before n, the reverse of the
 *  others.
 *  @{ */

/**
 * Constants of a cone with one or two standard parallels (Snyder 1987, eq. 14-12 to 14-15).  It
 * cannot fail: parallels symmetric about the equator give a cone constant of zero and a rho0 that
 * is no number.
 * @param e          first eccentricity; exactly 0 for the sphere
 * @param lon0       not read
 * @param lat0       latitude of origin, radians
 * @param lat1,lat2  standard parallels; less than 1e-13 apart they count as one
 * @param n          cone constant
 * @param C          constant of rho = sqrt(C - n q) / n
 * @param rho0       rho at lat0
 */
TW_API void TWalbers_c(double e, double lon0, double lat0, double lat1, double lat2, double* n,
                       double* C, double* rho0);

/**
 * Forward (Snyder 1987, eq. 14-1 to 14-4, 14-12).
 * @param e       first eccentricity; exactly 0 for the sphere
 * @param lon0    central meridian; whole turns are taken off a difference, -pi and pi stay
 * @param n       constant of TWalbers_c()
 * @param C       constant of TWalbers_c()
 * @param rho0    constant of TWalbers_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y
 * @param status  #TW_BAD_LATITUDE beyond pi/2 + 1e-12: stop; #TW_I_LATITUDE_LIMITED for a latitude
 *                beyond pi/2 held at the pole
 */
TW_API void TWalbers_f(double e, double lon0, double n, double C, double rho0, int32_t count,
                       const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 14-8 to 14-11, 14-19, 3-16), to 1e-13 radians away from the poles.
 * Newton's steps shrink only by half towards a pole; there they are extrapolated, and a latitude
 * that comes within 4e-5 radians may be held at the pole.  On the sphere (e of 1e-13 or less) one
 * within 4e-7 of a pole is the pole.  The longitude is not wrapped.  For an eccentricity above
 * 1e-13 and below about 0.01, as no ellipsoid of the earth has, the logarithm of the formula loses
 * digits (1e-16 / e of them), in all four functions: pass 0 for a sphere.
 * @param e       first eccentricity
 * @param lon0    central meridian
 * @param n       constant of TWalbers_c()
 * @param C       constant of TWalbers_c()
 * @param rho0    constant of TWalbers_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude
 * @param status  #TW_NOT_CONVERGED for a point outside the cone's fan or beyond its poles: stop;
 *                #TW_I_LATITUDE_LIMITED for a latitude held at a pole, or one that took all 30
 *                steps, both written; on the ellipsoid a point a hair beyond the SOUTH pole comes
 *                out at the north pole with this word
 */
TW_API void TWalbers_i(double e, double lon0, double n, double C, double rho0, int32_t count,
                       const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, eq. 14-16, 14-18).  The areal scale is k0 squared.  At the apex of a polar
 * cone k is k0; at any other pole it is -k0, a marker, with h = 0.
 * @param e       first eccentricity; exactly 0 for the sphere
 * @param k0      central scale
 * @param C       constant of TWalbers_c(); here BEFORE n
 * @param n       constant of TWalbers_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     (k k0, k0 / k, k0 k0)
 * @param status  #TW_NOT_CONVERGED beyond a pole: stop
 */
TW_API void TWalbers_s(double e, double k0, double C, double n, int32_t count,
                       const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Equidistant conic (Snyder 1987, pp. 111-115)
 *
 *  Meridian series in powers of cos 2p: M(p) = C0 p + (((C8 cos 2p + C6) cos 2p + C4) cos 2p + C2)
 *  sin 2p, and the latitude of a rectifying latitude u with D2 to D8 likewise.  Nothing is tested
 *  in these functions.  Arrays may have any number of points that the count can tell.
 *  @{ */

/**
 * Constants of a cone with one or two standard parallels (Snyder 1987, p. 114, eq. 3-21, 3-26).
 * @param e            first eccentricity
 * @param lat0         latitude of origin, radians
 * @param lat1,lat2    standard parallels; exactly equal for a single one
 * @param n            cone constant
 * @param G            radius of the equator on the cone
 * @param rho0         radius of the parallel of lat0
 * @param C0           coefficient of the arc
 * @param C2,C4,C6,C8  coefficients of the arc
 * @param D2,D4,D6,D8  coefficients of the latitude
 * @param status       always #TW_SUCCESS
 */
TW_API void TWconic_c(double e, double lat0, double lat1, double lat2, double* n, double* G,
                      double* rho0, double* C0, double* C2, double* C4, double* C6, double* C8,
                      double* D2, double* D4, double* D6, double* D8, TWstatus* status);

/**
 * Forward (Snyder 1987, p. 114).
 * @param lon0         central meridian; whole turns are taken off a difference, -pi and pi stay
 * @param n,G,rho0     constants of TWconic_c()
 * @param C0           constant of TWconic_c()
 * @param C2,C4,C6,C8  constants of TWconic_c()
 * @param count        number of points
 * @param in           longitude, latitude
 * @param out          x, y
 * @param status       always #TW_SUCCESS
 */
TW_API void TWconic_f(double lon0, double n, double G, double rho0, double C0, double C2, double C4,
                      double C6, double C8, int32_t count, const CoordinateTriple* in,
                      CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, p. 115).  The longitude is not wrapped.
 * @param lon0         central meridian
 * @param n,G,rho0     constants of TWconic_c()
 * @param C0           constant of TWconic_c()
 * @param D2,D4,D6,D8  constants of TWconic_c()
 * @param count        number of points
 * @param in           x, y
 * @param out          longitude, latitude
 * @param status       always #TW_SUCCESS
 */
TW_API void TWconic_i(double lon0, double n, double G, double rho0, double C0, double D2, double D4,
                      double D6, double D8, int32_t count, const CoordinateTriple* in,
                      CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, p. 114).  The third element carries k0 once, not twice.
 * @param e            first eccentricity
 * @param k0           central scale
 * @param n,G          constants of TWconic_c()
 * @param C0           constant of TWconic_c()
 * @param C2,C4,C6,C8  constants of TWconic_c()
 * @param count        number of points
 * @param in           longitude, latitude; a pole is not caught
 * @param out          (k k0, k0, k k0)
 * @param status       always #TW_SUCCESS
 */
TW_API void TWconic_s(double e, double k0, double n, double G, double C0, double C2, double C4,
                      double C6, double C8, int32_t count, const CoordinateTriple* in,
                      CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name State plane zones (Claire 1968, C&GS Publication 62-4; Stem 1989, NOAA Manual NOS NGS 5)
 *
 *  Parameters of the zones of the State Plane Coordinate Systems, by zone number.  The projection
 * of a zone is TWt_merc_f(), TWlam_f() or TWo_merc_f(), by its type.
 *  @{ */

/**
 * A zone of the 1927 system.  False values come out in metres, turned from US survey feet
 * (1200/3937).
 * @param zone_text               the zone number in the start of a text: blanks and a sign may
 * stand before it, anything behind it
 * @param type                    0 transverse Mercator, 1 Lambert with two parallels, -1 oblique
 * Mercator
 * @param lon0,lat0               origin, radians
 * @param false_easting           metres
 * @param false_northing          metres
 * @param k0                      scale on the central line
 * @param lat1,lat2               standard parallels, radians; written for type 1 alone
 * @param lon_center,lat_center   centre of the oblique line, radians; written for type -1 alone
 * @param azimuth                 of the oblique line, radians; written for type -1 alone
 * @param status                  #TW_BAD_ZONE for a zone that is not in the list, or no number;
 * nothing is written
 */
TW_API void TWspcs27(const char* zone_text, int16_t* type, double* lon0, double* lat0,
                     double* false_easting, double* false_northing, double* k0, double* lat1,
                     double* lat2, double* lon_center, double* lat_center, double* azimuth,
                     TWstatus* status);

/**
 * A zone of the 1983 system.
 * @param zone_text               the zone number in the start of a text: blanks and a sign may
 * stand before it, anything behind it
 * @param type                    0 transverse Mercator, 1 Lambert with two parallels, -1 oblique
 * Mercator
 * @param lon0,lat0               origin, radians
 * @param false_easting           metres
 * @param false_northing          metres
 * @param k0                      scale on the central line
 * @param lat1,lat2               standard parallels, radians; written for type 1 alone
 * @param lon_center,lat_center   centre of the oblique line, radians; written for type -1 alone
 * @param azimuth                 of the oblique line, radians; written for type -1 alone
 * @param status                  #TW_BAD_ZONE for a zone that is not in the list, or no number;
 * nothing is written
 */
TW_API void TWspcs83(const char* zone_text, int16_t* type, double* lon0, double* lat0,
                     double* false_easting, double* false_northing, double* k0, double* lat1,
                     double* lat2, double* lon_center, double* lat_center, double* azimuth,
                     TWstatus* status);
/** @} */

/** @name Stereographic projection of the ellipsoid (Snyder 1987, pp. 154-163)
 *
 *  Oblique through the conformal latitude where C is exactly 0, polar otherwise.  A point within
 * 1e-12 of the origin in longitude and in latitude is the origin.  Differences of longitude are not
 * wrapped.
 *  @{ */

/**
 * Constants (Snyder 1987, eq. 14-15, 3-1, 21-33).  An origin within 1e-14 of a pole is polar.
 * @param e       first eccentricity
 * @param lat0    latitude of origin, radians
 * @param C       0 for an oblique origin; else the polar factor, negative at the south pole
 * @param m0      radius of the parallel of origin; unwritten at a pole
 * @param chi0    conformal latitude of origin; unwritten at a pole
 * @param status  #TW_BAD_LATITUDE beyond a pole; C and m0 are written, chi0 is not
 */
TW_API void TWstereo_c(double e, double lat0, double* C, double* m0, double* chi0,
                       TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 21-24, 21-25, 21-27; polar 21-30, 21-33).
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param C,m0,chi0  constants of TWstereo_c()
 * @param count      number of points
 * @param in         longitude, latitude
 * @param out        x, y; may be in
 * @param status     #TW_BAD_LATITUDE beyond a pole: skip
 */
TW_API void TWstereo_f(double e, double lon0, double lat0, double C, double m0, double chi0,
                       int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                       TWstatus* status);

/**
 * Inverse, to 1e-12 radians (Snyder 1987, eq. 20-14, 21-36 to 21-38; polar 7-9, 20-16).
 *
 * On the oblique road the longitude is a plain arctangent, so it NEVER LIES MORE THAN 90 DEGREES
 * from lon0.  On the polar road of the south lon0 is negated at each point that is not the origin,
 * so with a lon0 other than 0 the longitudes of points in an array ALTERNATE between right and
 * shifted by twice lon0.  At the end every output within 2e-12 of a pole, skipped or not, gets lon0
 * as it then stands.
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param C,m0,chi0  constants of TWstereo_c()
 * @param count      number of points
 * @param in         x, y
 * @param out        longitude, latitude; may be in
 * @param status     #TW_BAD_LATITUDE when no latitude was found (oblique), #TW_NOT_CONVERGED when
 * ten passes were used (polar): skip
 */
TW_API void TWstereo_i(double e, double lon0, double lat0, double C, double m0, double chi0,
                       int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                       TWstatus* status);

/**
 * Scale (Snyder 1987, eq. 21-26; polar 21-32).
 * @param e          first eccentricity
 * @param k0         scale at the origin
 * @param lon0,lat0  origin
 * @param C,m0,chi0  constants of TWstereo_c()
 * @param count      number of points
 * @param in         longitude, latitude
 * @param out        (k, k, k k); may be in
 * @param status     #TW_BAD_LATITUDE beyond a pole: skip
 * @return           k of the last point worked on; k0 where that point failed, and for no points
 */
TW_API double TWstereo_s(double e, double k0, double lon0, double lat0, double C, double m0,
                         double chi0, int32_t count, const CoordinateTriple* in,
                         CoordinateTriple* out, TWstatus* status);

/**
 * Scale at the origin that makes the scale true at a latitude.
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param C,m0,chi0  constants of TWstereo_c()
 * @param lat_ts     latitude of true scale; for C = 0 the angular distance from lat0, not negative,
 * laid off southwards in the northern hemisphere and northwards in the southern
 * @param k0         the scale
 * @param status     #TW_BAD_DATA for lat_ts beyond pi/2, or negative with C = 0; k0 unwritten.
 *                   #TW_BAD_LATITUDE where the distance runs over a pole; k0 is then 1
 */
TW_API void TWstereo_latTs(double e, double lon0, double lat0, double C, double m0, double chi0,
                           double lat_ts, double* k0, TWstatus* status);

/**
 * Latitude of true scale for a scale at the origin, by the secant method to 1e-9 radians.
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param C,m0,chi0  constants of TWstereo_c()
 * @param k0         the scale, above 0 and at most 1
 * @param lat_ts     latitude of true scale; for C = 0 the angular distance from lat0
 * @param status     #TW_BAD_SCALE_LATITUDE for a k0 out of range; lat_ts unwritten. #TW_RANGE_ERROR
 * when no latitude was found, otherwise the word of the last scale evaluated; lat_ts is written in
 * both cases
 */
TW_API void TWstereo_sTlat(double e, double lon0, double lat0, double C, double m0, double chi0,
                           double k0, double* lat_ts, TWstatus* status);
/** @} */

/** @name Double stereographic
 *
 *  The ellipsoid onto the Gauss sphere, the graticule of that turned to the origin as its pole, and
 * the polar stereographic of the sphere.  The word of each call is that of the last stage that ran.
 *  @{ */

/**
 * Constants.
 * @param e           first eccentricity
 * @param lat0        latitude of origin, radians
 * @param chi_g,c,t   constants of TWgaussII_c()
 * @param C           constant of TWstereo_c() for the pole of a sphere: 2
 * @param m0,chi0     left unwritten, as by TWstereo_c() at a pole
 * @param status      word of the last stage; a failing TWgaussII_c() leaves C unwritten
 */
TW_API void TWstereo3_c(double e, double lat0, double* chi_g, double* c, double* t, double* C,
                        double* m0, double* chi0, TWstatus* status);

/**
 * Forward.
 * @param e           first eccentricity
 * @param lon0        longitude of origin
 * @param chi_g,c,t   constants of TWstereo3_c()
 * @param C,m0,chi0   constants of TWstereo3_c()
 * @param count       number of points
 * @param in          longitude, latitude
 * @param out         x, y; may be in
 * @param status      word of the last stage; where one fails, out holds what that stage left
 */
TW_API void TWstereo3_f(double e, double lon0, double chi_g, double c, double t, double C,
                        double m0, double chi0, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);

/**
 * Inverse.
 * @param e           first eccentricity
 * @param lon0        longitude of origin
 * @param chi_g,c,t   constants of TWstereo3_c()
 * @param C,m0,chi0   constants of TWstereo3_c()
 * @param count       number of points
 * @param in          x, y
 * @param out         longitude, latitude; may be in
 * @param status      word of the last stage; where one fails, out holds what that stage left
 */
TW_API void TWstereo3_i(double e, double lon0, double chi_g, double c, double t, double C,
                        double m0, double chi0, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Azimuthal equidistant projection of the ellipsoid (Snyder 1987, pp. 191-202)
 *
 *  By a series in the distance along the normal section: within millimetres 600 km from the
 *  origin, with an azimuth that is off that of the geodesic by up to 6e-6 radians there.  Past a
 *  quarter turn on the meridian of the origin the distance is the meridian arc.
 *  @{ */

/**
 * Constants.  This call has NO STATUS and never fails.
 * @param e     first eccentricity
 * @param lat0  latitude of origin, radians
 * @param n1    radius of curvature in the prime vertical at the origin
 * @param g     e sin(lat0) / sqrt(1 - e^2)
 */
TW_API void TWaz_eq_c(double e, double lat0, double* n1, double* g);

/**
 * Forward (Snyder 1987, eq. 25-19 to 25-25).  The difference of longitude is not wrapped.
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param n1,g       constants of TWaz_eq_c()
 * @param count      number of points
 * @param in         longitude, latitude
 * @param out        x, y; may be in
 * @param status     #TW_SUCCESS, or the word of the last meridian arc that was computed
 */
TW_API void TWaz_eq_f(double e, double lon0, double lat0, double n1, double g, int32_t count,
                      const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 25-26 to 25-36).  The longitude is not wrapped.
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param n1         constant of TWaz_eq_c(); g is not needed
 * @param count      number of points
 * @param in         x, y
 * @param out        longitude, latitude; may be in
 * @param status     always #TW_SUCCESS
 */
TW_API void TWaz_eq_i(double e, double lon0, double lat0, double n1, int32_t count,
                      const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Scale on the SPHERE (Snyder 1987, eq. 25-2); at an origin off the poles it is not a number.
 * @param lon0,lat0  origin
 * @param k0         central scale
 * @param count      number of points
 * @param in         longitude, latitude
 * @param out        (k, k0, k k0); may be in
 * @param status     #TW_BAD_LATITUDE beyond a pole: fill
 */
TW_API void TWaz_eq_s(double lon0, double lat0, double k0, int32_t count,
                      const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Lambert azimuthal equal-area projection (Snyder 1987, pp. 182-190)
 *
 *  Sphere for e exactly 0.  The input array and the count come FIRST in TWlam_az_eq_f(),
 *  TWlam_az_eq_i() and TWlam_az_eq_s().
 *  @{ */

/**
 * Constants (Snyder 1987, eq. 3-11 to 3-13, 14-15, 24-20).
 * @param e                  first eccentricity
 * @param lon0               not read
 * @param lat0               latitude of origin, radians
 * @param e2,q1,qp,rq        e squared, q at the origin and at the pole, authalic radius; unwritten
 * for a sphere
 * @param m1,sin_b1,cos_b1   radius of the parallel and authalic latitude of the origin; unwritten
 * for a sphere and for an origin within 1e-12 of a pole
 * @param sin_lat0,cos_lat0  always written
 * @param D                  unwritten as m1
 * @param status             always #TW_SUCCESS
 */
TW_API void TWlam_az_eq_c(double e, double lon0, double lat0, double* e2, double* q1, double* qp,
                          double* rq, double* m1, double* sin_b1, double* cos_b1, double* sin_lat0,
                          double* cos_lat0, double* D, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 24-2, 24-17 to 24-27).  The difference of longitude is not wrapped; a
 * point within 1e-7 of the antipode of the origin is moved 1e-7 off it.
 * @param in                 longitude, latitude
 * @param count              number of points
 * @param e                  first eccentricity
 * @param lon0,lat0          origin
 * @param e2,q1,qp,rq,m1     constants of TWlam_az_eq_c(); q1 and m1 are not read
 * @param sin_b1,cos_b1      constants of TWlam_az_eq_c()
 * @param sin_lat0,cos_lat0  constants of TWlam_az_eq_c()
 * @param D                  constant of TWlam_az_eq_c()
 * @param out                x, y; may be in
 * @param status             #TW_NOT_CONVERGED for |q / qp| beyond 1 and 1e-12: stop;
 *                           #TW_I_LATITUDE_LIMITED for a lesser excess, held at 1
 */
TW_API void TWlam_az_eq_f(const CoordinateTriple* in, int32_t count, double e, double lon0,
                          double lat0, double e2, double q1, double qp, double rq, double m1,
                          double sin_b1, double cos_b1, double sin_lat0, double cos_lat0, double D,
                          CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 20-14, 24-28 to 24-31, 3-16), to 1e-13 radians.  A longitude of exactly
 * -pi becomes pi.  From a polar origin of the ellipsoid a point past the equator comes out MIRRORED
 * in the equator.
 * @param in                 x, y
 * @param count              number of points
 * @param e                  first eccentricity
 * @param lon0,lat0          origin
 * @param e2,qp,rq           constants of TWlam_az_eq_c(); q1 and m1 are not in the list.  A qp that
 *                           is not that of e gives the latitude whose q the geometry finds with it
 * @param sin_b1,cos_b1      constants of TWlam_az_eq_c()
 * @param sin_lat0,cos_lat0  constants of TWlam_az_eq_c()
 * @param D                  constant of TWlam_az_eq_c()
 * @param out                longitude, latitude; may be in
 * @param status             #TW_NOT_CONVERGED outside the disc by more than 1e-12 (sphere) or
 * 0.0005 (ellipsoid) of its radius, when 50 passes were used, or for a latitude beyond a pole:
 * stop.  #TW_I_LATITUDE_LIMITED for a lesser excess, held at 1
 */
TW_API void TWlam_az_eq_i(const CoordinateTriple* in, int32_t count, double e, double lon0,
                          double lat0, double e2, double qp, double rq, double sin_b1,
                          double cos_b1, double sin_lat0, double cos_lat0, double D,
                          CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, eq. 24-2; polar 24-23a, 24-32).  At an origin off the poles it is that of the
 * SPHERE, on the ellipsoid too.
 * @param in                 longitude, latitude
 * @param count              number of points
 * @param lon0,lat0          origin
 * @param e,e2,qp            first eccentricity, and constants of TWlam_az_eq_c()
 * @param k0                 central scale
 * @param sin_lat0,cos_lat0  constants of TWlam_az_eq_c()
 * @param out                (k k0, k0 / k, k0 k0); may be in
 * @param status             always #TW_SUCCESS
 */
TW_API void TWlam_az_eq_s(const CoordinateTriple* in, int32_t count, double lon0, double lat0,
                          double e, double e2, double qp, double k0, double sin_lat0,
                          double cos_lat0, CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Gnomonic projection of the sphere (Snyder 1987, pp. 164-168)
 *
 *  An origin within 5e-10 of a pole or of the equator takes the formula of that aspect.
 *  @{ */

/**
 * Cosine and sine of the latitude of origin.
 * @param lat0      latitude of origin, radians; not tested
 * @param cos_lat0  its cosine
 * @param sin_lat0  its sine
 * @param status    always #TW_SUCCESS
 */
TW_API void TWgnomon_c(double lat0, double* cos_lat0, double* sin_lat0, TWstatus* status);

/**
 * The fixed parameters of the projection: three zeros.
 * @param value1,value2,value3  0
 * @param status                always #TW_SUCCESS
 */
TW_API void TWgnomon_param(double* value1, double* value2, double* value3, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 22-4 to 22-11).  The OUTPUT ARRAY COMES BEFORE THE INPUT ARRAY.
 * @param lon0,lat0          origin; the difference of longitude is not wrapped
 * @param cos_lat0,sin_lat0  constants of TWgnomon_c()
 * @param count              number of points
 * @param out                x, y; may be in
 * @param in                 longitude, latitude
 * @param status             #TW_NOT_CONVERGED on or behind the horizon (the cosine of the distance
 * from the origin is 1e-13 or less): stop
 */
TW_API void TWgnomon_f(double lon0, double lat0, double cos_lat0, double sin_lat0, int32_t count,
                       CoordinateTriple* out, const CoordinateTriple* in, TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 20-14 to 20-17, 22-12).  Longitudes of exactly -pi and pi both stay.
 * @param lon0,lat0          origin
 * @param cos_lat0,sin_lat0  constants of TWgnomon_c()
 * @param count              number of points
 * @param in                 x, y
 * @param out                longitude, latitude; may be in
 * @param status             always #TW_SUCCESS
 */
TW_API void TWgnomon_i(double lon0, double lat0, double cos_lat0, double sin_lat0, int32_t count,
                       const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, eq. 22-2, 22-3): k = k0 / cos c across the ray from the origin and h = k /
 * cos c along it.
 * @param lon0               longitude of origin
 * @param lat0               not read
 * @param k0                 central scale
 * @param cos_lat0,sin_lat0  constants of TWgnomon_c()
 * @param count              number of points
 * @param in                 longitude, latitude
 * @param out                (k, h, k h); may be in
 * @param status             #TW_I_LATITUDE_LIMITED on or behind the horizon: fill
 */
TW_API void TWgnomon_s(double lon0, double lat0, double k0, double cos_lat0, double sin_lat0,
                       int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                       TWstatus* status);
/** @} */

/** @name Orthographic projection of the ellipsoid (Snyder 1987, pp. 145-153)
 *
 *  The surface point as seen from straight above the origin, by way of geocentric space.  Heights
 * are taken for 0.  The semi-major axis is part of the calls but drops out.
 *  @{ */

/**
 * Geocentric position of the origin, and the rotation to its local axes.
 * @param e          first eccentricity
 * @param lon0,lat0  origin, radians
 * @param x0,y0,z0   geocentric position, in units of the semi-major axis
 * @param r          nine doubles, row by row: east, north, up
 * @param status     always #TW_SUCCESS
 */
TW_API void TWortho_c(double e, double lon0, double lat0, double* x0, double* y0, double* z0,
                      double* r, TWstatus* status);

/**
 * Forward.
 * @param a          not read
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param x0,y0,z0   constants of TWortho_c()
 * @param r          constant of TWortho_c()
 * @param count      number of points
 * @param in         longitude, latitude
 * @param out        x, y; may be in
 * @param status     #TW_I_LATITUDE_LIMITED for a point more than 90 degrees from the origin: STOP,
 * although the word counts as good
 */
TW_API void TWortho_f(double a, double e, double lon0, double lat0, double x0, double y0, double z0,
                      const double* r, int32_t count, const CoordinateTriple* in,
                      CoordinateTriple* out, TWstatus* status);

/**
 * Inverse: the local vertical met with the ellipsoid, a quadratic equation, to 1e-15 radians of the
 * surface; within three degrees of the rim, and above e = 0.1, by iteration along the vertical to
 * 1e-9 radians.  An inner call sets the word anew, so a word of an earlier point does not outlast a
 * later point that is computed.
 * @param a          not read
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param x0,y0,z0   constants of TWortho_c()
 * @param r          constant of TWortho_c()
 * @param count      number of points
 * @param in         x, y
 * @param out        longitude, latitude; may be in
 * @param status     #TW_I_LATITUDE_LIMITED for a point at or beyond sqrt(1 - e^2) from the origin:
 * STOP, although the word counts as good; and when the passes were used up: the last values are
 * written, the loop goes on
 */
TW_API void TWortho_i(double a, double e, double lon0, double lat0, double x0, double y0, double z0,
                      const double* r, int32_t count, const CoordinateTriple* in,
                      CoordinateTriple* out, TWstatus* status);

/**
 * Scale on the SPHERE (Snyder 1987, eq. 20-5): the cosine of the distance from the origin.
 * Latitudes within 1e-10 of a pole are held as in TWmerc_s(), the south pole just past the NORTH
 * pole.
 * @param lon0,lat0  origin
 * @param k0         not read
 * @param count      number of points
 * @param in         longitude, latitude
 * @param out        (1, h, h); may be in
 * @param status     #TW_BAD_LATITUDE beyond a pole: written with h of the PREVIOUS point (0 at the
 * first)
 */
TW_API void TWortho_s(double lon0, double lat0, double k0, int32_t count,
                      const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Vertical and tilted perspective (Snyder 1987, pp. 169-181)
 *
 *  Sphere for e exactly 0.  Heights are READ from element z of the input and COPIED to the output;
 * h, h0 and the heights are in the unit of a, x and y in units of a.
 *  @{ */

/**
 * Constants (Snyder 1987, eq. 23-17, 23-18).
 * @param a       semi-major axis
 * @param e       first eccentricity
 * @param lat0    latitude of origin, radians
 * @param h       height of the point of perspective above the reference surface
 * @param h0      height of the reference surface
 * @param p       distance of the point of perspective from the centre, in units of a
 * @param phi_g   geocentric latitude of the point of perspective
 * @param status  #TW_BAD_PARAMETER when ten passes did not settle to 1e-12; the values are written
 */
TW_API void TWpersp_c(double a, double e, double lat0, double h, double h0, double* p,
                      double* phi_g, TWstatus* status);

/**
 * Vertical perspective, forward (Snyder 1987, eq. 23-13 to 23-16; sphere 22-4, 22-5, 23-3).
 * @param a          semi-major axis
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param h0         not read
 * @param h          height of the point of perspective
 * @param p,phi_g    constants of TWpersp_c()
 * @param count      number of points
 * @param in         longitude, latitude, height
 * @param out        x, y, height; may be in
 * @param status     #TW_NOT_CONVERGED beyond the horizon of a SPHERE: stop.  On the ellipsoid
 * nothing fails, and what lies behind the horizon is projected as it comes
 */
TW_API void TWpersp_vert_f(double a, double e, double lon0, double lat0, double h0, double h,
                           double p, double phi_g, int32_t count, const CoordinateTriple* in,
                           CoordinateTriple* out, TWstatus* status);

/**
 * Vertical perspective, inverse (Snyder 1987, eq. 23-19 to 23-30).
 * @param a          semi-major axis
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param h0         not read
 * @param h          height of the point of perspective
 * @param p,phi_g    constants of TWpersp_c()
 * @param count      number of points
 * @param in         x, y, and the height to which the point belongs
 * @param out        longitude, latitude, height; may be in
 * @param status     #TW_I_LATITUDE_LIMITED when ten passes were used: written with the last values
 */
TW_API void TWpersp_vert_i(double a, double e, double lon0, double lat0, double h0, double h,
                           double p, double phi_g, int32_t count, const CoordinateTriple* in,
                           CoordinateTriple* out, TWstatus* status);

/**
 * Tilted perspective, forward (Snyder 1987, eq. 23-7 to 23-12): the vertical one, tilted, then
 * turned.
 * @param a          semi-major axis
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param h0         not read
 * @param h          height of the point of perspective
 * @param p,phi_g    constants of TWpersp_c()
 * @param tilt_a     turns the image in its plane before the tilt
 * @param tilt_b     the tilt itself, which foreshortens
 * @param rot        turns the image by rot LESS PI: half a turn at 0, nothing at pi and at -pi
 * @param count      number of points
 * @param in         longitude, latitude, height
 * @param out        x, y, height; may be in
 * @param status     as TWpersp_vert_f(), with the rest of the output then neither tilted nor turned
 */
TW_API void TWpersp_f(double a, double e, double lon0, double lat0, double h0, double h, double p,
                      double phi_g, double tilt_a, double tilt_b, double rot, int32_t count,
                      const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Tilted perspective, inverse.  The rotation is undone IN THE INPUT ARRAY, which this call CHANGES
 * unless rot is pi or -pi.
 * @param a          semi-major axis
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param h0         not read
 * @param h          height of the point of perspective
 * @param p,phi_g    constants of TWpersp_c()
 * @param tilt_a     as in TWpersp_f()
 * @param tilt_b     as in TWpersp_f()
 * @param rot        as in TWpersp_f()
 * @param count      number of points
 * @param in         x, y, and the height to which the point belongs; CHANGED by the call
 * @param out        longitude, latitude, height; may be in
 * @param status     as TWpersp_vert_i()
 */
TW_API void TWpersp_i(double a, double e, double lon0, double lat0, double h0, double h, double p,
                      double phi_g, double tilt_a, double tilt_b, double rot, int32_t count,
                      CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Polyconic (Snyder 1987, pp. 124-131)
 *
 *  TWpolycon_c() has NO status argument.
 *  @{ */

/**
 * Meridian arc of the latitude of origin (Snyder 1987, eq. 3-21).
 * @param e     first eccentricity
 * @param lat0  latitude of origin, radians
 * @param m0    its arc from the equator
 */
TW_API void TWpolycon_c(double e, double lat0, double* m0);

/**
 * Forward (Snyder 1987, p. 129).  Below a latitude of 1e-7 in size the point is
 * taken on the equator: x is the difference of longitude and y is -m0.
 * @param e       first eccentricity
 * @param lon0    central meridian; one turn at most is taken off a difference, -pi and pi stay
 * @param m0      constant of TWpolycon_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y
 * @param status  always #TW_SUCCESS
 */
TW_API void TWpolycon_f(double e, double lon0, double m0, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);

/**
 * Inverse by Newton's iteration, to 1e-9 radians (Snyder 1987, pp. 130-131).  Below 1e-6 in
 * size y + m0 gives latitude 0 and longitude x + lon0.  The longitude is not wrapped.
 * @param e       first eccentricity
 * @param lon0    central meridian
 * @param m0      constant of TWpolycon_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude
 * @param status  #TW_DIVERGED when a step after the fourth pass exceeds 5 radians: stop;
 *                #TW_I_LATITUDE_LIMITED when the passes ran out, with the last value written
 */
TW_API void TWpolycon_i(double e, double lon0, double m0, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, p. 130).  The scale along the parallel is true.
 * @param e       first eccentricity
 * @param lon0    central meridian; a difference is not wrapped
 * @param k0      central scale
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     (k0, h, h k0)
 * @param status  #TW_BAD_LATITUDE beyond a pole: k0 with the h and product of the last good point
 *                before it, zeros where there is none; the loop goes on
 */
TW_API void TWpolycon_s(double e, double lon0, double k0, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Cassini (Snyder 1987, pp. 92-95)
 *
 *  Series about the central meridian, for a few degrees on either side.  TWcassini_c() has NO
 *  status argument, and TWcassini_s() works IN PLACE only.
 *  @{ */

/**
 * Coefficients of the meridian arc and of its inverse, as of TWconic_c(), and the arc of the
 * latitude of origin.
 * @param e            first eccentricity
 * @param lon0         not read
 * @param lat0         latitude of origin, radians
 * @param c0           coefficient of the arc
 * @param c2,c4,c6,c8  coefficients of the arc
 * @param m0           arc of lat0; exactly 0 for a latitude of 0
 * @param d2,d4,d6,d8  coefficients of the latitude
 */
TW_API void TWcassini_c(double e, double lon0, double lat0, double* c0, double* c2, double* c4,
                        double* c6, double* c8, double* m0, double* d2, double* d4, double* d6,
                        double* d8);

/**
 * Forward (Snyder 1987, p. 95).  No latitude is tested.
 * @param e            first eccentricity
 * @param lon0         central meridian; whole turns are taken off a difference, -pi and pi stay
 * @param c0           constant of TWcassini_c()
 * @param c2,c4,c6,c8  constants of TWcassini_c()
 * @param m0           constant of TWcassini_c()
 * @param count        number of points
 * @param in           longitude, latitude
 * @param out          x, y
 * @param status       always #TW_SUCCESS
 */
TW_API void TWcassini_f(double e, double lon0, double c0, double c2, double c4, double c6,
                        double c8, double m0, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, p. 95).  The longitude is not wrapped; a footpoint within 1e-12
 * of a pole gives lon0 and the pole, the south pole for a negative y.
 * @param e            first eccentricity
 * @param lon0         central meridian
 * @param c0,m0        constants of TWcassini_c()
 * @param d2,d4,d6,d8  constants of TWcassini_c()
 * @param count        number of points
 * @param in           x, y
 * @param out          longitude, latitude
 * @param status       always #TW_SUCCESS
 */
TW_API void TWcassini_i(double e, double lon0, double c0, double m0, double d2, double d4,
                        double d6, double d8, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, p. 95): 1 + x^2 / 2 R^2 with R^2 the product of the radii
 * of curvature, along the central meridian's direction; true across it.  It works IN PLACE only: in
 * and out must be the same array, which then holds scales.  (With two arrays z of in is lost to the
 * latitude, and h is formed with whatever latitude z of out held.)  A latitude within 1e-10 of a
 * pole is held there; one near the south pole is held just past the NORTH pole.
 * @param e            first eccentricity
 * @param lon0         central meridian
 * @param k0           central scale
 * @param c0           constant of TWcassini_c()
 * @param c2,c4,c6,c8  constants of TWcassini_c()
 * @param m0           constant of TWcassini_c()
 * @param count        number of points
 * @param in           longitude, latitude; z CHANGED by the call
 * @param out          (k0, h, k0 h)
 * @param status       #TW_BAD_LATITUDE beyond a pole: fill
 */
TW_API void TWcassini_s(double e, double lon0, double k0, double c0, double c2, double c4,
                        double c6, double c8, double m0, int32_t count, CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);
/** @} */

#ifdef __cplusplus
}
#endif

#endif
