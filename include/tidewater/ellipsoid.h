/**
 * @file ellipsoid.h
 * Quantities of the reference ellipsoid.
 *
 * The ellipsoid is a, the semi-major axis, whose unit is that of every length, and e, the first
 * eccentricity (not its square; TWdM_dphi() alone takes the square).
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Radius of the parallel, all latitudes, GRS 1980: 1.1 nm (< 1 nm);
 * - Radius in the meridian, all latitudes, GRS 1980: 1.4 nm (< 1 nm);
 * - Gaussian radius, all latitudes, GRS 1980: 1.0 nm (< 1 nm);
 * - Radius of equal surface, GRS 1980: 164 um (164 um);
 * - Radius of equal volume, GRS 1980: < 1 nm (< 1 nm);
 * - Meridian arc, all latitudes, GRS 1980: forward 65 nm (62 nm), inverse 65 nm (61 nm);
 * - Derivative of the arc, all latitudes, GRS 1980: 554 nm (539 nm);
 * - Conformal latitude, all latitudes, GRS 1980: forward 3.2 nm (2.2 nm), inverse 39 nm (20 nm);
 * - Normal gravity, height 0: 2.4e-15 m/s^2 (2.2e-15 m/s^2).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987); Helmert,
 * Die mathematischen und physikalischen Theorieen der hoeheren Geodaesie, part 1 (1880), for the
 * meridian arc; Heiskanen and Moritz, Physical Geodesy (1967), for normal gravity.
 */
#ifndef TIDEWATER_ELLIPSOID_H
#define TIDEWATER_ELLIPSOID_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Radius of the parallel at a latitude, a cos(lat) / sqrt(1 - e^2 sin^2 lat) (Snyder 1987,
 * eq. 14-15).
 * @param a,e     ellipsoid
 * @param lat     latitude, radians, at most pi/2 in size (no tolerance)
 * @param radius  radius, in the unit of a
 * @param status  #TW_BAD_LATITUDE beyond a pole; radius unwritten
 */
TW_API void TWRparal(double a, double e, double lat, double* radius, TWstatus* status);

/**
 * Radius of curvature in the meridian, a (1 - e^2) / (1 - e^2 sin^2 lat)^(3/2) (Snyder 1987,
 * eq. 4-18).
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
 * (Snyder 1987, p. 16, authalic radius).
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
 * Meridian arc from the equator, by the series in the third flattening to the fourth power (Helmert
 * 1880); a lat for e below 1e-12.
 * @param a,e       ellipsoid
 * @param lat       latitude, radians
 * @param distance  signed arc, in the unit of a
 * @param status    #TW_BAD_ECCENTRICITY unless 0 <= e < 1, then #TW_BAD_SEMI_MAJOR for a of zero or
 *                  below, then #TW_BAD_LATITUDE beyond pi/2 + 1e-12, each with distance unwritten;
 *                  #TW_I_LATITUDE_LIMITED for a latitude beyond pi/2 clamped to the pole
 */
TW_API void TWmerid_dist_f(double a, double e, double lat, double* distance, TWstatus* status);

/**
 * Latitude at a meridian arc, by iteration of the series of TWmerid_dist_f() to 1e-12 radians.
 * @param a,e       ellipsoid
 * @param distance  signed arc from the equator, in the unit of a
 * @param lat       latitude, radians
 * @param status    #TW_BAD_ECCENTRICITY and #TW_BAD_SEMI_MAJOR as in TWmerid_dist_f();
 *                  #TW_BAD_LATITUDE for an arc beyond the mean term's quarter arc and its
 *                  tolerance, #TW_BAD_PARAMETER when 50 rounds were needed or a latitude beyond a
 *                  pole came out, each with lat unwritten; #TW_I_LATITUDE_LIMITED within the
 *                  tolerance, with the pole written
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
 * eq. 2-78) with a constant free-air gradient of 3.086e-6 per second squared.
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

#ifdef __cplusplus
}
#endif

#endif
