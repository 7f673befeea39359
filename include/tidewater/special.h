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

/** @name Bipolar oblique conic conformal projection of the sphere (Snyder 1987, pp. 116-123)
 *
 *  Two oblique conics with poles A and B, joined along the great circle through the poles.
 *  @{ */

/**
 * The parameters of the one case in use, the map of the Americas.
 * @param lon_a,lat_a                   pole A: 110 W, 20 S
 * @param lat_b                         latitude of pole B: 45 N
 * @param ab                            arc from A to B: 104 degrees
 * @param z1,z2                         polar distances of the standard parallels: 31, 73 degrees
 * @param false_easting,false_northing  0
 * @param lon_c,lat_c                   centre of the projection, radians
 * @param status                        always #TW_SUCCESS
 */
TW_API void TWbipocc_param(double* lon_a, double* lat_a, double* lat_b, double* ab, double* z1,
                           double* z2, double* false_easting, double* false_northing, double* lon_c,
                           double* lat_c, TWstatus* status);

/**
 * Constants (Snyder 1987, eq. 17-1 to 17-11).  Nothing is tested.
 * @param lon_a,lat_a   pole A, radians
 * @param lat_b         latitude of pole B
 * @param ab            arc from A to B
 * @param z1,z2         polar distances of the standard parallels
 * @param lon_b         longitude of pole B
 * @param n             cone constant
 * @param k             central scale that balances the error, for the caller to apply; its arcs of
 * 26 and 52 degrees are fixed degrees
 * @param f             size of the cone
 * @param az_ab,az_ba   azimuth from A to B, and from B to A westward
 * @param t             sum of the half-arc powers of the standard parallels
 * @param rho_c,z_c     radius and polar distance of the centre
 * @param az_c          turn of the plane at the centre
 * @param status        always #TW_SUCCESS
 */
TW_API void TWbipocc_c(double lon_a, double lat_a, double lat_b, double ab, double z1, double z2,
                       double* lon_b, double* n, double* k, double* f, double* az_ab, double* az_ba,
                       double* t, double* rho_c, double* z_c, double* az_c, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 17-12 to 17-22).  The OUTPUT array stands before the input array.
 * @param lon_a,lat_a     pole A
 * @param lon_b,lat_b     pole B
 * @param az_ab,az_ba     constants of TWbipocc_c()
 * @param az_c,n          constants of TWbipocc_c()
 * @param unused1         not read
 * @param unused2         not read
 * @param t,rho_c         constants of TWbipocc_c()
 * @param ab              arc from A to B
 * @param f               constant of TWbipocc_c()
 * @param count           number of points
 * @param out             x, y
 * @param in              longitude, latitude
 * @param status          #TW_NOT_CONVERGED for a point about 106 degrees or more from its pole:
 * stop
 */
TW_API void TWbipocc_f(double lon_a, double lat_a, double lon_b, double lat_b, double az_ab,
                       double az_ba, double az_c, double n, double unused1, double unused2,
                       double t, double rho_c, double ab, double f, int32_t count,
                       CoordinateTriple* out, const CoordinateTriple* in, TWstatus* status);

/**
 * Inverse, by iteration to 1e-10, at most 30 passes, which is not reported if they run out
 * (Snyder 1987, eq. 17-23 to 17-36).
 * @param lon_a,lat_a     pole A
 * @param lon_b,lat_b     pole B
 * @param az_ab,az_ba     constants of TWbipocc_c()
 * @param az_c,n,t,rho_c  constants of TWbipocc_c()
 * @param ab              arc from A to B
 * @param f               constant of TWbipocc_c()
 * @param lon_c           longitude that is written for a point within a second of arc of a pole
 * @param count           number of points
 * @param in              x, y
 * @param out             longitude, latitude
 * @param status          #TW_NOT_CONVERGED for a point beyond the map: stop
 */
TW_API void TWbipocc_i(double lon_a, double lat_a, double lon_b, double lat_b, double az_ab,
                       double az_ba, double az_c, double n, double t, double rho_c, double ab,
                       double f, double lon_c, int32_t count, const CoordinateTriple* in,
                       CoordinateTriple* out, TWstatus* status);

/**
 * Scale.
 * @param unused1      not read
 * @param unused2      not read
 * @param k0           central scale
 * @param lon_a,lat_a  pole A
 * @param lon_b,lat_b  pole B
 * @param n,f,az_ba    constants of TWbipocc_c()
 * @param count        number of points
 * @param in           longitude, latitude
 * @param out          (k, k, k k)
 * @param status       #TW_I_LATITUDE_LIMITED beyond the reach of TWbipocc_f(): fill
 */
TW_API void TWbipocc_s(double unused1, double unused2, double k0, double lon_a, double lat_a,
                       double lon_b, double lat_b, double n, double f, double az_ba, int32_t count,
                       const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Chamberlin trimetric projection of the ellipsoid (Christensen 1992, Cartography and
 *        Geographic Information Systems 19, pp. 88-100)
 *
 *  A point lies at the mean of the three intersections of the circles that its geodesic distances
 *  draw round the corners of a triangle.  Geodesics are solved as by TWgeodesic_inv(), on an axis
 * of the library's own; plane coordinates are in units of the semi-major axis as elsewhere.
 *  @{ */

/**
 * Places the triangle on the plane.
 *
 * forward is called in mode 0 alone, one point at a time, while plane already holds the triangle:
 * it must map by TWchamtri_f() with this call's e, control, sides, azimuths and plane.
 * @param forward        the map; may be null in mode 1
 * @param context        handed through to forward
 * @param mode           0: the origin is the triangle's centroid, north there is up; 1: the origin
 * is (lon_c, lat_c), where north lies at rotation
 * @param e              first eccentricity
 * @param control        three corners: longitude, latitude
 * @param sides          three lengths: 0 to 1, 1 to 2, 2 to 0
 * @param azimuths       azimuth of each side at its first corner
 * @param plane          three corners on the plane: x, y; z is not touched
 * @param lon_c,lat_c    place of the origin: written in mode 0, read in mode 1
 * @param rotation       angle from the x axis to north, radians: written (pi/2) in mode 0, read in
 *                       mode 1
 * @param status         #TW_BAD_INPUT for another mode, with sides and azimuths written; a failing
 *                       TWgeneric_i() or TWchamtri_f() ends the call with its word
 */
TW_API void TWchamtri_c(TWtransform forward, TWcontext context, int16_t mode, double e,
                        const CoordinateTriple* control, double* sides, double* azimuths,
                        CoordinateTriple* plane, double* lon_c, double* lat_c, double* rotation,
                        TWstatus* status);

/**
 * Forward.  There is no inverse of its own: TWgeneric_i() serves.
 * @param e         first eccentricity
 * @param control   the three corners
 * @param sides     of TWchamtri_c()
 * @param azimuths  of TWchamtri_c()
 * @param plane     of TWchamtri_c()
 * @param count     number of points
 * @param in        longitude, latitude, height
 * @param out       x, y, and the HEIGHT, which is copied
 * @param status    the word of the last TWgeodesic_inv()
 */
TW_API void TWchamtri_f(double e, const CoordinateTriple* control, const double* sides,
                        const double* azimuths, const CoordinateTriple* plane, int32_t count,
                        const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Modified polyconic of the International Map of the World (Snyder 1987, pp. 131-137)
 *
 *  A sheet spans 4 degrees of latitude, and 4 degrees of longitude; 8 from 60 degrees of latitude
 * on, 16 from 76 degrees on.
 *  @{ */

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
 * @param status  #TW_BAD_LATITUDE as in TWIMWmodP_stp(), nothing written; words of TWmerid_dist_f()
 */
TW_API void TWIMWmodPoly_c(double e, double lon0, double lat1, double* r1, double* r2, double* c,
                           double* p, double* q, double* s, double* t, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 18-36 to 18-51).
 * @param e              first eccentricity
 * @param lon0           central meridian; a difference beyond two pi is refused
 * @param lat1           southern edge of the sheet
 * @param r1,r2          constants of TWIMWmodPoly_c()
 * @param c,p,q,s,t      constants of TWIMWmodPoly_c()
 * @param count          number of points
 * @param in             longitude, latitude
 * @param out            x, y; the origin is the southern edge on the central meridian
 * @param status         #TW_BAD_LATITUDE beyond a pole by more than 1e-9, #TW_BAD_LONGITUDE,
 *                       #TW_RANGE_ERROR for a point too far from the sheet, and the words of
 *                       TWmerid_dist_f(): stop.  #TW_I_LATITUDE_LIMITED for a latitude held at a
 * pole
 */
TW_API void TWIMWmodPoly_f(double e, double lon0, double lat1, double r1, double r2, double c,
                           double p, double q, double s, double t, int32_t count,
                           const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse, by proportion, until both coordinates are within 1e-13, at most 15 passes.
 * @param e              first eccentricity
 * @param lon0           central meridian
 * @param lat1           southern edge of the sheet
 * @param r1,r2          constants of TWIMWmodPoly_c()
 * @param c,p,q,s,t      constants of TWIMWmodPoly_c()
 * @param count          number of points
 * @param in             x, y
 * @param out            longitude, latitude
 * @param status         #TW_I_LATITUDE_LIMITED where the passes ran out, the forward function
 * failed or the latitude was held at a pole; the point is written all the same
 */
TW_API void TWIMWmodPoly_i(double e, double lon0, double lat1, double r1, double r2, double c,
                           double p, double q, double s, double t, int32_t count,
                           const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Oblique Lambert and Krovak
 *
 *  The ellipsoid goes to a conformal sphere, the sphere's graticule is turned about the cone's
 * pole, and a Lambert conic maps the turned sphere.  Plane coordinates are in units of that
 * sphere's radius, TWgaussian_R() at the latitude lat0 + (d1 + d2) / 2.
 *  @{ */

/**
 * Constants of the oblique Lambert.
 * @param e                  first eccentricity; exactly 0 is the sphere, with g_c and g_t unwritten
 * @param lon0,lat0          origin, radians
 * @param d1,d2              distances of the standard parallels from the origin, along the cone's
 *                           axis, radians
 * @param azimuth            from the origin to the cone's pole; read where use_azimuth is not 0
 * @param use_azimuth        0: pole_lon and pole_lat are read; else they are written, with a pole
 * as far from the origin as the nearer geographic pole
 * @param pole_lon,pole_lat  the cone's pole on the ellipsoid
 * @param lat_r              latitude of the origin on the turned sphere
 * @param s_lon,s_lat        the cone's pole on the sphere
 * @param offset             of TWrotgrat_c()
 * @param C,n_cone,rho0      of TWlam_c()
 * @param g_c,g_t            of TWgaussII_c()
 * @param status             the word of the inner call that failed, which ends the call
 */
TW_API void TWo_lam_c(double e, double lon0, double lat0, double d1, double d2, double azimuth,
                      uint32_t use_azimuth, double* pole_lon, double* pole_lat, double* lat_r,
                      double* s_lon, double* s_lat, double* offset, double* C, double* n_cone,
                      double* rho0, double* g_c, double* g_t, TWstatus* status);

/**
 * Constants of the Krovak projection (EPSG Guidance Note 7-2, method 9819), for TWo_lam_f() and its
 * fellows: as TWo_lam_c(), but with the cone's pole on the sphere at 59.71186 degrees (not for
 * e = 0), the standard parallel at 78.5 degrees, a rho0 of 0 and C times 0.9999.
 * @param e                  first eccentricity
 * @param lon0,lat0          origin, radians
 * @param d1,d2              they choose the conformal sphere's latitude, lat0 + (d1 + d2) / 2
 * @param azimuth            as in TWo_lam_c()
 * @param use_azimuth        as in TWo_lam_c()
 * @param pole_lon,pole_lat  as in TWo_lam_c()
 * @param lat_r              latitude of the origin on the turned sphere
 * @param s_lon,s_lat        the cone's pole on the sphere
 * @param offset             of TWrotgrat_c()
 * @param C,n_cone,rho0      of TWlam_c(), changed as above
 * @param g_c,g_t            of TWgaussII_c()
 * @param status             the word of the inner call that failed, which ends the call
 */
TW_API void TWkrovak_c(double e, double lon0, double lat0, double d1, double d2, double azimuth,
                       uint32_t use_azimuth, double* pole_lon, double* pole_lat, double* lat_r,
                       double* s_lon, double* s_lat, double* offset, double* C, double* n_cone,
                       double* rho0, double* g_c, double* g_t, TWstatus* status);

/**
 * Forward.
 * @param e              first eccentricity
 * @param lon0           longitude of the origin
 * @param lat_r          constants of TWo_lam_c(), as the others without a word here
 * @param C,n_cone,rho0  of the cone
 * @param s_lon,s_lat    the cone's pole; nothing is turned where it is the pole above lon0 to 1e-13
 * @param turn           the plane is turned by minus this angle about its origin, radians
 * @param offset         of the turned graticule
 * @param g_c,g_t        of the conformal sphere
 * @param count          number of points
 * @param in             longitude, latitude
 * @param out            x, y
 * @param status         the word of the inner call that failed, which ends the call with out as it
 *                       stands between two steps
 */
TW_API void TWo_lam_f(double e, double lon0, double lat_r, double C, double n_cone, double rho0,
                      double s_lon, double s_lat, double turn, double offset, double g_c,
                      double g_t, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                      TWstatus* status);

/**
 * Inverse, with the arguments of TWo_lam_f().
 * @param e,lon0,lat_r   as there
 * @param C,n_cone,rho0  as there
 * @param s_lon,s_lat    as there
 * @param turn,offset    as there
 * @param g_c,g_t        as there
 * @param count          number of points
 * @param in             x, y; CHANGED by the call: turned in place
 * @param out            longitude, latitude
 * @param status         the word of the inner call that failed, which ends the call
 */
TW_API void TWo_lam_i(double e, double lon0, double lat_r, double C, double n_cone, double rho0,
                      double s_lon, double s_lat, double turn, double offset, double g_c,
                      double g_t, int32_t count, CoordinateTriple* in, CoordinateTriple* out,
                      TWstatus* status);

/**
 * Scale of the cone.  On the ellipsoid the sphere's longitudes are here taken relative to lon0, not
 * from Greenwich as in TWo_lam_f(): turned about an oblique pole they agree for a lon0 of 0 alone.
 * @param e             first eccentricity
 * @param k0            central scale
 * @param lon0,lat_r    as in TWo_lam_f()
 * @param C,n_cone      as there
 * @param s_lon,s_lat   as there
 * @param offset        as there
 * @param g_c,g_t       as there
 * @param count         number of points
 * @param in            longitude, latitude
 * @param out           (k, k, k k) of TWlam_s()
 * @param status        the word of an inner call
 */
TW_API void TWo_lam_s(double e, double k0, double lon0, double lat_r, double C, double n_cone,
                      double s_lon, double s_lat, double offset, double g_c, double g_t,
                      int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                      TWstatus* status);
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
