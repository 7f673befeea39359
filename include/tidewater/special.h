/**
 * @file special.h
 * Oblique, pseudocylindrical and special projections, and local distortion.
 *
 * A projection is up to four functions with one stem: _c computes constants, _f goes from longitude
 * and latitude to the plane, _i goes back, _s gives local scale factors.  The constants are the
 * caller's: _c writes them once, and they are passed to the others.
 *
 * - Angles are radians.  Plane coordinates are in units of the semi-major axis, with central scale
 *   1 and no false origin: TWab_to_en() applies those.
 * - _f and _i read and write elements x and y of a point; z of the output stays as it is.
 * - _s writes (k, h, areal scale) with the caller's k0 multiplied in.
 * - Output may be the same array as input.
 * - A point that fails leaves its word, which later points do not clear, and takes one of three
 *   forms.  SKIP: its output stays as it was, the loop goes on.  STOP: the function returns, the
 *   rest of the output stays as it was.  FILL: the scale falls back to k0 and is written, the loop
 *   goes on.
 *
 * Formulas follow Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * where no other source is named.
 */
#ifndef TIDEWATER_SPECIAL_H
#define TIDEWATER_SPECIAL_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/** @name Hotine oblique Mercator projection of the ellipsoid (Snyder 1987, pp. 66-75, 274-278)
 *
 *  Skew coordinates u along the central line and v across it, counted from the crossing of the
 *  line with the equator of the aposphere, are rotated to map axes by the azimuth of the line.
 *  @{ */

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
 * 2 pi added where it is negative
 * @param B       constant of the aposphere
 * @param A       radius of the aposphere
 * @param E       constant of the isometric latitude
 * @param lon0    longitude where the central line crosses the equator of the aposphere
 * @param gamma0  azimuth of the central line there
 * @param status  #TW_BAD_PARAMETER for a sine beyond 1 by more than 1e-14, and in mode 2 for two
 * equal points or a line that has no constants (a point or the origin at a pole)
 */
TW_API void TWo_merc_c(int16_t mode, double e, double lon_c, double lat_c, double lon2, double lat2,
                       double* lat0, double* alpha, double* B, double* A, double* E, double* lon0,
                       double* gamma0, TWstatus* status);

/**
 * Skew coordinates, and the scale if it is wanted (Snyder 1987, eq. 9-27 to 9-32).  Within 1e-10
 * of a pole the formulas of the pole apply.
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
 * point before it (0 for the first), the loop goes on
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
 * Inverse (Snyder 1987, eq. 9-35 to 9-43).  The longitude is not wrapped.
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
/** @} */

/** @name Rectified skew orthomorphic projection of the ellipsoid (Hotine, The Orthomorphic
 *        Projection of the Spheroid, Empire Survey Review 8-9, 1946-47)
 *  @{ */

/**
 * Constants.  A centre hard by the equator gives not-a-numbers, untested.
 * @param e       first eccentricity
 * @param lon_c   longitude of the centre
 * @param lat_c   latitude of the centre
 * @param skew    angle of the central line where it crosses the equator of the aposphere
 * @param A       radius of the aposphere
 * @param B       constant of the aposphere
 * @param C       additive constant of the isometric latitude
 * @param lon0    longitude of that crossing
 * @param status  #TW_RANGE_ERROR for a hyperbolic argument above 700, #TW_BAD_PARAMETER for
 *                parameters that do not meet; lon0 unwritten, the others written
 */
TW_API void TWrso_c(double e, double lon_c, double lat_c, double skew, double* A, double* B,
                    double* C, double* lon0, TWstatus* status);

/**
 * Forward.  No longitude is wrapped.
 * @param lon0    constant of TWrso_c()
 * @param skew    angle from the map's north to the central line
 * @param A       constant of TWrso_c()
 * @param B       constant of TWrso_c()
 * @param C       constant of TWrso_c()
 * @param e       first eccentricity
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y
 * @param status  #TW_RANGE_ERROR for a hyperbolic argument above 700: stop
 */
TW_API void TWrso_f(double lon0, double skew, double A, double B, double C, double e, int32_t count,
                    const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse, to 1e-14 radians.  The longitude is not wrapped.
 * @param lon0    constant of TWrso_c()
 * @param skew    angle from the map's north to the central line
 * @param A       constant of TWrso_c()
 * @param B       constant of TWrso_c()
 * @param C       constant of TWrso_c()
 * @param e       first eccentricity
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude
 * @param status  #TW_RANGE_ERROR for a hyperbolic argument above 700: stop
 */
TW_API void TWrso_i(double lon0, double skew, double A, double B, double C, double e, int32_t count,
                    const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Scale.  The projection is conformal.  At a latitude whose cosine is exactly zero the division by
 * it is left out.
 * @param e        first eccentricity
 * @param k0       central scale
 * @param unused1  not read
 * @param unused2  not read
 * @param skew     angle from the map's north to the central line
 * @param lon0     constant of TWrso_c()
 * @param A        constant of TWrso_c()
 * @param B        constant of TWrso_c()
 * @param C        constant of TWrso_c()
 * @param count    number of points
 * @param in       longitude, latitude
 * @param out      (k, k, k k)
 * @param status   #TW_RANGE_ERROR for a hyperbolic argument above 700: stop
 */
TW_API void TWrso_s(double e, double k0, double unused1, double unused2, double skew, double lon0,
                    double A, double B, double C, int32_t count, const CoordinateTriple* in,
                    CoordinateTriple* out, TWstatus* status);

/**
 * Parameters of the rectified skew orthomorphic grid of Malaya, for TWrso_c().
 * @param lon_c           longitude of the centre, radians
 * @param lat_c           latitude of the centre, radians
 * @param skew            arc sine of -0.6, radians
 * @param false_easting   metres
 * @param false_northing  metres
 * @param k0              central scale
 * @param status          always #TW_SUCCESS
 */
TW_API void TWrso_param(double* lon_c, double* lat_c, double* skew, double* false_easting,
                        double* false_northing, double* k0, TWstatus* status);
/** @} */

/** @name Laborde projection of the ellipsoid (Laborde, La nouvelle projection du Service
 *        Geographique de Madagascar, 1928; Snyder 1987, p. 175)
 *
 *  Three stages: the Gauss conformal sphere, its transverse Mercator, and a complex cubic.  The
 *  plane is in units of the sphere's radius R.
 *  @{ */

/**
 * Parameters of the Laborde grid of Madagascar.
 * @param lon_c           longitude of the centre from Greenwich, radians
 * @param lat_c           latitude of the centre, radians
 * @param azimuth         azimuth of the central line, radians
 * @param false_easting   metres
 * @param false_northing  metres
 * @param k0              central scale
 * @param status          always #TW_SUCCESS
 */
TW_API void TWlab_param(double* lon_c, double* lat_c, double* azimuth, double* false_easting,
                        double* false_northing, double* k0, TWstatus* status);

/**
 * Constants of the cubic.
 * @param azimuth  azimuth of the central line, radians
 * @param A        (1 - cos(2 azimuth)) / 12
 * @param B        sin(2 azimuth) / 12
 * @param C        3 (A^2 - B^2)
 * @param D        6 A B
 * @param status   always #TW_SUCCESS
 */
TW_API void TWlabor_c(double azimuth, double* A, double* B, double* C, double* D, TWstatus* status);

/**
 * Forward cubic: transverse Mercator plane to Laborde plane.
 * @param A       constant of TWlabor_c()
 * @param B       constant of TWlabor_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     x, y
 * @param status  always #TW_SUCCESS
 */
TW_API void TWlabor_f(double A, double B, int32_t count, const CoordinateTriple* in,
                      CoordinateTriple* out, TWstatus* status);

/**
 * Inverse cubic: by a series of order five, whose last coefficient in y departs from the exact one,
 * and from it, if wanted, by iteration to 1e-14.
 * @param mode    1: iterate; any other value: the series alone
 * @param A       constant of TWlabor_c()
 * @param B       constant of TWlabor_c()
 * @param C       constant of TWlabor_c()
 * @param D       constant of TWlabor_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     x, y
 * @param status  #TW_NOT_CONVERGED if the iteration reaches 30 passes: the point is written, the
 * loop goes on
 */
TW_API void TWlabor_i(int16_t mode, double A, double B, double C, double D, int32_t count,
                      const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Scale of the cubic, the last stage of a chain.  The constant of the cubic is taken as B + i A,
 * while TWlabor_f() has A + i B: the scale is that of the projection where A and B are equal, or
 * given in exchanged order.
 * @param k0      factor of the scale
 * @param A       constant of TWlabor_c()
 * @param B       constant of TWlabor_c()
 * @param count   number of points
 * @param in      x, y in the transverse Mercator plane
 * @param out     in: z, the scale of the stages before; out: (k, k, k k)
 * @param status  always #TW_SUCCESS
 */
TW_API void TWlabor_s(double k0, double A, double B, int32_t count, const CoordinateTriple* in,
                      CoordinateTriple* out, TWstatus* status);

/**
 * Constants of all stages.
 * @param e        first eccentricity
 * @param lon0     central meridian; not read
 * @param lat0     latitude of the centre
 * @param azimuth  azimuth of the central line, radians
 * @param chi0     latitude of the centre on the sphere
 * @param c        constant of TWgaussII_c()
 * @param t        constant of TWgaussII_c()
 * @param R        radius of the sphere
 * @param A0       constant of TWt_merc_c() on the sphere
 * @param A2       constant of TWt_merc_c() on the sphere
 * @param A4       constant of TWt_merc_c() on the sphere
 * @param A6       constant of TWt_merc_c() on the sphere
 * @param A8       constant of TWt_merc_c() on the sphere
 * @param M0       constant of TWt_merc_c() on the sphere
 * @param B2       constant of TWt_merc_c() on the sphere
 * @param B4       constant of TWt_merc_c() on the sphere
 * @param B6       constant of TWt_merc_c() on the sphere
 * @param A        constant of TWlabor_c()
 * @param B        constant of TWlabor_c()
 * @param C        constant of TWlabor_c()
 * @param D        constant of TWlabor_c()
 * @param status   word of TWgaussII_c() or TWt_merc_c(); later stages unwritten on failure
 */
TW_API void TWlaborde_c(double e, double lon0, double lat0, double azimuth, double* chi0, double* c,
                        double* t, double* R, double* A0, double* A2, double* A4, double* A6,
                        double* A8, double* M0, double* B2, double* B4, double* B6, double* A,
                        double* B, double* C, double* D, TWstatus* status);

/**
 * Forward: TWgaussII_f(), TWt_merc_f(), TWlabor_f().
 * @param e       first eccentricity
 * @param lon0    central meridian
 * @param c       constant of TWgaussII_c()
 * @param t       constant of TWgaussII_c()
 * @param A0      constant of TWt_merc_c() on the sphere
 * @param A2      constant of TWt_merc_c() on the sphere
 * @param A4      constant of TWt_merc_c() on the sphere
 * @param A6      constant of TWt_merc_c() on the sphere
 * @param A8      constant of TWt_merc_c() on the sphere
 * @param M0      constant of TWt_merc_c() on the sphere
 * @param A       constant of TWlabor_c()
 * @param B       constant of TWlabor_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y in units of the radius of the sphere
 * @param status  word of the stage that failed; later stages are left out
 */
TW_API void TWlaborde_f(double e, double lon0, double c, double t, double A0, double A2, double A4,
                        double A6, double A8, double M0, double A, double B, int32_t count,
                        const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse: TWlabor_i(), TWt_merc_i(), TWgaussII_i().
 * @param e       first eccentricity
 * @param lon0    central meridian
 * @param chi0    latitude of the centre on the sphere
 * @param c       constant of TWgaussII_c()
 * @param t       constant of TWgaussII_c()
 * @param A0      constant of TWt_merc_c() on the sphere
 * @param M0      constant of TWt_merc_c() on the sphere
 * @param B2      constant of TWt_merc_c() on the sphere
 * @param B4      constant of TWt_merc_c() on the sphere
 * @param B6      constant of TWt_merc_c() on the sphere
 * @param mode    as in TWlabor_i()
 * @param A       constant of TWlabor_c()
 * @param B       constant of TWlabor_c()
 * @param C       constant of TWlabor_c()
 * @param D       constant of TWlabor_c()
 * @param count   number of points
 * @param in      x, y in units of the radius of the sphere
 * @param out     longitude, latitude
 * @param status  word of the stage that failed; later stages are left out for the WHOLE array
 */
TW_API void TWlaborde_i(double e, double lon0, double chi0, double c, double t, double A0,
                        double M0, double B2, double B4, double B6, int16_t mode, double A,
                        double B, double C, double D, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);

/**
 * Scale: TWg_schreiber(), x and y of every point times R (also after a failure), TWlabor_s().  It
 * works IN PLACE only, as TWg_schreiber() does.
 * @param e       first eccentricity
 * @param lon0    central meridian
 * @param c       constant of TWgaussII_c()
 * @param t       constant of TWgaussII_c()
 * @param R       radius of the sphere, constant of TWgaussII_c()
 * @param A0      constant of TWt_merc_c() on the sphere
 * @param A2      constant of TWt_merc_c() on the sphere
 * @param A4      constant of TWt_merc_c() on the sphere
 * @param A6      constant of TWt_merc_c() on the sphere
 * @param A8      constant of TWt_merc_c() on the sphere
 * @param M0      constant of TWt_merc_c() on the sphere
 * @param A       constant of TWlabor_c()
 * @param B       constant of TWlabor_c()
 * @param k0      central scale
 * @param count   number of points
 * @param in      longitude, latitude; z CHANGED by the call
 * @param out     (k, k, k k); after a failure the array as the first stage left it, x and y times R
 * @param status  word of TWg_schreiber()
 */
TW_API void TWlaborde_s(double e, double lon0, double c, double t, double R, double A0, double A2,
                        double A4, double A6, double A8, double M0, double A, double B, double k0,
                        int32_t count, CoordinateTriple* in, CoordinateTriple* out,
                        TWstatus* status);
/** @} */

/** @name Grid of Malaya by polynomials
 *
 *  The polynomials of degree five stand for the rectified skew orthomorphic grid of
 *  TWrso_param().
 *  @{ */

/**
 * Parameters of the grid: those of TWrso_param() in another order.
 * @param lon_c           longitude of the centre, radians
 * @param lat_c           latitude of the centre, radians
 * @param false_easting   metres
 * @param false_northing  metres
 * @param k0              central scale
 * @param skew            arc sine of -0.6, radians
 * @param status          always #TW_SUCCESS
 */
TW_API void TWmalaya_param(double* lon_c, double* lat_c, double* false_easting,
                           double* false_northing, double* k0, double* skew, TWstatus* status);

/**
 * Coefficients.
 * @param table   84 doubles: four rows of 21, two forward and two inverse
 * @param status  always #TW_SUCCESS
 */
TW_API void TWmalaya_c(double* table, TWstatus* status);

/**
 * Forward.
 * @param table   coefficients of TWmalaya_c()
 * @param lon0    longitude of the origin
 * @param lat0    latitude of the origin
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y in units of the semi-major axis of Everest 1830, 6377304.063 m
 * @param status  always #TW_SUCCESS
 */
TW_API void TWmalaya_f(const double* table, double lon0, double lat0, int32_t count,
                       const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse.  The input is in METRES, unlike the output of TWmalaya_f().
 * @param table   coefficients of TWmalaya_c()
 * @param lon0    longitude of the origin
 * @param lat0    latitude of the origin
 * @param count   number of points
 * @param in      x, y in metres
 * @param out     longitude, latitude
 * @param status  always #TW_SUCCESS
 */
TW_API void TWmalaya_i(const double* table, double lon0, double lat0, int32_t count,
                       const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Space oblique Mercator projection of the ellipsoid (Snyder, Space Oblique Mercator
 *        Projection: Mathematical Development, USGS Bulletin 1518, 1981; Snyder 1987, pp.
 *        214-229)
 *
 *  The constants are one set: TWsom_c() works them out once for an orbit, TWsom_f() and TWsom_i()
 *  take them as they are.  The arrays are the caller's and hold n_terms doubles each.
 *  @{ */

/**
 * Constants, by Simpson's rule along one whole orbit.  With a0 an exact whole number the
 * coefficients come from a division by zero.
 * @param e         first eccentricity
 * @param inc       inclination of the orbit, radians
 * @param P         ratio of the satellite's period to the Earth's rotation
 * @param eps       eccentricity of the orbit
 * @param om        angle of the perigee, radians
 * @param n_terms   terms of the Fourier series; none for zero or below
 * @param n_points  points of the grid, at least 2; an even number counts as one more; up to 32767
 * @param Q         constant of the ellipsoid and the inclination
 * @param T         constant of the ellipsoid and the inclination
 * @param W         constant of the ellipsoid and the inclination
 * @param G         1 - e^2
 * @param a0        mean turning of the track, zero but for rounding on a circular orbit
 * @param C         n_terms cosine coefficients of the turning
 * @param S         n_terms sine coefficients of the turning
 * @param X1        n_terms coefficients of the track
 * @param X2        n_terms coefficients of the track
 * @param X3        n_terms coefficients of the track
 * @param X4        n_terms coefficients of the track
 * @param R1        m_sin / a0; R1 to R4 are unwritten for |a0| up to 1e-10
 * @param R2        m_cos / a0
 * @param R3        sum4 + R2
 * @param R4        R1 - sum3
 * @param m_sin     mean of sin(theta) s
 * @param m_cos     mean of cos(theta) s
 * @param sum3      sum of X3
 * @param sum4      sum of X4
 * @param status    #TW_NO_MEMORY if the scratch arrays cannot be had, #TW_BAD_INPUT for fewer than
 * two grid points; nothing written
 */
TW_API void TWsom_c(double e, double inc, double P, double eps, double om, int16_t n_terms,
                    int16_t n_points, double* Q, double* T, double* W, double* G, double* a0,
                    double* C, double* S, double* X1, double* X2, double* X3, double* X4,
                    double* R1, double* R2, double* R3, double* R4, double* m_sin, double* m_cos,
                    double* sum3, double* sum4, TWstatus* status);

/**
 * Forward, by iteration to 1e-10 radians along the orbit.
 * @param orbit    orbit from which the search starts, as TWsomps() gives it
 * @param side     side of the orbit, as TWsomps() gives it
 * @param n_terms  terms of the Fourier series
 * @param lon_n    longitude of the ascending node, radians
 * @param e        first eccentricity
 * @param inc      inclination of the orbit, radians
 * @param P        ratio of the satellite's period to the Earth's rotation
 * @param eps      eccentricity of the orbit
 * @param om       angle of the perigee, radians
 * @param Q        constant of TWsom_c()
 * @param T        constant of TWsom_c()
 * @param W        constant of TWsom_c()
 * @param G        constant of TWsom_c()
 * @param a0       constant of TWsom_c()
 * @param C        constant of TWsom_c()
 * @param S        constant of TWsom_c()
 * @param X1       constant of TWsom_c()
 * @param X2       constant of TWsom_c()
 * @param X3       constant of TWsom_c()
 * @param X4       constant of TWsom_c()
 * @param R1       constant of TWsom_c()
 * @param R2       constant of TWsom_c()
 * @param R3       constant of TWsom_c()
 * @param R4       constant of TWsom_c()
 * @param m_sin    constant of TWsom_c()
 * @param m_cos    constant of TWsom_c()
 * @param sum3     constant of TWsom_c()
 * @param sum4     constant of TWsom_c()
 * @param count    number of points
 * @param in       longitude, latitude
 * @param out      x, y
 * @param axes     1: (x, y) as computed; any other value: (y, -x)
 * @param status   #TW_I_LATITUDE_LIMITED for more than 50 passes: the point is written from the
 * last values, the loop goes on
 */
TW_API void TWsom_f(int16_t orbit, int16_t side, int16_t n_terms, double lon_n, double e,
                    double inc, double P, double eps, double om, double Q, double T, double W,
                    double G, double a0, const double* C, const double* S, const double* X1,
                    const double* X2, const double* X3, const double* X4, double R1, double R2,
                    double R3, double R4, double m_sin, double m_cos, double sum3, double sum4,
                    int32_t count, const CoordinateTriple* in, CoordinateTriple* out, int32_t axes,
                    TWstatus* status);

/**
 * Inverse, by iteration to 1e-10 radians along the orbit.
 * @param n_terms  terms of the Fourier series
 * @param lon_n    longitude of the ascending node, radians
 * @param e        first eccentricity
 * @param inc      inclination of the orbit, radians
 * @param P        ratio of the satellite's period to the Earth's rotation
 * @param eps      eccentricity of the orbit
 * @param om       angle of the perigee, radians
 * @param Q        constant of TWsom_c()
 * @param T        constant of TWsom_c()
 * @param W        constant of TWsom_c()
 * @param G        constant of TWsom_c()
 * @param a0       constant of TWsom_c()
 * @param C        constant of TWsom_c()
 * @param S        constant of TWsom_c()
 * @param X1       constant of TWsom_c()
 * @param X2       constant of TWsom_c()
 * @param X3       constant of TWsom_c()
 * @param X4       constant of TWsom_c()
 * @param R1       constant of TWsom_c()
 * @param R2       constant of TWsom_c()
 * @param R3       constant of TWsom_c()
 * @param R4       constant of TWsom_c()
 * @param m_sin    constant of TWsom_c()
 * @param m_cos    constant of TWsom_c()
 * @param sum3     constant of TWsom_c()
 * @param sum4     constant of TWsom_c()
 * @param count    number of points
 * @param in       x, y
 * @param out      longitude, latitude
 * @param axes     the form in which x and y stand, as in TWsom_f()
 * @param status   #TW_I_LATITUDE_LIMITED for more than 50 passes: the point is written from the
 * last values, the loop goes on
 */
TW_API void TWsom_i(int16_t n_terms, double lon_n, double e, double inc, double P, double eps,
                    double om, double Q, double T, double W, double G, double a0, const double* C,
                    const double* S, const double* X1, const double* X2, const double* X3,
                    const double* X4, double R1, double R2, double R3, double R4, double m_sin,
                    double m_cos, double sum3, double sum4, int32_t count,
                    const CoordinateTriple* in, CoordinateTriple* out, int32_t axes,
                    TWstatus* status);

/**
 * Orbit inputs for a path and row of a satellite's reference system.
 * @param paths      number of paths of the system
 * @param lon_ref    longitude of the ascending node of path 0, radians
 * @param row        row of the scene
 * @param path       path of the scene
 * @param row_first  first row of the day side
 * @param row_last   last row of the day side
 * @param row_next   row from which the next orbit counts
 * @param lon_n      longitude of the ascending node of the path, radians; not wrapped
 * @param side       1 from row_first to row_last, else -1
 * @param orbit      1 outside that range from row_next on, else 0
 * @param status     always #TW_SUCCESS
 */
TW_API void TWsomps(int32_t paths, double lon_ref, int16_t row, int16_t path, int16_t row_first,
                    int16_t row_last, int16_t row_next, double* lon_n, int16_t* side,
                    int16_t* orbit, TWstatus* status);
/** @} */

/** @name Robinson projection of the sphere and its spline (Robinson, A New Map Projection: Its
 *        Development and Characteristics, International Yearbook of Cartography 14, 1974, pp.
 *        145-155)
 *
 *  The projection is a table of 19 parallels.  Two clamped cubic splines go through it, so that
 *  the figures differ from those of other interpolations between the 5-degree parallels.
 *  A spline of n knots is an array of knots and n rows (a, b, c, d): between knots i and i + 1 its
 *  value is ((d t + c) t + b) t + a with t = x - knots[i].
 *  @{ */

/**
 * Splines and ordinate of the latitude of origin.
 * @param knots   19 latitudes, radians
 * @param y_coef  19 rows of four: distance of the parallel from the equator; c and d of the last
 * row are unwritten
 * @param x_coef  19 rows of four: length of the parallel; c and d of the last row are unwritten
 * @param y0      ordinate of lat0
 * @param lat0    latitude of origin, radians
 * @param status  #TW_NO_MEMORY without memory for the work, y0 unwritten; #TW_BAD_LATITUDE for lat0
 *                beyond a pole, y0 written from the extended cubic
 */
TW_API void TWrobin_c(double* knots, double* y_coef, double* x_coef, double* y0, double lat0,
                      TWstatus* status);

/**
 * Forward.  The output array comes BEFORE the input array.
 * @param knots   19 knots of TWrobin_c()
 * @param y_coef  coefficients of TWrobin_c()
 * @param x_coef  coefficients of TWrobin_c()
 * @param lon0    central meridian; any number of turns is taken off, a difference of pi or -pi
 * stays
 * @param y0      constant of TWrobin_c()
 * @param count   number of points
 * @param out     x, y
 * @param in      longitude, latitude
 * @param status  #TW_I_LATITUDE_LIMITED for a latitude less than 0.0001 beyond a pole, held there;
 *                #TW_BAD_LATITUDE farther out: stop
 */
TW_API void TWrobin_f(const double* knots, const double* y_coef, const double* x_coef, double lon0,
                      double y0, int32_t count, CoordinateTriple* out, const CoordinateTriple* in,
                      TWstatus* status);

/**
 * Inverse, to 1e-8 radians or better.  The longitude is not wrapped.
 * @param knots   19 knots of TWrobin_c()
 * @param y_coef  coefficients of TWrobin_c()
 * @param x_coef  coefficients of TWrobin_c()
 * @param lon0    central meridian
 * @param y0      constant of TWrobin_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude
 * @param status  #TW_I_LATITUDE_LIMITED for an ordinate that leads less than 0.0001 beyond a pole,
 * held there; #TW_BAD_LATITUDE for any other beyond the table's end: stop
 */
TW_API void TWrobin_i(const double* knots, const double* y_coef, const double* x_coef, double lon0,
                      double y0, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                      TWstatus* status);

/**
 * Scale on the ellipsoid.  The areal scale is without k0.
 * @param knots   19 knots of TWrobin_c()
 * @param y_coef  coefficients of TWrobin_c()
 * @param x_coef  coefficients of TWrobin_c()
 * @param lon0    central meridian
 * @param radius  radius that scales the map, in the unit of a
 * @param a       semi-major axis
 * @param e       first eccentricity
 * @param k0      central scale
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     (k, h, areal scale)
 * @param status  #TW_BAD_LATITUDE beyond a pole: fill; a word of TWRparal() or TWRmerid(): stop
 */
TW_API void TWrobin_s(const double* knots, const double* y_coef, const double* x_coef, double lon0,
                      double radius, double a, double e, double k0, int32_t count,
                      const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Clamped cubic spline: works out b, c, d from the values a and the two end slopes (de Boor, A
 * Practical Guide to Splines, 1978, chapter IV).
 * @param knots   n knots, strictly rising
 * @param coef    n rows of four; in: a of every row, b of the first and last rows; out: b, c, d of
 * the others, c and d of the first; c and d of the last row are unwritten
 * @param n       number of knots; below 2 nothing is done
 * @param status  #TW_NO_MEMORY without memory for the work; coef unwritten
 */
TW_API void TWrobin_csform(const double* knots, double* coef, int32_t n, TWstatus* status);

/**
 * Value of a spline.
 * @param x      argument
 * @param knots  n knots, strictly rising
 * @param coef   n rows of four coefficients, from TWrobin_csform()
 * @param n      number of knots, at least 2
 * @param flag   1 inside the range of the knots; 2 outside, by the outermost cubic
 * @return the value; not-a-number for fewer than 2 knots
 */
TW_API double TWrobin_cseval(double x, const double* knots, const double* coef, int32_t n,
                             uint32_t* flag);

/**
 * First derivative of a spline; at the last knot the given end slope.
 * @param x      argument
 * @param knots  n knots, strictly rising
 * @param coef   n rows of four coefficients, from TWrobin_csform()
 * @param n      number of knots, at least 2
 * @param flag   1 inside the range of the knots; 2 outside, by the outermost cubic
 * @return the derivative; not-a-number for fewer than 2 knots
 */
TW_API double TWrobin_csderv(double x, const double* knots, const double* coef, int32_t n,
                             uint32_t* flag);

/**
 * Argument at which a rising spline takes a value: Newton on the cubic of the interval that holds
 * the value, to a step of 1e-8 or for 11 passes.
 * @param y      value
 * @param knots  n knots, strictly rising
 * @param coef   n rows of four coefficients, from TWrobin_csform()
 * @param n      number of knots, at least 2
 * @param flag   1 inside the range of the values; 2 outside, by the outermost cubic
 * @return the argument; not-a-number for fewer than 2 knots
 */
TW_API double TWrobin_csinv(double y, const double* knots, const double* coef, int32_t n,
                            uint32_t* flag);
/** @} */

/** @name Sinusoidal projection of the ellipsoid (Snyder 1987, pp. 243-248)
 *  @{ */

/**
 * Constants.
 * @param e       first eccentricity
 * @param lat0    latitude of origin, radians
 * @param e2      square of e
 * @param m0      meridian arc of lat0
 * @param status  that of TWmerid_dist_f(); m0 unwritten on failure
 */
TW_API void TWsinusoidal_c(double e, double lat0, double* e2, double* m0, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 30-8, 30-9).  Differences up to 1e-12 count as none.
 * @param lon0    central meridian; any number of turns is taken off, a difference of pi or -pi
 * stays
 * @param lat0    latitude of origin
 * @param e       first eccentricity
 * @param e2      constant of TWsinusoidal_c()
 * @param m0      constant of TWsinusoidal_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y
 * @param status  word of TWmerid_dist_f(): stop on failure
 */
TW_API void TWsinusoidal_f(double lon0, double lat0, double e, double e2, double m0, int32_t count,
                           const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 30-10, 30-11).  Within 1e-12 of a pole the longitude is lon0.
 * @param lon0    central meridian; any number of turns is taken off, a difference of pi or -pi
 * stays
 * @param lat0    latitude of origin
 * @param e       first eccentricity
 * @param e2      constant of TWsinusoidal_c()
 * @param m0      constant of TWsinusoidal_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude
 * @param status  word of TWmerid_dist_i(): stop on failure
 */
TW_API void TWsinusoidal_i(double lon0, double lat0, double e, double e2, double m0, int32_t count,
                           const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, p. 243).  The scale along the parallel is k0 everywhere.
 * @param k0      central scale
 * @param lon0    central meridian
 * @param e2      constant of TWsinusoidal_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     (k0, h, areal scale)
 * @param status  #TW_BAD_LATITUDE more than 1e-12 beyond a pole, or the word of TWdM_dphi(): stop
 */
TW_API void TWsinusoidal_s(double k0, double lon0, double e2, int32_t count,
                           const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Mollweide projection of the sphere (Snyder 1987, pp. 249-252)
 *
 *  No longitude is wrapped.  Within about 1e-3 of a pole the ordinate is good to 1e-10 only.
 *  @{ */

/**
 * Ordinate of the latitude of origin.
 * @param lat0    latitude of origin, radians; not tested
 * @param y0      ordinate of lat0
 * @param status  always #TW_SUCCESS
 */
TW_API void TWmollweide_c(double lat0, double* y0, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 31-1 to 31-4), within 1e-15 of the exact plane point.  No latitude is
 * tested.
 * @param lon0    central meridian
 * @param y0      constant of TWmollweide_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y
 * @param status  always #TW_SUCCESS
 */
TW_API void TWmollweide_f(double lon0, double y0, int32_t count, const CoordinateTriple* in,
                          CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 31-6 to 31-8).
 * @param lon0    central meridian
 * @param y0      constant of TWmollweide_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude
 * @param status  #TW_RANGE_ERROR for an ordinate beyond the map: stop, and for a sine beyond 1:
 * stop, with the failing point's longitude already written
 */
TW_API void TWmollweide_i(double lon0, double y0, int32_t count, const CoordinateTriple* in,
                          CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Eckert IV projection of the sphere (Snyder 1987, pp. 253-258)
 *
 *  No longitude is wrapped.  Arrays of more than 32767 points work in all functions.
 *  @{ */

/**
 * Ordinate of the latitude of origin.  The iteration ends at the first step that is not above
 * 1e-12, a negative one included, so that the ordinate may be that of the first estimate and
 * TWeckertIV_f() of the origin need not be 0.
 * @param lat0    latitude of origin, radians; not tested
 * @param y0      ordinate of the origin
 * @param status  always #TW_SUCCESS
 */
TW_API void TWeckertIV_c(double lat0, double* y0, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 32-1 to 32-5), within 1e-15 of the exact plane point; within 5e-4 radians of
 * a pole by iteration to 1e-12 radians.
 * @param lon0    central meridian
 * @param y0      constant of TWeckertIV_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y
 * @param status  #TW_NOT_CONVERGED if the iteration reaches 50 passes, as it does for a latitude
 *                that is not finite: stop
 */
TW_API void TWeckertIV_f(double lon0, double y0, int32_t count, const CoordinateTriple* in,
                         CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 32-9 to 32-11).  An ordinate beyond the map is taken at its edge.  The
 * call has no bound of 32767 points.
 * @param lon0    central meridian
 * @param y0      constant of TWeckertIV_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude
 * @param status  always #TW_SUCCESS
 */
TW_API void TWeckertIV_i(double lon0, double y0, int32_t count, const CoordinateTriple* in,
                         CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Bonne projection of the ellipsoid (Snyder 1987, pp. 138-140)
 *  @{ */

/**
 * Constants.
 * @param e       first eccentricity; a sphere below 1.6e-8
 * @param lat1    in: standard parallel, radians; out: the same, kept 1.6e-8 away from the equator
 * @param e2      square of e, 0 for a sphere
 * @param c1      radius of the standard parallel on the cone
 * @param r0      c1 and the meridian arc of lat1
 * @param status  #TW_BAD_ECCENTRICITY for e of 1 or more or below 0, nothing written; word of
 *                TWmerid_dist_f(), r0 unwritten on failure
 */
TW_API void TWbonne_c(double e, double* lat1, double* e2, double* c1, double* r0, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 19-1 to 19-3, 19-5 to 19-7).  Differences up to 1e-12 count as none.
 * @param lon0    central meridian; any number of turns is taken off, a difference of pi or -pi
 * stays
 * @param lat1    standard parallel, as TWbonne_c() gave it back
 * @param e       first eccentricity
 * @param e2      constant of TWbonne_c()
 * @param c1      constant of TWbonne_c()
 * @param r0      constant of TWbonne_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y
 * @param status  word of TWmerid_dist_f(): stop on failure
 */
TW_API void TWbonne_f(double lon0, double lat1, double e, double e2, double c1, double r0,
                      int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                      TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 19-8 to 19-12).  Within 1e-12 of a pole the longitude is lon0.
 * @param lon0    central meridian; any number of turns is taken off, a difference of pi or -pi
 * stays
 * @param lat1    standard parallel, as TWbonne_c() gave it back
 * @param e       first eccentricity
 * @param e2      constant of TWbonne_c()
 * @param c1      constant of TWbonne_c()
 * @param r0      constant of TWbonne_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude
 * @param status  word of TWmerid_dist_i(): stop on failure
 */
TW_API void TWbonne_i(double lon0, double lat1, double e, double e2, double c1, double r0,
                      int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                      TWstatus* status);

/**
 * Scale, by the formula of the sphere on the ellipsoid too (Snyder 1987, eq. 19-4).
 * @param k0      central scale
 * @param lat1    standard parallel
 * @param lon0    central meridian
 * @param e2      constant of TWbonne_c()
 * @param r0      constant of TWbonne_c(); read for a sphere only
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     (k0, h, k0 k0)
 * @param status  #TW_BAD_LATITUDE more than 1e-12 beyond a pole, off the central meridian and the
 *                standard parallel: stop
 */
TW_API void TWbonne_s(double k0, double lat1, double lon0, double e2, double r0, int32_t count,
                      const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Van der Grinten projection of the sphere (Snyder 1987, pp. 239-242)
 *
 *  Within 0.0003 of an axis (of the equator or the central meridian, or of the lines x = 0 and
 *  y = 0) the formulas are those of the axis, by design.
 *  @{ */

/**
 * Ordinate of the latitude of origin.  It has no status word.
 * @param lat0  latitude of origin, radians; not-a-number beyond a pole
 * @param y0    ordinate of lat0
 */
TW_API void TWvdg_c(double lat0, double* y0);

/**
 * Forward (Snyder 1987, eq. 29-1 to 29-6).
 * @param lon0    central meridian; one turn at most is taken off, a difference of pi or -pi stays
 * @param y0      constant of TWvdg_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y
 * @param status  always #TW_SUCCESS
 */
TW_API void TWvdg_f(double lon0, double y0, int32_t count, const CoordinateTriple* in,
                    CoordinateTriple* out, TWstatus* status);

/**
 * Inverse, in closed form (Rubincam, The American Cartographer 8, 1981), within 1e-11 radians of the
 * iteration to 1e-12 radians that serves within 0.01 radians of a pole and at the outer circle.  The
 * longitude is not wrapped.
 * @param lon0    central meridian
 * @param y0      constant of TWvdg_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude
 * @param status  #TW_I_LATITUDE_LIMITED where the estimate of the latitude passes a pole: the point
 * is written with it, the loop goes on
 */
TW_API void TWvdg_i(double lon0, double y0, int32_t count, const CoordinateTriple* in,
                    CoordinateTriple* out, TWstatus* status);

/**
 * Scale, from the derivatives of the forward formulas.
 * @param k0      central scale
 * @param lon0    central meridian; a difference of exactly -pi becomes pi
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     (k, h, areal scale)
 * @param status  #TW_BAD_LATITUDE within 1e-14 of a pole or beyond: fill
 */
TW_API void TWvdg_s(double k0, double lon0, int32_t count, const CoordinateTriple* in,
                    CoordinateTriple* out, TWstatus* status);
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

/** @name Local distortion of any transformation by finite differences
 *
 *  A Jacobian record is nine doubles: the derivatives of the output's elements x, y, z by the
 *  input's x, then by its y, then by its z.
 *  @{ */

/**
 * Jacobian records.  The transformation is called with six neighbours of a point at once; where
 * that fails, with the point and its neighbours one by one, and a neighbour that fails gives a
 * one-sided difference.
 * @param transform  the transformation, called from the same thread
 * @param context    handed through to it
 * @param step0      step along x, in its unit
 * @param step1      step along y
 * @param step2      step along z
 * @param count      number of points
 * @param in         points
 * @param jacobians  nine doubles for each point, written whole or not at all
 * @param status     word of the transformation's last call that was not held back for a neighbour;
 * on failure of the point itself, or of both neighbours along an axis, the call ends
 */
TW_API void TWget_jacobian(TWtransform_ptr transform, void* context, double step0, double step1,
                           double step2, int32_t count, const CoordinateTriple* in,
                           double* jacobians, TWstatus* status);

/**
 * Scale factors from the Jacobian records of a projection.
 * @param a          semi-major axis, in the unit of the output
 * @param e          first eccentricity
 * @param count      number of points
 * @param in         longitude, latitude of the points
 * @param jacobians  their records, steps taken in radians
 * @param out        (scale along the parallel, along the meridian, areal scale)
 * @param status     #TW_BAD_LATITUDE beyond a pole: (1, 1, 1), the loop goes on
 */
TW_API void TWJ_to_scales(double a, double e, int32_t count, const CoordinateTriple* in,
                          const double* jacobians, CoordinateTriple* out, TWstatus* status);

/**
 * Slopes of the axes.  The first is the arc tangent of element 3 by element 0, NOT of element 1 by
 * element 0; the meridian convergence does not depend on it.
 * @param count      number of points
 * @param jacobians  records
 * @param out        (t1, t2, t2 - t1) with t2 the slope of the north-going axis, radians
 * @param status     always #TW_SUCCESS
 */
TW_API void TWJ_to_slopes(int32_t count, const double* jacobians, CoordinateTriple* out,
                          TWstatus* status);

/**
 * Meridian convergence: slope of the north-going axis less pi/2, in (-pi, pi].
 * @param count      number of points
 * @param jacobians  records
 * @param out        one double for each point, radians
 * @param status     always #TW_SUCCESS
 */
TW_API void TWJ_to_merconv(int32_t count, const double* jacobians, double* out, TWstatus* status);
/** @} */

#ifdef __cplusplus
}
#endif

#endif
