/**
 * @file frame.h
 * What all functions of the library have in common: points, status words, and the checks and
 * precision helpers of a call.
 *
 * Every function can be called at any time, from C or C++, without set-up, and by any number of
 * threads at once but for three groups: the shift and geoid grids (TWnadcon_..., TWcnt_...,
 * TWgeo90_...) keep one window for the process, the text functions adopt the user's locale while
 * they run, which is the process's, and the harmonic sums (TWhar_...) write work arrays that a
 * thread must have for itself.
 *
 * Angles are radians, longitude first and positive east, latitude positive north.  Points travel as
 * arrays of CoordinateTriple; the output array may be the input array, partial overlap is not
 * supported.  A count of zero or below does nothing and leaves #TW_SUCCESS.
 *
 * The last argument is the caller's status word.  It is set to #TW_SUCCESS first and written again
 * only by a failure or an information event, so a status set for one point stands at the end of the
 * array.  Test its low bit with TW_OK(): set means that the values may be used.  A result pointer
 * is written only when its value was computed.  No pointer is checked for null.
 *
 * Projections.  A projection is up to four functions with one stem: _c computes constants, _f goes
 * from longitude and latitude to the plane, _i goes back, _s gives local scale factors.  The
 * constants are the caller's: _c writes them once, and they are passed to the others.
 * - Plane coordinates are in units of the semi-major axis, with central scale 1 and no false
 *   origin: TWab_to_en() applies those.
 * - _f and _i read and write elements x and y of a point; z of the output stays as it is.
 * - _s writes (k, h, areal scale): scale along the parallel, along the meridian, and of areas, with
 *   the caller's k0 multiplied in.
 * - A point that fails leaves its status, which later points do not clear, and takes one of three
 *   forms.  SKIP: its output stays as it was, the loop goes on.  STOP: the function returns, the
 *   rest of the output stays as it was.  FILL: the scale falls back to k0 and is written, the loop
 *   goes on.
 *
 * "Snyder 1987" is Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987).
 *
 * Accuracy: no figure; limits of angles and of digits, exact by comparison (docs/accuracy.md).
 */
#ifndef TIDEWATER_FRAME_H
#define TIDEWATER_FRAME_H

#include <stdint.h>

/** Marks what the library exports. */
#if defined(TIDEWATER_STATIC)
#define TW_API
#elif defined(_WIN32)
#if defined(TIDEWATER_BUILDING)
#define TW_API __declspec(dllexport)
#else
#define TW_API __declspec(dllimport)
#endif
#else
#define TW_API __attribute__((visibility("default")))
#endif

#ifdef __cplusplus
extern "C" {
typedef char16_t TWchar16; /**< One unit of wide text: 16 bits on every platform. */
#else
typedef uint_least16_t TWchar16; /**< One unit of wide text: 16 bits on every platform. */
#endif

/** A point: longitude, latitude, height; or easting, northing, height; or X, Y, Z. */
typedef struct CoordinateTriple {
  double x; /**< Longitude in radians, easting, or X. */
  double y; /**< Latitude in radians, northing, or Y. */
  double z; /**< Height in metres, or Z. */
} CoordinateTriple;

/**
 * Status word: facility 0x0FCF in the high half, message above bit 3, severity in the low 3 bits.
 */
typedef uint32_t TWstatus;

/**
 * A caller's value that is handed through to a callback: an integer or a pointer turned into one.
 */
typedef uintptr_t TWcontext;

/** A caller's transformation of count points; in and out may be the same array. */
typedef void (*TWtransform)(TWcontext context, int32_t count, const CoordinateTriple* in,
                            CoordinateTriple* out, TWstatus* status);

/** As TWtransform, with a pointer for the context. */
typedef void (*TWtransform_ptr)(void* context, int32_t count, const CoordinateTriple* in,
                                CoordinateTriple* out, TWstatus* status);

/** True for success and information words, false for warnings and errors. */
#define TW_OK(status) (((status)&1u) != 0u)

/** @name Status words
 *  @{ */
#define TW_SUCCESS UINT32_C(0x0FCF8009)          /**< The call did what was asked. */
#define TW_FAILURE UINT32_C(0x0FCF8012)          /**< A step without a status of its own failed. */
#define TW_RANGE_ERROR UINT32_C(0x0FCF801A)      /**< The formula has no answer for the value. */
#define TW_BAD_ECCENTRICITY UINT32_C(0x0FCF8022) /**< Eccentricity of one or more, or negative. */
#define TW_BAD_LONGITUDE UINT32_C(0x0FCF802A)    /**< Longitude beyond two pi either way. */
#define TW_BAD_LATITUDE UINT32_C(0x0FCF8032)     /**< Latitude beyond the function's bound. */
#define TW_BAD_SCALE_LATITUDE UINT32_C(0x0FCF803A) /**< Scale not above 0 and at most 1. */
#define TW_BAD_DATE UINT32_C(0x0FCF8042)           /**< Date outside the magnetic model's span. */
#define TW_BAD_STANDARD_PARALLEL UINT32_C(0x0FCF804A) /**< Standard parallel at the pole. */
#define TW_BAD_SEMI_MAJOR UINT32_C(0x0FCF8052)        /**< Semi-major axis of zero or below. */
#define TW_DIVERGED UINT32_C(0x0FCF805A)              /**< The polyconic inverse ran away. */
#define TW_BAD_ZONE UINT32_C(0x0FCF8062)              /**< No such zone. */
#define TW_BAD_HEMISPHERE UINT32_C(0x0FCF806A)        /**< Hemisphere other than 0 and 1. */
#define TW_BAD_TEXT UINT32_C(0x0FCF8072)           /**< A character or letter that does not fit. */
#define TW_BAD_INPUT UINT32_C(0x0FCF807A)          /**< Mode or flag outside its values. */
#define TW_NOT_CONVERGED UINT32_C(0x0FCF8082)      /**< Iteration limit, or outside the domain. */
#define TW_NO_MEMORY UINT32_C(0x0FCF808A)          /**< An allocation failed. */
#define TW_BAD_DATA UINT32_C(0x0FCF8092)           /**< Values read or worked out are unusable. */
#define TW_BAD_PARAMETER UINT32_C(0x0FCF809A)      /**< Parameters do not fit together. */
#define TW_SINGULAR UINT32_C(0x0FCF80A2)           /**< The scale factor 1 + s is exactly zero. */
#define TW_NO_SUCH_MODEL UINT32_C(0x0FCF80AA)      /**< The store has no such model. */
#define TW_BAD_HARMONIC_MODEL UINT32_C(0x0FCF80B2) /**< Harmonic model data cannot be used. */
#define TW_GEOID_FILE_ERROR UINT32_C(0x0FCF80BA)   /**< The list of geoid grids cannot be used. */
#define TW_GRID_FILE_ERROR UINT32_C(0x0FCF80C2)    /**< A shift grid cannot be used. */
#define TW_BAD_TOLERANCE UINT32_C(0x0FCF80CA)      /**< The tolerance is exactly zero. */
#define TW_NO_SUCH_SYSTEM UINT32_C(0x0FCF80D2)     /**< The store has no such system. */
#define TW_PF_OPEN_ERROR UINT32_C(0x0FCF80DA)      /**< The parameter store cannot be opened. */
#define TW_PF_TABLE_ERROR UINT32_C(0x0FCF80E2)     /**< A table operation of the store failed. */
#define TW_NO_SUCH_VERT_DATUM UINT32_C(0x0FCF80EA) /**< The store has no such vertical datum. */
#define TW_BUFFER_TOO_SMALL UINT32_C(0x0FCF80F2)   /**< Fewer than two points asked for. */
#define TW_GEOID_READ_ERROR UINT32_C(0x0FCF80FA)   /**< Reading a geoid file failed. */
#define TW_GSB_READ_ERROR UINT32_C(0x0FCF8102)     /**< Reading a national grid file failed. */
#define TW_GRID_NOT_FOUND UINT32_C(0x0FCF810A)     /**< area.par cannot be opened, or is empty. */
#define TW_NO_SUCH_SATELLITE UINT32_C(0x0FCF8112)  /**< The store has no such satellite. */
#define TW_W_NO_POINTS UINT32_C(0x0FCF8118) /**< Line too short for any intermediate point. */
#define TW_I_LATITUDE_LIMITED \
  UINT32_C(0x0FCF8123) /**< A value was clamped, or an iteration ran out. */
#define TW_I_OUTSIDE_NADCON UINT32_C(0x0FCF812B) /**< A point outside the NADCON grids. */
#define TW_I_OUTSIDE_GEOID UINT32_C(0x0FCF8133)  /**< A point outside the geoid grids. */
#define TW_I_OUTSIDE_CNT UINT32_C(0x0FCF813B)    /**< A point outside the national grid. */
/** @} */

/**
 * Checks a latitude and clamps it to the pole.
 * @param lat     latitude, radians
 * @param result  the latitude; exactly plus or minus pi/2 where lat lies beyond by less than 1e-12
 * @param status  #TW_BAD_LATITUDE at or beyond pi/2 + 1e-12 or for a NaN; result unwritten
 */
TW_API void TWverify_lat(double lat, double* result, TWstatus* status);

/**
 * Checks a longitude and brings it into [-pi, pi].
 * @param lon     longitude, radians, from -2 pi to 2 pi, both included
 * @param result  the longitude; exactly pi and -pi stay, 2 pi gives 0
 * @param status  #TW_BAD_LONGITUDE outside that range or for a NaN; result unwritten
 */
TW_API void TWverify_lon(double lon, double* result, TWstatus* status);

/**
 * How many decimal places a number can carry in a double: TWmax_f_prec() for a magnitude of 1.0 or
 * more, otherwise (a NaN too) TWmin_f_prec().
 * @param value      the number
 * @param precision  decimal places
 * @param status     always #TW_SUCCESS
 * @return 1; no part of the contract
 */
TW_API int32_t TWget_prec(const double* value, uint16_t* precision, TWstatus* status);

/**
 * Decimal places left after the integer digits of a number of one or more: 14 for 1, 12 for 999, 11
 * for 1000, 0 from 10^15 on; 15 for a magnitude below 1.
 * @param value      the number
 * @param precision  decimal places, 0 to 15
 * @param status     always #TW_SUCCESS
 * @return 1; no part of the contract
 */
TW_API int32_t TWmax_f_prec(const double* value, uint16_t* precision, TWstatus* status);

/**
 * Decimal places that show the first significant digits of a number below one: 0 for exactly zero,
 * 15 for 0.5, 16 for 0.1, 18 for 0.001, 29 for 1e-15 and less.
 * @param value      the number
 * @param precision  decimal places, 0 or 15 to 29
 * @param status     always #TW_SUCCESS
 * @return 1; no part of the contract
 */
TW_API int32_t TWmin_f_prec(const double* value, uint16_t* precision, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
