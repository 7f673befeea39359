/**
 * @file magnetic_elements.h
 * Geomagnetic field and its elements.
 *
 * Coefficients, work arrays and remembered positions are those of harmonic_synthesis.h.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Magnetic field, WMM2025 at 2027.3, lat -89 to 89, to 400 km up: 5.8e-11 nT (5.0e-11 nT);
 * - Magnetic field, IGRF-14 at 2026.5, lat -89 to 89, to 400 km up: 5.5e-11 nT (5.1e-11 nT);
 * - Magnetic field, IGRF-14 at 1952.5, lat -89 to 89, to 400 km up: 6.0e-11 nT (5.3e-11 nT);
 * - Magnetic field, IGRF-13 at 2021.0, lat -89 to 89, to 400 km up: 5.5e-11 nT (5.1e-11 nT).
 *
 * Source: The US/UK World Magnetic Model for 2025-2030: Technical Report, NOAA National Centers for
 * Environmental Information.
 */
#ifndef TIDEWATER_MAGNETIC_ELEMENTS_H
#define TIDEWATER_MAGNETIC_ELEMENTS_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/** Magnetic elements, or their change in one unit of the model's time. */
typedef struct MagneticElements {
  double declination; /**< Radians, positive east of north. */
  double inclination; /**< Radians, positive down. */
  double horizontal;  /**< Horizontal intensity, in the unit of the coefficients. */
  double total;       /**< Total intensity, in the unit of the coefficients. */
} MagneticElements;

/**
 * Field and magnetic elements at geodetic points.
 *
 * Where the horizontal intensity is 1e-12 or less, the declination is 0.  Within 1e-12 radians of a
 * pole, where north is the direction of the point's longitude, it counts from the meridian of
 * Greenwich.
 * @param N,radius,C,S,rec_a,rec_b  as in TWhar_sum()
 * @param sum_dC,sum_dS,sum_lC,sum_lS,sum_rC,sum_rS,sum_C,sum_S  as in TWhar_sum()
 * @param last_colat,last_radius,last_lon,tolerance  as in TWhar_sum()
 * @param saved_tcos,saved_tsin,saved_scale_theta,saved_scale_lambda,saved_scale_r  as in
 *                                  TWhar_sum()
 * @param a,e                       ellipsoid of the points
 * @param count                     number of points
 * @param points                    longitude, latitude, height
 * @param field                     north, east and down in the geodetic frame; may be points
 * @param elements                  declination in (-pi, pi], inclination, intensities
 * @param status                    #TW_NO_MEMORY when there is none for the positions; nothing
 *                                  written
 */
TW_API void TWhar_mag_val(int32_t N, double radius, double** C, double** S, double** rec_a,
                          double** rec_b, double* sum_dC, double* sum_dS, double* sum_lC,
                          double* sum_lS, double* sum_rC, double* sum_rS, double* sum_C,
                          double* sum_S, double* last_colat, double* last_radius, double* last_lon,
                          double tolerance, double* saved_tcos, double* saved_tsin,
                          double* saved_scale_theta, double* saved_scale_lambda,
                          double* saved_scale_r, double a, double e, int32_t count,
                          const CoordinateTriple* points, CoordinateTriple* field,
                          MagneticElements* elements, TWstatus* status);

/**
 * Field, magnetic elements, and their change in one unit of time, at geodetic points.
 *
 * The rates are differences: elements of field plus secular field, less elements of the field.  The
 * rate of the declination is formed whatever the horizontal intensity, and is not counted from
 * Greenwich at the poles.
 *
 * The second series shares radius, rec_a, rec_b, tolerance and last_lon with the first.
 * @param N,radius,C,S,rec_a,rec_b        as in TWhar_sum()
 * @param sum_dC,sum_dS,sum_lC,sum_lS,sum_rC,sum_rS,sum_C,sum_S  as in TWhar_sum()
 * @param last_colat,last_radius,last_lon,tolerance  as in TWhar_sum()
 * @param saved_tcos,saved_tsin,saved_scale_theta,saved_scale_lambda,saved_scale_r  as in
 *                                        TWhar_sum()
 * @param n_sec                           degree of the rates, at least 2 and at most N
 * @param Ct,St                           rates of the coefficients in one unit of time
 * @param sec_dC,sec_dS,sec_lC,sec_lS,sec_rC,sec_rS,sec_C,sec_S  work arrays of the rates
 * @param sec_last_colat,sec_last_radius  remembered position of the rates
 * @param sec_tcos,sec_tsin,sec_scale_theta,sec_scale_lambda,sec_scale_r  remembered values of the
 *                                        rates
 * @param a,e                             ellipsoid of the points
 * @param count                           number of points
 * @param points                          longitude, latitude, height
 * @param field                           north, east and down in the geodetic frame; may be points
 * @param elements                        declination in (-pi, pi], inclination, intensities
 * @param sec_field                       change of north, east and down; may be points
 * @param rates                           change of the elements, that of the declination in (-pi,
 *                                        pi]
 * @param status                          #TW_NO_MEMORY when there is none for the positions;
 *                                        nothing written
 */
TW_API void TWhar_mag_var(
    int32_t N, double radius, double** C, double** S, double** rec_a, double** rec_b,
    double* sum_dC, double* sum_dS, double* sum_lC, double* sum_lS, double* sum_rC, double* sum_rS,
    double* sum_C, double* sum_S, double* last_colat, double* last_radius, double* last_lon,
    double tolerance, double* saved_tcos, double* saved_tsin, double* saved_scale_theta,
    double* saved_scale_lambda, double* saved_scale_r, int32_t n_sec, double** Ct, double** St,
    double* sec_dC, double* sec_dS, double* sec_lC, double* sec_lS, double* sec_rC, double* sec_rS,
    double* sec_C, double* sec_S, double* sec_last_colat, double* sec_last_radius, double* sec_tcos,
    double* sec_tsin, double* sec_scale_theta, double* sec_scale_lambda, double* sec_scale_r,
    double a, double e, int32_t count, const CoordinateTriple* points, CoordinateTriple* field,
    MagneticElements* elements, CoordinateTriple* sec_field, MagneticElements* rates,
    TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
