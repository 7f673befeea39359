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
 * within 4e-7 of a pole is the pole.  The longitude is not wrapped.
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
 *                steps, both written
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
