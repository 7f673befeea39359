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

/** @name Similarity transformations
 *  @{ */

/** @} */

/** @name Molodensky
 *  @{ */

/** @} */

/** @name Plane polynomials
 *  @{ */

/** @} */

/** @name Complex polynomials
 *  @{ */

/** @} */

/** @name Multiple regression
 *  @{ */

/** @} */

/** @name Inverse of any forward function
 *  @{ */

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
 *  passed, others load it anew from the files.  So points in the order of a line are fast, points
 *  at random cost two opened files each, and calls must not run at once.  A node whose value is
 *  beyond 180 in size has no data and takes the mean of its cell's three others.
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
 *                 #TW_NO_MEMORY where a window could not be loaded: the point, and later ones up
 *                 to the next load, stay unwritten, and the next load clears the word
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
 *                   for files that are too short: window written, the tables that could not be
 *                   read untouched
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
 *  whatever control block is passed, others load it anew.  Calls must not run at once.
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
 * @param status      #TW_I_OUTSIDE_GEOID, #TW_GEOID_READ_ERROR, #TW_NO_MEMORY; undulation
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
 *                    #TW_GEOID_READ_ERROR for a file that is too short: window written, data
 *                    untouched
 */
TW_API void TWgeo90_local(double x, double y, double unused, const GeoidControl* control,
                          GeoidWindow* window, float* data, int32_t* grid_index, TWstatus* status);
/** @} */

/** @name Points that a line needs
 *  @{ */

/** @} */

#ifdef __cplusplus
}
#endif

#endif
