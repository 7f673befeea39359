/**
 * @file space_oblique_mercator.h
 * Space oblique Mercator projection of the ellipsoid.
 *
 * The constants are one set: TWsom_c() works them out once for an orbit, TWsom_f() and TWsom_i()
 * take them as they are.  The arrays are the caller's and hold n_terms doubles each.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Space oblique Mercator, Landsat 2, 5 terms, the scanned strip from its northernmost point to
 *   the equator: forward 17 mm (17 mm), inverse 17 mm (17 mm);
 * - Space oblique Mercator, Landsat 5, 5 terms, the scanned strip from its northernmost point to
 *   the equator: forward 17 mm (17 mm), inverse 17 mm (17 mm);
 * - Space oblique Mercator, Landsat 5, 20 terms, the scanned strip from its northernmost point to
 *   the equator: forward 1.8 um (1.6 um), inverse 65 um (39 um).
 *
 * Source: Snyder, Space Oblique Mercator Projection: Mathematical Development, USGS Bulletin 1518
 * (1981); Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 214-229.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_SPACE_OBLIQUE_MERCATOR_H
#define TIDEWATER_SPACE_OBLIQUE_MERCATOR_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

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
 *                  two grid points; nothing written
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
 *                 last values, the loop goes on
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
 *                 last values, the loop goes on
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

#ifdef __cplusplus
}
#endif

#endif
