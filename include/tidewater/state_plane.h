/**
 * @file state_plane.h
 * Zones of the State Plane Coordinate Systems of 1927 and 1983.
 *
 * Parameters of the zones of the State Plane Coordinate Systems, by zone number.  The projection of
 * a zone is TWt_merc_f(), TWlam_f() or TWo_merc_f(), by its type.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - State plane 1983, 4 zones, one at least of each type: 879 um (879 um);
 * - State plane 1927, 3 zones, one at least of each type: 2.0 mm (2.0 mm).
 *
 * Source: Claire, State Plane Coordinates by Automatic Data Processing, C&GS Publication 62-4
 * (1968); Stem, State Plane Coordinate System of 1983, NOAA Manual NOS NGS 5 (1989).
 */
#ifndef TIDEWATER_STATE_PLANE_H
#define TIDEWATER_STATE_PLANE_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * A zone of the 1927 system.  False values come out in metres, turned from US survey feet
 * (1200/3937).
 * @param zone_text              the zone number in the start of a text: blanks and a sign may stand
 *                               before it, anything behind it
 * @param type                   0 transverse Mercator, 1 Lambert with two parallels, -1 oblique
 *                               Mercator
 * @param lon0,lat0              origin, radians
 * @param false_easting          metres
 * @param false_northing         metres
 * @param k0                     scale on the central line
 * @param lat1,lat2              standard parallels, radians; written for type 1 alone
 * @param lon_center,lat_center  centre of the oblique line, radians; written for type -1 alone
 * @param azimuth                of the oblique line, radians; written for type -1 alone
 * @param status                 #TW_BAD_ZONE for a zone that is not in the list, or no number;
 *                               nothing is written
 */
TW_API void TWspcs27(const char* zone_text, int16_t* type, double* lon0, double* lat0,
                     double* false_easting, double* false_northing, double* k0, double* lat1,
                     double* lat2, double* lon_center, double* lat_center, double* azimuth,
                     TWstatus* status);

/**
 * A zone of the 1983 system.
 * @param zone_text              the zone number in the start of a text: blanks and a sign may stand
 *                               before it, anything behind it
 * @param type                   0 transverse Mercator, 1 Lambert with two parallels, -1 oblique
 *                               Mercator
 * @param lon0,lat0              origin, radians
 * @param false_easting          metres
 * @param false_northing         metres
 * @param k0                     scale on the central line
 * @param lat1,lat2              standard parallels, radians; written for type 1 alone
 * @param lon_center,lat_center  centre of the oblique line, radians; written for type -1 alone
 * @param azimuth                of the oblique line, radians; written for type -1 alone
 * @param status                 #TW_BAD_ZONE for a zone that is not in the list, or no number;
 *                               nothing is written
 */
TW_API void TWspcs83(const char* zone_text, int16_t* type, double* lon0, double* lat0,
                     double* false_easting, double* false_northing, double* k0, double* lat1,
                     double* lat2, double* lon_center, double* lat_center, double* azimuth,
                     TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
