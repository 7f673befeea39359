/**
 * @file national_grid.h
 * National datum shift grids in the NTv2 form.
 *
 * Shifts interpolated in one NTv2 grid shift file (.gsb) of rectangular sub-grids, finer ones
 * nested in coarser ones (Junkins and Farley 1995, NTv2: National Transformation Version 2
 * Developer's Guide, Geomatics Canada).  TWcnt_c() opens the file for the PROCESS; the nodes around
 * the last point, 4 by 4, are kept.  Calls of this group must not run at once.
 *
 * Longitudes in such files are positive west.  The sign of a point's longitude is dropped and put
 * back on its shift: the functions serve grids of the western hemisphere, and a point east of
 * Greenwich is shifted as its mirror image.
 *
 * Within one array call the file is read whole into memory of the call's own when many blocks of
 * nodes are loaded from it.
 *
 * By contract a block that could not be read counts as loaded, with the nodes that were in their
 * place before: a point of that block that is asked for AGAIN after #TW_GSB_READ_ERROR gets
 * #TW_SUCCESS and a figure that is none.  After that status nothing may be tried again before
 * TWcnt_c() or a point far off, whose nodes can be read.  A block is four records in each of four
 * rows also in a sub-grid of fewer than four rows or columns, and is then read with what follows
 * the sub-grid in the file; at the end of the file that is the read error.
 *
 * Arguments named reserved are ignored.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - National transformation grids, a grid of 0.25 degrees: forward < 1 nm (< 1 nm), inverse < 1 nm
 *   (< 1 nm).
 *
 * Source: Junkins and Farley, NTv2: National Transformation Version 2 Developer's Guide, Geomatics
 * Canada (1995).
 */
#ifndef TIDEWATER_NATIONAL_GRID_H
#define TIDEWATER_NATIONAL_GRID_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Opens the grid file that the first word of area.par names, without its extension .gsb, and reads
 * its headers.  An earlier file stays open, and its table in memory, to the end of the process.
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
 * @param status     #TW_GRID_NOT_FOUND where area.par cannot be opened, is empty, or begins with a
 *                   blank line; name unwritten
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
 * Shift at one point, bilinear in the cell of the deepest sub-grid that holds it.  Edges belong to
 * a sub-grid to 2e-7 arc-seconds; of several children that hold a point, one with the point off its
 * north and west edges comes first, then the order in the file decides.
 * @param point      longitude, latitude
 * @param reserved   ignored
 * @param lon_shift  radians, to be added
 * @param lat_shift  radians, to be added
 * @param status     #TW_I_OUTSIDE_CNT outside all sub-grids, or with no grid open: shifts
 *                   unwritten; #TW_GSB_READ_ERROR where nodes could not be read: shifts written all
 *                   the same, from the nodes that were in their place before
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
 * Loads the nodes around a record of a sub-grid, 4 by 4, unless they are the ones kept.  A failure
 * leaves no status; an index of no sub-grid does nothing.
 * @param sub_grid  index of the sub-grid in the file, from 0
 * @param record    number of the node's record in the file, from 1
 */
TW_API void TWload_cnt_local_grid(int32_t sub_grid, int32_t record);

#ifdef __cplusplus
}
#endif

#endif
