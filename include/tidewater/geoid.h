/**
 * @file geoid.h
 * Geoid undulation from grids.
 *
 * Undulations N, in metres, interpolated in .geo files, which have the form of .las files.  The
 * height above the ellipsoid is that above the geoid plus N. The file area.par of a directory lists
 * the grids in order of priority: 15 columns of free text, then the base name of the file.  Blank
 * lines and lines with an asterisk in the first column are skipped.
 *
 * A grid holds a point strictly inside its bounds.  The nodes around the last point, 22 by 22, are
 * kept in a window of the PROCESS: points inside it, off its outer cells, are served from it
 * whatever control block is passed, others load it anew.  Calls must not run at once.  Within one
 * array call a file is opened once, and read whole into memory of the call's own when many windows
 * are loaded from it.
 *
 * By contract, and to be known by a caller:
 * - The window remembers its grid by its index in the control block.  After a point outside all
 *   grids that index is 0, while the window stays: the next point inside it is placed by the
 *   lattice of the block's FIRST grid.  Where that has another spacing or origin than the window's
 *   own grid, the undulation is wrong, by a metre and more, with success.  Points outside are best
 *   kept out of a call.
 * - A window that could not be read has its new bounds and its old nodes: the point that gave
 *   #TW_GEOID_READ_ERROR or #TW_NO_MEMORY gives success and a figure that is none when it is asked
 *   for again.  After a read error nothing may be tried again before a point far off, whose window
 *   can be read.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Geoid grids, a grid of 0.25 degrees: forward 2.0 um (1.4 um), inverse < 1 nm (< 1 nm).
 *
 * Source: Milbert, GEOID90: A High-Resolution Geoid for the United States, Eos 72 (1991), for the
 * grids; Abramowitz and Stegun, Handbook of Mathematical Functions (1964), section 25.2, Newton's
 * forward difference formula, for the interpolation.
 */
#ifndef TIDEWATER_GEOID_H
#define TIDEWATER_GEOID_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/** A grid of the list, as its file header tells it; degrees, negative west of Greenwich. */
typedef struct GeoidGrid {
  char name[260]; /**< Base name of its file. */
  int32_t nc;     /**< Columns. */
  int32_t nr;     /**< Rows. */
  float xmin;     /**< Western bound. */
  float ymin;     /**< Southern bound. */
  float xmax;     /**< Eastern bound. */
  float ymax;     /**< Northern bound. */
  float dx;       /**< Spacing of columns. */
  float dy;       /**< Spacing of rows. */
} GeoidGrid;

/** The grids of a directory in order of priority; the caller's, filled by TWgeo90_c(). */
typedef struct GeoidControl {
  char directory[260]; /**< With its separator behind it. */
  int32_t grid_count;  /**< Grids in use. */
  GeoidGrid grids[50]; /**< At most so many. */
} GeoidControl;

/** A window of up to 22 by 22 nodes; degrees, negative west of Greenwich. */
typedef struct GeoidWindow {
  int32_t nc; /**< Columns: 22 unless clipped to the grid. */
  int32_t nr; /**< Rows: 22 unless clipped to the grid. */
  float xmin; /**< Western bound. */
  float ymin; /**< Southern bound. */
  float xmax; /**< Eastern bound. */
  float ymax; /**< Northern bound. */
  float dx;   /**< Spacing of columns. */
  float dy;   /**< Spacing of rows. */
} GeoidWindow;

/**
 * Reads area.par and the headers of the grids that it names, at most 50.  Lines are read in pieces
 * of 274 characters.
 * @param directory  folder with its separator behind it, at most 259 characters
 * @param control    filled; on a failure at a line its count stays as it was, while directory and
 *                   earlier grids are written
 * @param status     #TW_GEOID_FILE_ERROR where area.par cannot be opened: control untouched; and
 *                   for a line of fewer than 16 characters or without a name; #TW_GEOID_READ_ERROR
 *                   where a grid file is missing or its header short
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
 *                 shifted; #TW_GEOID_READ_ERROR, #TW_NO_MEMORY where a window could not be loaded:
 *                 stop
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
 *                    fewer than twelve rows or columns, or of impossible sizes, and for a file that
 *                    cannot be opened: window untouched; #TW_NO_MEMORY, and #TW_GEOID_READ_ERROR
 *                    for a file that is too short and for a window that was moved out of its own
 *                    grid: window written, data untouched
 */
TW_API void TWgeo90_local(double x, double y, double unused, const GeoidControl* control,
                          GeoidWindow* window, float* data, int32_t* grid_index, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
