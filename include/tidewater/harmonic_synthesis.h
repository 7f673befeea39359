/**
 * @file harmonic_synthesis.h
 * Harmonic synthesis by Clenshaw summation.
 *
 * A triangular array of degree N is a table of N + 1 row pointers, row n pointing at the n + 1
 * doubles of orders m = 0 .. n; the rows stand one behind the other in a flat block of (N + 1) (N +
 * 2) / 2 doubles.  Coefficients C (cosine) and S (sine) are fully normalised: the mean square of
 * each harmonic on the sphere is 1.  S[n][0] is 0.
 *
 * All arrays are the caller's, and nothing is kept between calls but what stands in them.  A user
 * 1. builds row tables over flat blocks (TWhar_alocCtnm() for the coefficient sets) and fills them,
 * 2. brings each set to full normalisation with TWhar_normaliz(), if it is not of that kind,
 * 3. calls TWhar_recur_c() once,
 * 4. calls TWhar_set_date() for each date, and sets the remembered positions to values that match
 *    no point whenever the coefficients have changed,
 * 5. calls TWhar_mag_val(), TWhar_mag_var() or TWhar_sum() for each array of points.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Magnetic field, WMM2025 at 2027.3, lat -89 to 89, to 400 km up: 5.8e-11 nT (5.0e-11 nT);
 * - Magnetic field, IGRF-14 at 2026.5, lat -89 to 89, to 400 km up: 5.5e-11 nT (5.1e-11 nT);
 * - Magnetic field, IGRF-14 at 1952.5, lat -89 to 89, to 400 km up: 6.0e-11 nT (5.3e-11 nT);
 * - Magnetic field, IGRF-13 at 2021.0, lat -89 to 89, to 400 km up: 5.5e-11 nT (5.1e-11 nT).
 *
 * Source: Holmes and Featherstone, A Unified Approach to the Clenshaw Summation and the Recursive
 * Computation of Very High Degree and Order Normalised Associated Legendre Functions, Journal of
 * Geodesy 76 (2002), pp. 279-299.
 */
#ifndef TIDEWATER_HARMONIC_SYNTHESIS_H
#define TIDEWATER_HARMONIC_SYNTHESIS_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Tries whether six row tables of a degree can be allocated.  The row tables are plain values, so
 * none of those built reaches the caller: build your own, row n at n (n + 1) / 2 doubles into its
 * block.
 * @param N                                    degree
 * @param block1,block2,block3,block4,block5,block6  flat blocks; not read
 * @param rows1,rows2,rows3,rows4,rows5,rows6  not used
 * @param status                               #TW_NO_MEMORY when an allocation failed
 */
TW_API void TWhar_aloc_Cnm(int32_t N, double* block1, double* block2, double* block3,
                           double* block4, double* block5, double* block6, void* rows1, void* rows2,
                           void* rows3, void* rows4, void* rows5, void* rows6, TWstatus* status);

/**
 * Row tables over the coefficient sets of a model, which stand one behind the other in a block.
 * Each table is allocated with malloc(): the caller releases it with free().
 * @param k        number of sets
 * @param degrees  degree of each set; a negative one has no rows
 * @param c_block  cosine coefficients of all sets; not read
 * @param s_block  sine coefficients of all sets; not read
 * @param c_sets   k row tables into c_block, out
 * @param s_sets   k row tables into s_block, out
 * @param status   #TW_NO_MEMORY when an allocation failed: nothing stays allocated, the tables of
 *                 the sets begun are null, the others as they were
 */
TW_API void TWhar_alocCtnm(int32_t k, const int32_t* degrees, double* c_block, double* s_block,
                           double*** c_sets, double*** s_sets, TWstatus* status);

/**
 * Recursion constants of the fully normalised harmonics (Holmes and Featherstone 2002, eq. 12).
 * The diagonal of rec_b and the places beside it, [m][m] and [m][m - 1], hold no constant and are
 * not written: TWhar_sum() keeps its table of sines there.
 * @param N       degree, the highest that is to be summed
 * @param rec_a   triangular array of degree N, out
 * @param rec_b   triangular array of degree N, out
 * @param status  always #TW_SUCCESS
 */
TW_API void TWhar_recur_c(int32_t N, double** rec_a, double** rec_b, TWstatus* status);

/**
 * Brings coefficients to full normalisation, in place.
 * @param kind    2: from Schmidt's semi-normalisation; 1: from unnormalised coefficients whose
 *                tables are scaled with the double factorial (2m - 1)!! in the place of m!
 * @param N       degree
 * @param C,S     triangular arrays
 * @param status  #TW_BAD_HARMONIC_MODEL for any other kind; coefficients unchanged
 */
TW_API void TWhar_normaliz(int32_t kind, int32_t N, double** C, double** S, TWstatus* status);

/**
 * Coefficients and their rates between set i and set i + 1.  Without interpolation, for dt below
 * tolerance or a NaN, the coefficients are those of set i.
 * @param last_interval  0: set i + 1 is a model, and the rates are its differences from set i over
 *                       interval; 1: set i + 1 holds the rates themselves
 * @param interval       time between the two sets; read for last_interval 0
 * @param dt             time since set i
 * @param tolerance      least dt that is interpolated
 * @param i              index of the set
 * @param n_main,n_sec   degrees up to which coefficients and rates are written
 * @param c_sets,s_sets  coefficient sets
 * @param cnm,snm        coefficients, out
 * @param ctnm,stnm      rates per unit of time, out
 * @param status         #TW_BAD_INPUT for another last_interval; nothing written
 */
TW_API void TWhar_intp_Cnm(int16_t last_interval, double interval, double dt, double tolerance,
                           int32_t i, int32_t n_main, int32_t n_sec, double*** c_sets,
                           double*** s_sets, double** cnm, double** snm, double** ctnm,
                           double** stnm, TWstatus* status);

/**
 * Coefficients and their rates at a date.  The last set holds the rates of the one before it, and
 * may be used up to 5 units of time beyond its own epoch.
 *
 * Nothing is done if the whole units between date and last_date are not above tolerance: a change
 * of less than one unit never leads to new coefficients, whatever the tolerance.
 * @param date           in the unit of the epochs
 * @param last_date      date that the arrays hold, in and out; a NaN before first use
 * @param tolerance      see above, and TWhar_intp_Cnm()
 * @param epoch_count    number of sets, at least 2
 * @param degrees        degree of each set
 * @param epochs         epoch of each set, ascending
 * @param interval       time between two sets
 * @param c_sets,s_sets  coefficient sets
 * @param n_main         degree of the coefficients, out
 * @param n_sec          degree of the rates, out
 * @param cnm,snm        coefficients, out
 * @param ctnm,stnm      rates, out
 * @param status         #TW_BAD_DATE before the first epoch or more than 5 beyond the last,
 *                       #TW_BAD_INPUT with fewer than two epochs; nothing written, last_date
 *                       included
 */
TW_API void TWhar_set_date(double date, double* last_date, double tolerance, int32_t epoch_count,
                           const int32_t* degrees, const double* epochs, double interval,
                           double*** c_sets, double*** s_sets, int32_t* n_main, int32_t* n_sec,
                           double** cnm, double** snm, double** ctnm, double** stnm,
                           TWstatus* status);

/**
 * Sums a harmonic series, or its gradient, at geocentric points.
 *
 * For the potential V = radius sum (radius / r)^(n + 1) (C cos m lon + S sin m lon) P(cos theta)
 * mode 0 gives (1 / r) dV/dtheta, -1 / (r sin theta) dV/dlon and dV/dr: north, east and down of the
 * field -grad V in the geocentric frame, in the unit of the coefficients.
 *
 * The sums over degree are kept in the eight work arrays, and made anew only for a point that has
 * moved by more than tolerance in colatitude or radius; the table of sines, in rec_b, only for one
 * that has moved by more than tolerance in longitude.  So a profile along a parallel is cheap.  The
 * caches hold for one C, S, N, radius and mode: after a change of any set last_colat or last_radius
 * to a value that matches no point.  Two threads need a rec_b, work arrays and caches each.
 *
 * A point within 1e-12 radians of the axis is clamped to it, at longitude 0.
 * @param mode                             0: (north, east, down); 1: north alone; 2: east alone; 3:
 *                                         down alone; 4: gm / (r gamma) times the sum of C and S,
 *                                         with gamma normal gravity at the point, as for a geoid
 *                                         height; modes 1 to 4 write out[i].x only.  Any other:
 *                                         caches and the table of sines are brought up to date,
 *                                         nothing is written
 * @param N                                degree, AT LEAST 2: rows 1 and 2 of rec_b are written
 *                                         whatever it is
 * @param radius                           reference radius of the series
 * @param C,S                              coefficients
 * @param rec_a,rec_b                      constants of TWhar_recur_c(); rec_b is written
 * @param sum_dC,sum_dS,sum_lC,sum_lS,sum_rC,sum_rS,sum_C,sum_S  work arrays of N + 1 doubles
 * @param last_colat,last_radius,last_lon  remembered position, in and out; before first use any
 *                                         value that matches no point, such as 1e30, but for
 *                                         last_lon not NaN
 * @param tolerance                        a length, in the unit of radius
 * @param saved_tcos,saved_tsin,saved_scale_theta,saved_scale_lambda,saved_scale_r  remembered
 *                                         values, in and out
 * @param a,e                              ellipsoid; read in mode 4
 * @param gm                               gravitational constant times mass; read in mode 4
 * @param gamma_equator,gamma_pole         normal gravity; read in mode 4
 * @param count                            number of points
 * @param in                               geocentric X, Y, Z in the unit of radius
 * @param out                              see mode; may be in
 * @param status                           always #TW_SUCCESS
 */
TW_API void TWhar_sum(int16_t mode, int32_t N, double radius, double** C, double** S,
                      double** rec_a, double** rec_b, double* sum_dC, double* sum_dS,
                      double* sum_lC, double* sum_lS, double* sum_rC, double* sum_rS, double* sum_C,
                      double* sum_S, double* last_colat, double* last_radius, double* last_lon,
                      double tolerance, double* saved_tcos, double* saved_tsin,
                      double* saved_scale_theta, double* saved_scale_lambda, double* saved_scale_r,
                      double a, double e, double gm, double gamma_equator, double gamma_pole,
                      int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                      TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
