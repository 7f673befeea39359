/**
 * @file datum.h
 * Datum transformations by formulas, polynomials and shift grids, and geoid undulation.
 */
#ifndef TIDEWATER_DATUM_H
#define TIDEWATER_DATUM_H

#include "tidewater/catalogue.h"
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
 *  refused.
 *
 *  The formula is of the first order.  Against the shift of geocentric coordinates itself, measured
 *  over all longitudes with a shift of 105 m between Clarke 1866 and WGS 84 (of 865 m between
 *  Bessel and WGS 84): 0.03 m (0.08 m) at 30 degrees of latitude, 0.03 m (0.14 m) at 75, 0.14 m
 *  (1.5 m) just short of 89 degrees.  It grows with the square of the shift and with the tangent of
 *  the latitude.
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
 * Forward (the general polynomial of IOGP Guidance Note 7-2, methods 9645 to 9648).
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
 * Forward: y' + i x' = c_0 + c_1 z + ... + c_order z^order (IOGP Guidance Note 7-2, methods 9652
 * and 9653; Snyder 1987, eq. 26-1).
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
 *
 *  Shifts interpolated in pairs of grid files: .las with shifts of the latitude, positive north,
 *  and .los with shifts of the longitude, positive WEST, both in arc-seconds (Dewhurst 1990,
 *  NADCON: the application of minimum curvature-derived surfaces in the transformation of
 *  positional data, NOAA Technical Memorandum NOS NGS-50).  The file area.par of a directory
 *  names the pairs in order of priority, one a line: the first word of the line, without
 *  extension; the rest is a comment.  A line without a word names the grid above it again.
 *
 *  A grid holds a point strictly inside its bounds.  The nodes around the last point, 4 by 4, are
 *  kept in a window of the PROCESS: points inside it are served from it whatever control block is
 *  passed, others load it anew from the files.  So calls must not run at once.  A node whose value
 *  is beyond 180 in size has no data and takes the mean of its cell's three others.
 *
 *  Within one array call files are opened once, and read whole into memory of the call's own when
 *  many windows are loaded from them: points at random are best given in few, long calls.  A later
 *  call opens them anew.
 *
 *  By contract a window that could not be read has its new bounds and, in part or whole, its old
 *  nodes: a point inside those bounds that is asked for AGAIN after #TW_GRID_FILE_ERROR or
 *  #TW_NO_MEMORY is served from them with success, and its figure is that of another place or none
 *  at all.  After a read error neither the failed point nor others may be tried again: what was
 *  written after it is to be thrown away, and a point far off, whose window can be read, must come
 *  first in a later call.
 *  @{ */

/** A grid of the list, as its two file headers tell it; degrees, negative west of Greenwich. */
typedef struct NadconGrid {
  char name[264];                /**< Base name of its files. */
  int32_t nc;                    /**< Columns. */
  int32_t nr;                    /**< Rows. */
  double xmin, ymin, xmax, ymax; /**< Bounds. */
  double dx, dy;                 /**< Spacing of columns and of rows. */
} NadconGrid;

/** The grids of a directory in order of priority; the caller's, filled by TWnadcon_c(). */
typedef struct NadconControl {
  char directory[260];  /**< With its separator behind it. */
  int32_t grid_count;   /**< Grids in use. */
  NadconGrid grids[50]; /**< At most so many. */
} NadconControl;

/** A window of 4 by 4 nodes; degrees, negative west of Greenwich. */
typedef struct NadconWindow {
  int32_t nc;                    /**< Columns: 4 once loaded. */
  int32_t nr;                    /**< Rows: 4 once loaded. */
  double xmin, ymin, xmax, ymax; /**< Bounds. */
  double dx, dy;                 /**< Spacing of columns and of rows. */
} NadconWindow;

/**
 * Reads area.par and the headers of the grids that it names.  Lines are read in pieces of 259
 * characters; the 51st and later lines are not read.
 * @param directory  folder with its separator behind it, at most 259 characters
 * @param control    filled; on a failure at a grid its count stays as it was, while directory and
 *                   earlier grids are written
 * @param status     #TW_GRID_NOT_FOUND where area.par cannot be opened, or its first line is
 *                   blank: control untouched; #TW_GRID_FILE_ERROR where a grid file is missing or
 *                   short, or the two headers of a grid differ
 * @return 1; no part of the contract
 */
TW_API int32_t TWnadcon_c(const char* directory, NadconControl* control, TWstatus* status);

/**
 * Forward shift, bilinear in the cell of the point.
 * @param count    number of points
 * @param in       longitude, latitude, height
 * @param control  of TWnadcon_c()
 * @param out      shifted longitude, in (-pi, pi], latitude; height copied; may be in
 * @param status   #TW_I_OUTSIDE_NADCON if any point lay outside all grids: copied with its
 *                 longitude brought into (-pi, pi], the others shifted; #TW_GRID_FILE_ERROR,
 *                 #TW_NO_MEMORY where a window could not be loaded, or moved so far off a better
 *                 grid that no cell of it serves the point: the point, and later ones up to the
 *                 next load, stay unwritten, and the next load clears the word
 */
TW_API void TWnadcon_f(int32_t count, const CoordinateTriple* in, const NadconControl* control,
                       CoordinateTriple* out, TWstatus* status);

/**
 * Inverse of TWnadcon_f(), by at most four passes of it; ends as soon as ONE of longitude and
 * latitude is within 1e-9 degrees.  That the passes ran out is not told.
 * @param count    number of points
 * @param in       longitude, latitude, height
 * @param control  of TWnadcon_c()
 * @param out      longitude in (-pi, pi], latitude; height copied; may be in
 * @param status   #TW_I_OUTSIDE_NADCON if any point lay outside, then or on a later pass: copied
 *                 with its longitude brought into (-pi, pi]; #TW_GRID_FILE_ERROR, #TW_NO_MEMORY
 *                 only if the LAST point met it and none lay outside; at such a point only the
 *                 longitude that stands in out is brought into (-pi, pi]
 */
TW_API void TWnadcon_i(int32_t count, const CoordinateTriple* in, const NadconControl* control,
                       CoordinateTriple* out, TWstatus* status);

/**
 * Finds the first grid that holds a point and loads the 4 by 4 nodes around it.  Near a grid's
 * edge the window stays inside; where it would reach into a grid of higher priority, it is moved
 * off.
 * @param x,y        degrees, x in (-360, 0]
 * @param unused     ignored
 * @param control    of TWnadcon_c()
 * @param window     bounds of the nodes read
 * @param lon_table  16 doubles, shifts of the longitude: rows from the south, columns from the
 *                   west
 * @param lat_table  16 doubles, shifts of the latitude
 * @param status     #TW_I_OUTSIDE_NADCON outside all grids, #TW_GRID_FILE_ERROR for a grid of
 *                   fewer than four rows or columns, or of impossible sizes, and for files that
 *                   cannot be opened: window untouched; #TW_NO_MEMORY, and #TW_GRID_FILE_ERROR
 *                   for files that are too short and for a window that was moved out of its own
 *                   grid: window written, the tables that could not be read untouched
 */
TW_API void TWloc_grids(double x, double y, double unused, const NadconControl* control,
                        NadconWindow* window, double* lon_table, double* lat_table,
                        TWstatus* status);
/** @} */

/** @name National grids
 *
 *  Shifts interpolated in one NTv2 grid shift file (.gsb) of rectangular sub-grids, finer ones
 *  nested in coarser ones (Junkins and Farley 1995, NTv2: National Transformation Version 2
 *  Developer's Guide, Geomatics Canada).  TWcnt_c() opens the file for the PROCESS; the nodes
 *  around the last point, 4 by 4, are kept.  Calls of this group must not run at once.
 *
 *  Longitudes in such files are positive west.  The sign of a point's longitude is dropped and
 *  put back on its shift: the functions serve grids of the western hemisphere, and a point east
 *  of Greenwich is shifted as its mirror image.
 *
 *  Within one array call the file is read whole into memory of the call's own when many blocks of
 *  nodes are loaded from it.
 *
 *  By contract a block that could not be read counts as loaded, with the nodes that were in their
 *  place before: a point of that block that is asked for AGAIN after #TW_GSB_READ_ERROR gets
 *  #TW_SUCCESS and a figure that is none.  After that word nothing may be tried again before
 *  TWcnt_c() or a point far off, whose nodes can be read.  A block is four records in each of four
 *  rows also in a sub-grid of fewer than four rows or columns, and is then read with what follows
 *  the sub-grid in the file; at the end of the file that is the read error.
 *
 *  Arguments named reserved are ignored.
 *  @{ */

/**
 * Opens the grid file that the first word of area.par names, without its extension .gsb, and
 * reads its headers.  An earlier file stays open, and its table in memory, to the end of the
 * process.
 * @param directory  folder with its separator behind it, at most 259 characters
 * @param reserved   ignored
 * @param status     #TW_GRID_NOT_FOUND as TWget_cnt_fnam(): the grid open before stays in use;
 *                   #TW_GSB_READ_ERROR, #TW_NO_MEMORY as TWrd_cnt_fhdr(): the earlier grid is
 *                   dropped, and points must not be shifted
 */
TW_API void TWcnt_c(const char* directory, int32_t reserved, TWstatus* status);

/**
 * First word of the first line of area.par.
 * @param directory  folder with its separator behind it, at most 259 characters
 * @param name       at least 260 characters
 * @param status     #TW_GRID_NOT_FOUND where area.par cannot be opened, is empty, or begins with
 *                   a blank line; name unwritten
 */
TW_API void TWget_cnt_fnam(const char* directory, char* name, TWstatus* status);

/**
 * Opens a grid file and reads the headers of the file and of all sub-grids.
 * @param path    the file
 * @param flag    0
 * @param status  #TW_GSB_READ_ERROR for another flag, a file that cannot be opened, a header that
 *                is short or not of 11 records, a count of sub-grids that cannot be, and a sub-
 *                grid whose spacings cannot be or whose rows and columns do not make its count of
 *                nodes; #TW_NO_MEMORY
 */
TW_API void TWrd_cnt_fhdr(const char* path, int32_t flag, TWstatus* status);

/**
 * Forward shift.  No longitude is wrapped.
 * @param count     number of points
 * @param in        longitude, latitude, height
 * @param reserved  ignored
 * @param out       shifted longitude, latitude; height copied; may be in
 * @param status    #TW_I_OUTSIDE_CNT if any point lay outside all sub-grids: copied, the others
 *                  shifted; #TW_GSB_READ_ERROR where nodes could not be read: stop
 */
TW_API void TWcnt_f(int32_t count, const CoordinateTriple* in, int32_t reserved,
                    CoordinateTriple* out, TWstatus* status);

/**
 * Inverse of TWcnt_f(), by exactly four passes.
 * @param count     number of points
 * @param in        longitude, latitude, height
 * @param reserved  ignored
 * @param out       longitude, latitude; height copied; may be in
 * @param status    as TWcnt_f(); a point is outside if its LAST pass was
 */
TW_API void TWcnt_i(int32_t count, const CoordinateTriple* in, int32_t reserved,
                    CoordinateTriple* out, TWstatus* status);

/**
 * Shift at one point, bilinear in the cell of the deepest sub-grid that holds it.  Edges belong
 * to a sub-grid to 2e-7 arc-seconds; of several children that hold a point, one with the point
 * off its north and west edges comes first, then the order in the file decides.
 * @param point      longitude, latitude
 * @param reserved   ignored
 * @param lon_shift  radians, to be added
 * @param lat_shift  radians, to be added
 * @param status     #TW_I_OUTSIDE_CNT outside all sub-grids, or with no grid open: shifts
 *                   unwritten; #TW_GSB_READ_ERROR where nodes could not be read: shifts written
 *                   all the same, from the nodes that were in their place before
 */
TW_API void TWget_cnt_shift(CoordinateTriple point, int32_t reserved, double* lon_shift,
                            double* lat_shift, TWstatus* status);

/**
 * Names of the two datums of the open grid, as they stand in the file, padded with blanks.
 * @param reserved  ignored
 * @param from      9 characters: source datum
 * @param to        9 characters: target datum
 * @param status    always #TW_SUCCESS
 */
TW_API void TWcnt_to_from(int32_t reserved, char* from, char* to, TWstatus* status);

/**
 * Loads the nodes around a record of a sub-grid, 4 by 4, unless they are the ones kept.  A
 * failure is told by no word; an index of no sub-grid does nothing.
 * @param sub_grid  index of the sub-grid in the file, from 0
 * @param record    number of the node's record in the file, from 1
 */
TW_API void TWload_cnt_local_grid(int32_t sub_grid, int32_t record);
/** @} */

/** @name Geoid undulation
 *
 *  Undulations N, in metres, interpolated in .geo files, which have the form of .las files.  The
 *  height above the ellipsoid is that above the geoid plus N.  The file area.par of a directory
 *  lists the grids in order of priority: 15 columns of free text, then the base name of the file.
 *  Blank lines and lines with an asterisk in the first column are skipped.
 *
 *  A grid holds a point strictly inside its bounds.  The nodes around the last point, 22 by 22,
 *  are kept in a window of the PROCESS: points inside it, off its outer cells, are served from it
 *  whatever control block is passed, others load it anew.  Calls must not run at once.  Within one
 *  array call a file is opened once, and read whole into memory of the call's own when many windows
 *  are loaded from it.
 *
 *  By contract, and to be known by a caller:
 *  - The window remembers its grid by its index in the control block.  After a point outside all
 *    grids that index is 0, while the window stays: the next point inside it is placed by the
 *    lattice of the block's FIRST grid.  Where that has another spacing or origin than the
 *    window's own grid, the undulation is wrong, by a metre and more, with success.  Points outside
 *    are best kept out of a call.
 *  - A window that could not be read has its new bounds and its old nodes: the point that gave
 *    #TW_GEOID_READ_ERROR or #TW_NO_MEMORY gives success and a figure that is none when it is asked
 *    for again.  After a read error nothing may be tried again before a point far off, whose window
 *    can be read.
 *  @{ */

/** A grid of the list, as its file header tells it; degrees, negative west of Greenwich. */
typedef struct GeoidGrid {
  char name[260];               /**< Base name of its file. */
  int32_t nc;                   /**< Columns. */
  int32_t nr;                   /**< Rows. */
  float xmin, ymin, xmax, ymax; /**< Bounds. */
  float dx, dy;                 /**< Spacing of columns and of rows. */
} GeoidGrid;

/** The grids of a directory in order of priority; the caller's, filled by TWgeo90_c(). */
typedef struct GeoidControl {
  char directory[260]; /**< With its separator behind it. */
  int32_t grid_count;  /**< Grids in use. */
  GeoidGrid grids[50]; /**< At most so many. */
} GeoidControl;

/** A window of up to 22 by 22 nodes; degrees, negative west of Greenwich. */
typedef struct GeoidWindow {
  int32_t nc;                   /**< Columns: 22 unless clipped to the grid. */
  int32_t nr;                   /**< Rows: 22 unless clipped to the grid. */
  float xmin, ymin, xmax, ymax; /**< Bounds. */
  float dx, dy;                 /**< Spacing of columns and of rows. */
} GeoidWindow;

/**
 * Reads area.par and the headers of the grids that it names, at most 50.  Lines are read in
 * pieces of 274 characters.
 * @param directory  folder with its separator behind it, at most 259 characters
 * @param control    filled; on a failure at a line its count stays as it was, while directory and
 *                   earlier grids are written
 * @param status     #TW_GEOID_FILE_ERROR where area.par cannot be opened: control untouched; and
 *                   for a line of fewer than 16 characters or without a name;
 *                   #TW_GEOID_READ_ERROR where a grid file is missing or its header short
 * @return 1; no part of the contract
 */
TW_API int32_t TWgeo90_c(const char* directory, GeoidControl* control, TWstatus* status);

/**
 * Adds the undulation: height above the geoid to height above the ellipsoid.
 * @param count    number of points
 * @param in       longitude, latitude, height
 * @param control  of TWgeo90_c()
 * @param out      longitude, latitude copied, height plus N; may be in
 * @param status   #TW_I_OUTSIDE_GEOID if any point lay outside all grids: copied, the others
 *                 shifted; #TW_GEOID_READ_ERROR, #TW_NO_MEMORY where a window could not be
 *                 loaded: stop
 */
TW_API void TWgeo90_f(int32_t count, const CoordinateTriple* in, const GeoidControl* control,
                      CoordinateTriple* out, TWstatus* status);

/**
 * Takes the undulation off: height above the ellipsoid to height above the geoid.
 * @param count    number of points
 * @param in       longitude, latitude, height
 * @param control  of TWgeo90_c()
 * @param out      longitude, latitude copied, height less N; may be in
 * @param status   as TWgeo90_f()
 */
TW_API void TWgeo90_i(int32_t count, const CoordinateTriple* in, const GeoidControl* control,
                      CoordinateTriple* out, TWstatus* status);

/**
 * Undulation at one point, of the second order in both directions on the three nearest nodes each
 * way, in single precision.
 * @param lon,lat     radians
 * @param height      ignored
 * @param control     of TWgeo90_c(); the bounds of its grid with the window's index are used
 * @param undulation  metres
 * @param status      as TWgeo90_local(); #TW_GEOID_READ_ERROR also where the window was moved so
 *                    far off another grid that it lacks three nodes for the point; undulation
 *                    unwritten
 */
TW_API void TWget_geo90(double lon, double lat, double height, const GeoidControl* control,
                        double* undulation, TWstatus* status);

/**
 * Finds the first grid that holds a point and loads the nodes around it, up to 22 by 22.  Near a
 * grid's edge the window stays inside; where it would reach into any other grid, it is moved off.
 * @param x,y         degrees, x in (-360, 0]
 * @param unused      ignored
 * @param control     of TWgeo90_c()
 * @param window      bounds of the nodes read
 * @param data        22 rows of 22 floats: rows from the south, columns from the west
 * @param grid_index  index of the grid; 0 where none was opened
 * @param status      #TW_I_OUTSIDE_GEOID outside all grids, #TW_GEOID_READ_ERROR for a grid of
 *                    fewer than twelve rows or columns, or of impossible sizes, and for a file
 *                    that cannot be opened: window untouched; #TW_NO_MEMORY, and
 *                    #TW_GEOID_READ_ERROR for a file that is too short and for a window that was
 *                    moved out of its own grid: window written, data untouched
 */
TW_API void TWgeo90_local(double x, double y, double unused, const GeoidControl* control,
                          GeoidWindow* window, float* data, int32_t* grid_index, TWstatus* status);
/** @} */

/** @name Points that a line needs
 *  @{ */

/**
 * How many evenly spaced points a line must have so that the straight pieces between their images
 * stay within a tolerance of the line's image: by doubling, then by a secant search of at most 100
 * passes.
 *
 * By contract a tolerance that no count meets (a negative one, one below the rounding of the
 * transform's output, or a transform that jumps) keeps the doubling going until the count or the
 * memory is at its end: at a count of 2^30 + 1 the arrays take 48 GB.  A caller that takes the
 * tolerance from a user should hold it above what the transform can give.
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
