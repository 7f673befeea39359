/**
 * @file foundation.h
 * Quantities of the reference ellipsoid, geocentric and local frames, attitude angles, and helpers
 * on the plane.
 *
 * The ellipsoid is always two loose doubles: a, the semi-major axis, whose unit is that of every
 * length, and e, the first eccentricity (not its square; TWdM_dphi() alone takes the square).
 */
#ifndef TIDEWATER_FOUNDATION_H
#define TIDEWATER_FOUNDATION_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/** @name Ellipsoid quantities
 *  @{ */

/**
 * Radius of the parallel at a latitude, a cos(lat) / sqrt(1 - e^2 sin^2 lat) (Snyder 1987, eq.
 * 14-15).
 * @param a,e     ellipsoid
 * @param lat     latitude, radians, at most pi/2 in size (no tolerance)
 * @param radius  radius, in the unit of a
 * @param status  #TW_BAD_LATITUDE beyond a pole; radius unwritten
 */
TW_API void TWRparal(double a, double e, double lat, double* radius, TWstatus* status);

/**
 * Radius of curvature in the meridian, a (1 - e^2) / (1 - e^2 sin^2 lat)^(3/2) (Snyder 1987, eq.
 * 4-18).
 * @param a,e     ellipsoid
 * @param lat     latitude, radians, at most pi/2 in size (no tolerance)
 * @param radius  radius, in the unit of a
 * @param status  #TW_BAD_LATITUDE beyond a pole; radius unwritten
 */
TW_API void TWRmerid(double a, double e, double lat, double* radius, TWstatus* status);

/**
 * Gaussian mean radius, the geometric mean of the two radii of curvature (IOGP Guidance Note 7-2,
 * radius of the conformal sphere).
 * @param a,e     ellipsoid
 * @param lat     latitude, radians; not tested
 * @param radius  radius, in the unit of a
 * @param status  #TW_BAD_ECCENTRICITY for e^2 of one or more; radius unwritten
 */
TW_API void TWgaussian_R(double a, double e, double lat, double* radius, TWstatus* status);

/**
 * Radius of the sphere of equal surface, by the series a (1 - e^2/6 - 17 e^4/360 - 67 e^6/3024)
 * (Snyder 1987, p. 16, authalic radius); on the earth's ellipsoids within 2 mm of the closed form.
 * @param a,e     ellipsoid
 * @param radius  radius, in the unit of a
 * @param status  #TW_BAD_ECCENTRICITY for e^2 of one or more; radius unwritten
 */
TW_API void TWeq_surf_R(double a, double e, double* radius, TWstatus* status);

/**
 * Radius of the sphere of equal volume, a (1 - e^2)^(1/6) (Moritz, Geodetic Reference System 1980,
 * R3).
 * @param a,e     ellipsoid
 * @param radius  radius, in the unit of a
 * @param status  #TW_BAD_ECCENTRICITY for e^2 of one or more; radius unwritten
 */
TW_API void TWeq_vol_R(double a, double e, double* radius, TWstatus* status);

/**
 * Meridian arc from the equator, by the series in the third flattening to the fourth power
 * (Helmert 1880), within 1e-6 m on the earth's ellipsoids; a lat for e below 1e-12.
 * @param a,e       ellipsoid
 * @param lat       latitude, radians
 * @param distance  signed arc, in the unit of a
 * @param status    #TW_BAD_ECCENTRICITY unless 0 <= e < 1, then #TW_BAD_SEMI_MAJOR for a of zero or
 *                  below, then #TW_BAD_LATITUDE beyond pi/2 + 1e-12, each with distance unwritten;
 *                  #TW_I_LATITUDE_LIMITED for a latitude beyond pi/2 held at the pole
 */
TW_API void TWmerid_dist_f(double a, double e, double lat, double* distance, TWstatus* status);

/**
 * Latitude at a meridian arc, by iteration of the series of TWmerid_dist_f() to 1e-12 radians.
 * @param a,e       ellipsoid
 * @param distance  signed arc from the equator, in the unit of a
 * @param lat       latitude, radians
 * @param status    #TW_BAD_ECCENTRICITY and #TW_BAD_SEMI_MAJOR as in TWmerid_dist_f();
 *                  #TW_BAD_LATITUDE for an arc beyond the mean term's quarter arc and its
 * tolerance, #TW_BAD_PARAMETER when 50 rounds were needed or a latitude beyond a pole came out,
 * each with lat unwritten; #TW_I_LATITUDE_LIMITED within the tolerance, with the pole written
 */
TW_API void TWmerid_dist_i(double a, double e, double distance, double* lat, TWstatus* status);

/**
 * Derivative of the meridian arc by latitude: the series of TWmerid_dist_f() term by term.
 * @param a           semi-major axis
 * @param e2          the SQUARE of the first eccentricity; a negative one is not refused
 * @param lat         latitude, radians
 * @param derivative  in the unit of a, per radian
 * @param status      as TWmerid_dist_f(), #TW_BAD_ECCENTRICITY for e2 of one or more
 */
TW_API void TWdM_dphi(double a, double e2, double lat, double* derivative, TWstatus* status);

/**
 * Conformal latitude of a geodetic latitude (Snyder 1987, eq. 3-1).
 * @param e              first eccentricity
 * @param lat            geodetic latitude, radians
 * @param conformal_lat  conformal latitude, radians
 * @param status         #TW_BAD_LATITUDE beyond a pole; result unwritten
 */
TW_API void TWgeod_conflat(double e, double lat, double* conformal_lat, TWstatus* status);

/**
 * Geodetic latitude of a conformal latitude, by iteration to 1e-12 radians (Snyder 1987, eq. 3-4).
 * @param e              first eccentricity
 * @param conformal_lat  conformal latitude, radians
 * @param lat            geodetic latitude, radians
 * @param status         #TW_BAD_LATITUDE beyond a pole, and when ten rounds were needed; result
 *                       unwritten
 */
TW_API void TWconflat_geod(double e, double conformal_lat, double* lat, TWstatus* status);

/**
 * Normal gravity at a height: Somigliana's formula (Heiskanen and Moritz, Physical Geodesy, 1967,
 * eq. 2-78) with a constant free-air gradient of 3.086e-6
 * per second squared.
 * @param a,e            ellipsoid
 * @param gamma_equator  normal gravity at the equator, m/s^2
 * @param gamma_pole     normal gravity at the poles, m/s^2
 * @param lat            latitude, radians
 * @param height         height above the ellipsoid, metres
 * @param gravity        normal gravity, m/s^2
 * @param status         always #TW_SUCCESS
 * @return 1; no part of the contract
 */
TW_API int32_t TWnormal_grav(double a, double e, double gamma_equator, double gamma_pole,
                             double lat, double height, double* gravity, TWstatus* status);
/** @} */

/** @name Geocentric and local frames
 *
 *  The local frame's origin and the coordinates of TWlsr_f() and TWlsr_i() are in units of a;
 *  TWllh_to_lsr() and TWlsr_to_llh() use a times their scale.  A matrix is nine doubles row by row:
 *  the local x, y and z axis in geocentric components, z the outward normal at the origin.  No
 *  function here tests a latitude or a longitude.
 *  @{ */

/**
 * Geodetic to geocentric coordinates (Heiskanen and Moritz, Physical Geodesy, 1967, eq. 5-3); to
 * the rounding, 3 nm near the earth's surface.
 * @param a,e     ellipsoid
 * @param count   number of points
 * @param in      longitude, latitude (radians), height (in the unit of a)
 * @param out     X, Y, Z; may be in
 * @param status  always #TW_SUCCESS
 */
TW_API void TWllh_to_xyz(double a, double e, int32_t count, const CoordinateTriple* in,
                         CoordinateTriple* out, TWstatus* status);

/**
 * Geocentric to geodetic coordinates in closed form (Bowring 1985, Survey Review 28, 202-206):
 * within 1e-10 radians for points near the earth's surface.  Within 1e-9 of the axis the longitude
 * is 0 and the latitude a pole, the north pole for Z = 0.
 * @param a,e     ellipsoid
 * @param count   number of points
 * @param in      X, Y, Z
 * @param out     longitude, latitude (radians), height; may be in
 * @param status  always #TW_SUCCESS
 */
TW_API void TWxyz_to_llh(double a, double e, int32_t count, const CoordinateTriple* in,
                         CoordinateTriple* out, TWstatus* status);

/**
 * Sets up a local frame on a point (the topocentric frame of IOGP Guidance Note 7-2, method 9837,
 * turned about its z axis).
 *
 * In mode 1 the x axis points along azimuth, clockwise from north, and y lies 90 degrees to its
 * left. In any other mode the axes follow the line from a first to a second point; rows 0 and 1 are
 * then shorter than one where that line is not horizontal at the origin.
 * @param mode              1: by azimuth; else by two points
 * @param a,e               ellipsoid
 * @param lon0,lat0,h0      the origin
 * @param azimuth           read in mode 1, written otherwise
 * @param x0,y0,z0          geocentric origin, in units of a
 * @param lon1,lat1,h1      first point; not read in mode 1
 * @param lon2,lat2,h2      second point; not read in mode 1
 * @param matrix            nine doubles
 * @param status            #TW_BAD_PARAMETER when the two points are one (origin and row 2 are
 *                          written) or the azimuth cannot be told (the matrix is written)
 */
TW_API void TWlsr_c(int16_t mode, double a, double e, double lon0, double lat0, double h0,
                    double* azimuth, double* x0, double* y0, double* z0, double lon1, double lat1,
                    double h1, double lon2, double lat2, double h2, double* matrix,
                    TWstatus* status);

/**
 * Geodetic to local coordinates.
 * @param a,e       ellipsoid
 * @param x0,y0,z0  origin of TWlsr_c(), in units of a
 * @param matrix    nine doubles of TWlsr_c()
 * @param count     number of points
 * @param in        longitude, latitude, height
 * @param out       local x, y, z in units of a; may be in
 * @param status    always #TW_SUCCESS
 */
TW_API void TWlsr_f(double a, double e, double x0, double y0, double z0, const double* matrix,
                    int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                    TWstatus* status);

/**
 * Local to geodetic coordinates, with the transposed matrix: exact for rows of unit length.
 * @param a,e       ellipsoid
 * @param x0,y0,z0  origin of TWlsr_c(), in units of a
 * @param matrix    nine doubles of TWlsr_c()
 * @param count     number of points
 * @param in        local x, y, z in units of a
 * @param out       longitude, latitude, height; may be in
 * @param status    always #TW_SUCCESS
 */
TW_API void TWlsr_i(double a, double e, double x0, double y0, double z0, const double* matrix,
                    int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                    TWstatus* status);

/**
 * Geodetic to east, north, up on a point (IOGP Guidance Note 7-2, method 9837).
 * @param a,e           ellipsoid
 * @param scale         user units in one unit of a
 * @param lon0,lat0,h0  the origin
 * @param count         number of points
 * @param in            longitude, latitude, height
 * @param out           east, north, up in user units; may be in
 * @param status        always #TW_SUCCESS
 */
TW_API void TWllh_to_lsr(double a, double e, double scale, double lon0, double lat0, double h0,
                         int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                         TWstatus* status);

/**
 * East, north, up on a point to geodetic, the inverse of TWllh_to_lsr() (IOGP Guidance Note 7-2,
 * method 9837).
 * @param a,e           ellipsoid
 * @param scale         user units in one unit of a; zero is not caught
 * @param lon0,lat0,h0  the origin
 * @param count         number of points
 * @param in            east, north, up; CHANGED by the call: divided by a times scale
 * @param out           longitude, latitude, height; may be in
 * @param status        always #TW_SUCCESS
 */
TW_API void TWlsr_to_llh(double a, double e, double scale, double lon0, double lat0, double h0,
                         int32_t count, CoordinateTriple* in, CoordinateTriple* out,
                         TWstatus* status);
/** @} */

/** @name Attitude angles
 *
 *  Three sets of angles of a camera's attitude, all in radians: omega, phi, kappa; tilt, swing,
 *  azimuth; and Wx, Wy, Wz, rotations about the geocentric axes seen at a ground position.  The
 *  status is always #TW_SUCCESS.
 *  @{ */

/**
 * Rotation matrix of omega, phi, kappa; exactly the identity when all three are exactly zero.
 * @param omega,phi,kappa  angles
 * @param matrix           nine doubles, row by row
 * @param status           always #TW_SUCCESS
 */
TW_API void TWcalc_matrix(double omega, double phi, double kappa, double* matrix, TWstatus* status);

/**
 * Omega, phi, kappa to tilt, swing, azimuth; the azimuth is 0 for a tilt below 1e-12.
 * @param omega,phi,kappa     angles
 * @param tilt,swing,azimuth  angles out
 * @param status              always #TW_SUCCESS
 */
TW_API void TWopk_to_tsa(double omega, double phi, double kappa, double* tilt, double* swing,
                         double* azimuth, TWstatus* status);

/**
 * Tilt, swing, azimuth to omega, phi, kappa; kappa is 0 where phi stands at plus or minus pi/2.
 * @param tilt,swing,azimuth  angles
 * @param omega,phi,kappa     angles out
 * @param status              always #TW_SUCCESS
 */
TW_API void TWtsa_to_opk(double tilt, double swing, double azimuth, double* omega, double* phi,
                         double* kappa, TWstatus* status);

/**
 * Geocentric rotations to tilt, swing, azimuth at a position.
 * @param wx,wy,wz            angles
 * @param lon,lat             ground position
 * @param tilt,swing,azimuth  angles out
 * @param status              always #TW_SUCCESS
 */
TW_API void TWWxWyWzto_tsa(double wx, double wy, double wz, double lon, double lat, double* tilt,
                           double* swing, double* azimuth, TWstatus* status);

/**
 * Tilt, swing, azimuth at a position to geocentric rotations; Wz is 0 where Wy stands at pi/2.
 * @param tilt,swing,azimuth  angles
 * @param lon,lat             ground position
 * @param wx,wy,wz            angles out
 * @param status              always #TW_SUCCESS
 */
TW_API void TWtsa_toWxWyWz(double tilt, double swing, double azimuth, double lon, double lat,
                           double* wx, double* wy, double* wz, TWstatus* status);
/** @} */

/** @name Helpers on the plane
 *  @{ */

/**
 * Normalised plane coordinates to grid coordinates: x s2 s1 + false origin.
 * @param s1,s2                         factors, for instance semi-major axis and central scale
 * @param false_easting,false_northing  added after scaling
 * @param count                         number of points
 * @param in                            x, y; height not read
 * @param out                           easting, northing; height unwritten; may be in
 * @param status                        always #TW_SUCCESS
 */
TW_API void TWab_to_en(double s1, double s2, double false_easting, double false_northing,
                       int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                       TWstatus* status);

/**
 * Grid coordinates to normalised plane coordinates, the inverse of TWab_to_en().
 * @param s1,s2                         factors
 * @param false_easting,false_northing  taken off before scaling
 * @param count                         number of points
 * @param in                            easting, northing; height not read
 * @param out                           x, y; height unwritten; may be in
 * @param status                        always #TW_SUCCESS
 */
TW_API void TWen_to_ab(double s1, double s2, double false_easting, double false_northing,
                       int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                       TWstatus* status);

/**
 * Largest distance of the odd points of a polyline from the chords of their two neighbours.
 * @param points    x, y of each point, counted from 0: even points end the chords
 * @param count     number of points; below 3 the distance is 0
 * @param distance  in the unit of the points; a chord of no length is not caught
 * @param status    always #TW_SUCCESS
 */
TW_API void TWpt_line_dist(const CoordinateTriple* points, int32_t count, double* distance,
                           TWstatus* status);

/**
 * Bilinear interpolation in a cell.
 * @param p00,p01,p10,p11  values at (fx, fy) = (0, 0), (0, 1), (1, 0), (1, 1)
 * @param fx,fy            position in the cell
 * @param result           the value
 * @param status           always #TW_SUCCESS
 */
TW_API void TWbilinear_interpolation(double p00, double p01, double p10, double p11, double fx,
                                     double fy, double* result, TWstatus* status);

/**
 * Newton's forward interpolation of the second order on three equally spaced values, with
 * differences in single precision.
 * @param t         position: 0 at f0, 1 at f1, 2 at f2
 * @param f0,f1,f2  values
 * @param result    the value
 * @param status    always #TW_SUCCESS
 */
TW_API void TWqterp2(const float* t, const float* f0, const float* f1, const float* f2,
                     float* result, TWstatus* status);
/** @} */

#ifdef __cplusplus
}
#endif

#endif
