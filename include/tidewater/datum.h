/**
 * @file datum.h
 * Datum transformations by formulas, polynomials and shift grids, and geoid undulation.
 */
#ifndef TIDEWATER_DATUM_H
#define TIDEWATER_DATUM_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/** @name Similarity transformations (EPSG Guidance Note 7-2, coordinate frame and
 * Molodensky-Badekas)
 *
 *  Coordinates are geocentric X, Y, Z in any one unit.  rotation is nine doubles row by row and is
 *  not checked: the inverses use its transpose, so that a matrix that is not orthogonal does not
 *  come back.  s is the scale difference: the factor is 1 + s.
 *  @{ */

/**
 * Seven-parameter similarity: out = R (1 + s) in + t.
 * @param count     number of points
 * @param in        X, Y, Z
 * @param s         scale difference, parts of one
 * @param rotation  nine doubles
 * @param tx,ty,tz  translation
 * @param out       X, Y, Z; may be in
 * @param status    always #TW_SUCCESS
 */
TW_API void TWbw_f(int32_t count, const CoordinateTriple* in, double s, const double* rotation,
                   double tx, double ty, double tz, CoordinateTriple* out, TWstatus* status);

/**
 * The way back, with the parameters of TWbw_f().
 * @param count     number of points
 * @param in        X, Y, Z
 * @param s         scale difference
 * @param rotation  nine doubles; the transpose is applied
 * @param tx,ty,tz  translation
 * @param out       X, Y, Z; may be in
 * @param status    #TW_SINGULAR for s of -1, with every point written but not divided by the factor
 */
TW_API void TWbw_i(int32_t count, const CoordinateTriple* in, double s, const double* rotation,
                   double tx, double ty, double tz, CoordinateTriple* out, TWstatus* status);

/**
 * Ten-parameter similarity about a centre: out = R (1 + s) (in - p) + q.
 * @param count     number of points
 * @param in        X, Y, Z
 * @param s         scale difference, parts of one
 * @param rotation  nine doubles
 * @param px,py,pz  centre in the source datum
 * @param qx,qy,qz  centre in the target datum: p + t
 * @param out       X, Y, Z; may be in
 * @param status    always #TW_SUCCESS
 */
TW_API void TWmol_bdk_f(int32_t count, const CoordinateTriple* in, double s, const double* rotation,
                        double px, double py, double pz, double qx, double qy, double qz,
                        CoordinateTriple* out, TWstatus* status);

/**
 * The way back, with the parameters of TWmol_bdk_f().
 * @param count     number of points
 * @param in        X, Y, Z
 * @param s         scale difference; -1 is divided by
 * @param rotation  nine doubles; the transpose is applied
 * @param px,py,pz  centre in the source datum
 * @param qx,qy,qz  centre in the target datum
 * @param out       X, Y, Z; may be in
 * @param status    #TW_FAILURE for s of exactly 0, although every point is written and right
 */
TW_API void TWmol_bdk_i(int32_t count, const CoordinateTriple* in, double s, const double* rotation,
                        double px, double py, double pz, double qx, double qy, double qz,
                        CoordinateTriple* out, TWstatus* status);

/**
 * Adds three constants.
 * @param count     number of points
 * @param in        any coordinates
 * @param dx,dy,dz  shifts of the three elements
 * @param out       in plus the shifts; may be in
 * @param status    always #TW_SUCCESS
 */
TW_API void TWshifts_f(int32_t count, const CoordinateTriple* in, double dx, double dy, double dz,
                       CoordinateTriple* out, TWstatus* status);

/**
 * Takes three constants off.
 * @param count     number of points
 * @param in        any coordinates
 * @param dx,dy,dz  shifts of the three elements
 * @param out       in less the shifts; may be in
 * @param status    always #TW_SUCCESS
 */
TW_API void TWshifts_i(int32_t count, const CoordinateTriple* in, double dx, double dy, double dz,
                       CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Molodensky (DMA TR 8350.2, 1991, section 7; EPSG Guidance Note 7-2, method 9604)
 *
 *  Points are longitude, latitude (radians) and ellipsoidal height.  A latitude beyond 89 degrees
 *  (1.5533430342749535, itself excluded) goes by geocentric coordinates.  Nothing is wrapped or
 *  refused.  Within a decimetre of the three-parameter shift of geocentric coordinates for the
 *  usual datums.
 *  @{ */

/**
 * Source datum to target datum.
 * @param a,e       source ellipsoid
 * @param da        target less source semi-major axis
 * @param df        target less source flattening
 * @param dx,dy,dz  shift of the origin, in the unit of a
 * @param count     number of points
 * @param in        longitude, latitude, height
 * @param out       longitude, latitude, height; may be in
 * @param status    always #TW_SUCCESS
 */
TW_API void TWmol_std_f(double a, double e, double da, double df, double dx, double dy, double dz,
                        int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                        TWstatus* status);

/**
 * Target datum to source datum, with the parameters of TWmol_std_f(): two passes of the same shift,
 * so that a round trip is close, not exact.
 * @param a,e       source ellipsoid
 * @param da        target less source semi-major axis
 * @param df        target less source flattening
 * @param dx,dy,dz  shift of the origin, in the unit of a
 * @param count     number of points
 * @param in        longitude, latitude, height
 * @param out       longitude, latitude, height; may be in
 * @param status    always #TW_SUCCESS
 */
TW_API void TWmol_std_i(double a, double e, double da, double df, double dx, double dy, double dz,
                        int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                        TWstatus* status);
/** @} */

/** @name Plane polynomials
 *
 *  Coefficients of a degree d are two blocks of (d + 1)(d + 2)/2 doubles, for the first and the
 *  second output.  In a block terms go by total degree, and within it by falling power of x: 1; x,
 *  y; x^2, x y, y^2; and so on.
 *  @{ */

/**
 * Forward.
 * @param coefs   two blocks of coefficients
 * @param d       degree, 0 or more
 * @param count   number of points
 * @param in      x, y, height
 * @param out     the two polynomials' values, and the height; may be in
 * @param status  always #TW_SUCCESS
 */
TW_API void TWnpoly2d_f(const double* coefs, int32_t d, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);

/**
 * Inverse by Newton's method from the linear terms' solution: until both steps are below 1e-12, at
 * most 20 passes; running out of them, or a singular matrix, is not reported.
 * @param coefs   two blocks of coefficients
 * @param d       degree, 0 or more
 * @param count   number of points
 * @param in      values of the two polynomials, height
 * @param out     x, y, height; may be in
 * @param status  always #TW_SUCCESS
 */
TW_API void TWnpoly2d_i(const double* coefs, int32_t d, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);

/**
 * Forward, of second degree: x' = a0 + a1 x + a2 y + a3 x^2 + a4 x y + a5 y^2, and y' with b.  The
 * second-degree terms are dropped where all six are below 1e-12 in size.
 *
 * The normalisation, x := (x - x0) / sx and y := (y - y0) / sy, takes effect ONLY IF in and out are
 * the same array; with two arrays the polynomials read the raw input.
 * @param x0,y0,sx,sy        normalising origin and scales
 * @param a0,a1,a2,a3,a4,a5  coefficients of x'
 * @param b0,b1,b2,b3,b4,b5  coefficients of y'
 * @param count              number of points
 * @param in                 x, y, height
 * @param out                x', y', height
 * @param status             always #TW_SUCCESS
 */
TW_API void TWpoly2deg_f(double x0, double y0, double sx, double sy, double a0, double a1,
                         double a2, double a3, double a4, double a5, double b0, double b1,
                         double b2, double b3, double b4, double b5, int32_t count,
                         const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse of TWpoly2deg_f() as it works in place; the normalisation always applies.
 * @param x0,y0,sx,sy        normalising origin and scales
 * @param a0,a1,a2,a3,a4,a5  coefficients of x'
 * @param b0,b1,b2,b3,b4,b5  coefficients of y'
 * @param count              number of points
 * @param in                 x', y', height
 * @param out                x, y, height; may be in
 * @param status             always #TW_SUCCESS
 */
TW_API void TWpoly2deg_i(double x0, double y0, double sx, double sy, double a0, double a1,
                         double a2, double a3, double a4, double a5, double b0, double b1,
                         double b2, double b3, double b4, double b5, int32_t count,
                         const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name Complex polynomials
 *
 *  The variable is z = (y - y0) / sy + i (x - x0) / sx: northing is the real part.  Coefficients
 * are order + 1 pairs of doubles, real part first.  Element z of a point is neither read nor
 * written.
 *  @{ */

/**
 * Forward: y' + i x' = c_0 + c_1 z + ... + c_order z^order.
 * @param order        order, 0 or more
 * @param y0,x0,sy,sx  normalising origin and scales, northing FIRST
 * @param coefs        order + 1 pairs
 * @param count        number of points
 * @param in           x, y
 * @param out          x', y'; may be in
 * @param status       always #TW_SUCCESS
 */
TW_API void TWcomplexpol_f(int32_t order, double y0, double x0, double sy, double sx,
                           const double* coefs, int32_t count, const CoordinateTriple* in,
                           CoordinateTriple* out, TWstatus* status);

/**
 * Derivative of the polynomial.
 * @param order      order
 * @param coefs      order + 1 pairs
 * @param z_re,z_im  the (normalised) variable
 * @param result     two doubles: real and imaginary part
 * @param status     always #TW_SUCCESS
 */
TW_API void TWcomplexpol_g(int32_t order, const double* coefs, double z_re, double z_im,
                           double* result, TWstatus* status);

/**
 * Inverse by Newton's method, until the squared modulus of a step is below 1e-14, at most 50
 * passes.  It starts from the real part alone of the linear terms' solution.
 * @param order        order, 1 or more
 * @param y0,x0,sy,sx  normalising origin and scales, northing FIRST
 * @param coefs        order + 1 pairs
 * @param count        number of points
 * @param in           x', y'
 * @param out          x, y; may be in
 * @param status       #TW_I_LATITUDE_LIMITED if the LAST point ran out of passes; its last estimate
 *                     is written.  Those before it are not reported
 */
TW_API void TWcomplexpol_i(int32_t order, double y0, double x0, double sy, double sx,
                           const double* coefs, int32_t count, const CoordinateTriple* in,
                           CoordinateTriple* out, TWstatus* status);

/**
 * Conformal mapping of second degree: with X = (x - x0) / sx and Y = (y - y0) / sy,
 * x' = a0 + a1 X - b1 Y + a2 (X^2 - Y^2) - 2 b2 X Y and
 * y' = b0 + b1 X + a1 Y + b2 (X^2 - Y^2) + 2 a2 X Y.
 * The second-degree terms are dropped where hypot(a2, b2) is below 1e-12.
 * @param x0,y0,sx,sy  normalising origin and scales
 * @param a0,a1,a2     coefficients
 * @param b0,b1,b2     coefficients
 * @param count        number of points
 * @param in           x, y
 * @param out          x', y'; may be in
 * @param status       always #TW_SUCCESS
 */
TW_API void TWconform2_f(double x0, double y0, double sx, double sy, double a0, double a1,
                         double a2, double b0, double b1, double b2, int32_t count,
                         const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse of TWconform2_f(), by TWcomplexpol_i().
 * @param x0,y0,sx,sy  normalising origin and scales
 * @param a0,a1,a2     coefficients
 * @param b0,b1,b2     coefficients
 * @param count        number of points
 * @param in           x', y'
 * @param out          x, y; may be in
 * @param status       as TWcomplexpol_i()
 */
TW_API void TWconform2_i(double x0, double y0, double sx, double sy, double a0, double a1,
                         double a2, double b0, double b1, double b2, int32_t count,
                         const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);
/** @} */

/** One term of a regression sum, and one row of its table in the parameter store. */
typedef struct MreTerm {
  double coefficient; /**< Arc-seconds, or metres in a height sum. */
  int16_t u_power;    /**< Power of U, 0 to 9. */
  int16_t v_power;    /**< Power of V, 0 to 9. */
  int32_t unused;     /**< Not read. */
} MreTerm;

/** @name Multiple regression (DMA TR 8350.2, 1991, appendix D)
 *  @{ */

/**
 * Datum shift by three sums of terms c U^p V^q, with U = k (latitude + lat_offset) and
 * V = k (longitude + lon_offset), both in degrees.  There is no iteration: the way back takes the
 * same sums at the given point off, and does not return exactly.
 * @param count                             number of points
 * @param direction                         0: the sums are taken off; else they are added
 * @param lon_range                         1: the longitude is brought up to 0 or more before V is
 *                                          formed; else into [-180, 180]
 * @param lon_count,lat_count,height_count  numbers of terms
 * @param k                                 normalising scale, per degree
 * @param lon_offset,lat_offset             normalising offsets, degrees
 * @param lon_terms,lat_terms,height_terms  the terms: arc-seconds, arc-seconds, metres
 * @param in                                longitude, latitude (radians), height (metres)
 * @param out                               shifted; may be in
 * @param status                            always #TW_SUCCESS
 */
TW_API void TWmre(int32_t count, int16_t direction, int16_t lon_range, int32_t lon_count,
                  int32_t lat_count, int32_t height_count, double k, double lon_offset,
                  double lat_offset, const MreTerm* lon_terms, const MreTerm* lat_terms,
                  const MreTerm* height_terms, const CoordinateTriple* in, CoordinateTriple* out,
                  TWstatus* status);
/** @} */

/** @name Inverse of any forward function
 *  @{ */

/**
 * Inverts a caller's map of geodetic points to a plane, by walking on the sphere: to 1e-14, at most
 * 100 passes a point, which is not reported if they run out.  Each point starts where the one
 * before ended, so the points should follow a path.
 * @param forward              the map; called with one point at a time, of which only longitude and
 *                             latitude mean anything
 * @param context              handed through to forward
 * @param start_lon,start_lat  where the walk to the first point starts, radians
 * @param unused               not read
 * @param count                number of points
 * @param in                   x, y
 * @param out                  longitude, latitude; may be in
 * @param status               #TW_NOT_CONVERGED for a start latitude beyond a pole, and where
 *                             forward fails: stop.  An information word of forward is handed on
 */
TW_API void TWgeneric_i(TWtransform forward, TWcontext context, double start_lon, double start_lat,
                        double unused, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);
/** @} */

/** @name NADCON grids
 *  @{ */

/** @} */

/** @name National grids
 *  @{ */

/** @} */

/** @name Geoid undulation
 *  @{ */

/** @} */

/** @name Points that a line needs
 *  @{ */

/**
 * How many evenly spaced points a line must have so that the straight pieces between their images
 * stay within a tolerance of the line's image: by doubling, then by a secant search of at most 100
 * passes.
 *
 * A tolerance that no count meets (a negative one, or a transform that jumps) keeps the doubling
 * going until the count or the memory is at its end.
 * @param transform  a caller's map of points; it may set the word, which then stands for that trial
 * @param context    handed through to transform
 * @param start,end  the ends of the line, radians
 * @param a,e        ellipsoid
 * @param tolerance  largest deviation, in the unit of transform's output
 * @param line_kind  0 geodesic, 1 rhumb line
 * @param count      number of points; 2 where the image is straight
 * @param status     #TW_BAD_TOLERANCE for a tolerance of exactly 0, then #TW_BAD_INPUT for another
 *                   line_kind, both with count unwritten; #TW_NO_MEMORY where an allocation failed,
 *                   or a doubling would pass 32 bits; otherwise the word of the last trial, and if
 *                   that is not #TW_SUCCESS at the end of the doubling, count is left at 3
 */
TW_API void TWtoler_to_cnt(TWtransform transform, TWcontext context, CoordinateTriple start,
                           CoordinateTriple end, double a, double e, double tolerance,
                           int16_t line_kind, int32_t* count, TWstatus* status);
/** @} */

#ifdef __cplusplus
}
#endif

#endif
