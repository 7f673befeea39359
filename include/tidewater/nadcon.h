/**
 * @file nadcon.h
 * NADCON datum shift grids.
 *
 * Shifts interpolated in pairs of grid files: .las with shifts of the latitude, positive north, and
 * .los with shifts of the longitude, positive WEST, both in arc-seconds (Dewhurst 1990, NADCON: the
 * application of minimum curvature-derived surfaces in the transformation of positional data, NOAA
 * Technical Memorandum NOS NGS-50).  The file area.par of a directory names the pairs in order of
 * priority, one a line: the first word of the line, without extension; the rest is a comment.  A
 * line without a word names the grid above it again.
 *
 * A grid holds a point strictly inside its bounds.  The nodes around the last point, 4 by 4, are
 * kept in a window of the PROCESS: points inside it are served from it whatever control block is
 * passed, others load it anew from the files.  So calls must not run at once.  A node whose value
 * is beyond 180 in size has no data and takes the mean of its cell's three others.
 *
 * Within one array call files are opened once, and read whole into memory of the call's own when
 * many windows are loaded from them: points at random are best given in few, long calls.  A later
 * call opens them anew.
 *
 * By contract a window that could not be read has its new bounds and, in part or whole, its old
 * nodes: a point inside those bounds that is asked for AGAIN after #TW_GRID_FILE_ERROR or
 * #TW_NO_MEMORY is served from them with success, and its figure is that of another place or none
 * at all.  After a read error neither the failed point nor others may be tried again: what was
 * written after it is to be thrown away, and a point far off, whose window can be read, must come
 * first in a later call.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - NADCON grids, a grid of 0.25 degrees: forward < 1 nm (< 1 nm), inverse 92 um (5.1 um).
 *
 * Source: Dewhurst, NADCON: The Application of Minimum Curvature-Derived Surfaces in the
 * Transformation of Positional Data, NOAA Technical Memorandum NOS NGS-50 (1990).
 */
#ifndef TIDEWATER_NADCON_H
#define TIDEWATER_NADCON_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/** A grid of the list, as its two file headers tell it; degrees, negative west of Greenwich. */
typedef struct NadconGrid {
  char name[264]; /**< Base name of its files. */
  int32_t nc;     /**< Columns. */
  int32_t nr;     /**< Rows. */
  double xmin;    /**< Western bound. */
  double ymin;    /**< Southern bound. */
  double xmax;    /**< Eastern bound. */
  double ymax;    /**< Northern bound. */
  double dx;      /**< Spacing of columns. */
  double dy;      /**< Spacing of rows. */
} NadconGrid;

/** The grids of a directory in order of priority; the caller's, filled by TWnadcon_c(). */
typedef struct NadconControl {
  char directory[260];  /**< With its separator behind it. */
  int32_t grid_count;   /**< Grids in use. */
  NadconGrid grids[50]; /**< At most so many. */
} NadconControl;

/** A window of 4 by 4 nodes; degrees, negative west of Greenwich. */
typedef struct NadconWindow {
  int32_t nc;  /**< Columns: 4 once loaded. */
  int32_t nr;  /**< Rows: 4 once loaded. */
  double xmin; /**< Western bound. */
  double ymin; /**< Southern bound. */
  double xmax; /**< Eastern bound. */
  double ymax; /**< Northern bound. */
  double dx;   /**< Spacing of columns. */
  double dy;   /**< Spacing of rows. */
} NadconWindow;

/**
 * Reads area.par and the headers of the grids that it names.  Lines are read in pieces of 259
 * characters; the 51st and later lines are not read.
 * @param directory  folder with its separator behind it, at most 259 characters
 * @param control    filled; on a failure at a grid its count stays as it was, while directory and
 *                   earlier grids are written
 * @param status     #TW_GRID_NOT_FOUND where area.par cannot be opened, or its first line is blank:
 *                   control untouched; #TW_GRID_FILE_ERROR where a grid file is missing or short,
 *                   or the two headers of a grid differ
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
 *                 next load, stay unwritten, and the next load clears the status
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
 * Finds the first grid that holds a point and loads the 4 by 4 nodes around it.  Near a grid's edge
 * the window stays inside; where it would reach into a grid of higher priority, it is moved off.
 * @param x,y        degrees, x in (-360, 0]
 * @param unused     ignored
 * @param control    of TWnadcon_c()
 * @param window     bounds of the nodes read
 * @param lon_table  16 doubles, shifts of the longitude: rows from the south, columns from the west
 * @param lat_table  16 doubles, shifts of the latitude
 * @param status     #TW_I_OUTSIDE_NADCON outside all grids, #TW_GRID_FILE_ERROR for a grid of fewer
 *                   than four rows or columns, or of impossible sizes, and for files that cannot be
 *                   opened: window untouched; #TW_NO_MEMORY, and #TW_GRID_FILE_ERROR for files that
 *                   are too short and for a window that was moved out of its own grid: window
 *                   written, the tables that could not be read untouched
 */
TW_API void TWloc_grids(double x, double y, double unused, const NadconControl* control,
                        NadconWindow* window, double* lon_table, double* lat_table,
                        TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
