/**
 * @file catalogue.h
 * Umbrella: lookups in the parameter store: named systems, datums, zones, satellites and models.
 *
 * Every function opens the store at the path that it is given, works, and closes it; nothing of the
 * store stays between calls.  The store is reached through the operations of store.h.  The path and
 * text keys are handed on as they stand; whether keys compare exactly is the store's matter (in
 * libtabdll they do).
 *
 * Status words that all functions share, beside those that each names:
 * - #TW_PF_OPEN_ERROR: the store cannot be opened.
 * - #TW_PF_TABLE_ERROR: a table is missing or cannot be read; in the functions that say so, also a
 *   store that cannot be closed, over any other status.
 *
 * After a failure the outputs are as they were, except where a function says otherwise.
 *
 * A name list is a flat area of entries 41 bytes apart, each a text with its terminator; the area
 * holds as many entries as the count function of the same table tells, and is not checked.  Lists
 * come in the byte order of the names.
 */
#ifndef TIDEWATER_CATALOGUE_H
#define TIDEWATER_CATALOGUE_H

#include "tidewater/catalogue_datums.h"
#include "tidewater/catalogue_magnetic_models.h"
#include "tidewater/catalogue_satellites.h"
#include "tidewater/catalogue_systems.h"
#include "tidewater/catalogue_transform_models.h"
#include "tidewater/catalogue_undulations.h"
#include "tidewater/catalogue_vertical_datums.h"
#include "tidewater/catalogue_zones.h"

#endif
