// State plane zones: the projection parameters of a zone number.
// C. N. Claire, State Plane Coordinates by Automatic Data Processing, C&GS Publication 62-4 (1968);
// J. E. Stem, State Plane Coordinate System of 1983, NOAA Manual NOS NGS 5 (1989).

#include <cstdlib>
#include <span>

#include "formulas/constants.hpp"
#include "points/portable.hpp"
#include "projections/conformal/state_plane_zones.hpp"
#include "tidewater/state_plane.h"

using namespace tidewater::detail;

namespace {

constexpr double kMetresPerSurveyFoot = 0.3048006096012192;  // 1200/3937

// Zone 5001, the Alaskan panhandle, is the one oblique Mercator of both systems.
constexpr double kObliqueCenterLon = -133.66666666666666;
constexpr double kObliqueCenterLat = 57.0;
constexpr double kObliqueAzimuthTangent = -0.75;

// The number in the start of a text, whatever follows it.  Without one, or beyond the numbers that
// a zone can have, no zone is found.
const StatePlaneZone* find_zone(std::span<const StatePlaneZone> zones, const char* text) {
  const long number = std::strtol(text, nullptr, 10);
  for (const StatePlaneZone& zone : zones) {
    if (zone.number == number) return &zone;
  }
  return nullptr;
}

// Writes the parameters that the type of the zone has; unit is the metres in one of its lengths.
void write_zone(const StatePlaneZone* zone, double unit, int16_t* type, double* lon0, double* lat0,
                double* false_easting, double* false_northing, double* k0, double* lat1,
                double* lat2, double* lon_center, double* lat_center, double* azimuth,
                TWstatus* status) {
  *status = TW_SUCCESS;
  if (zone == nullptr) {
    *status = TW_BAD_ZONE;
    return;
  }
  // The oblique zone is in metres in both systems.
  if (zone->type == kOmerc) unit = 1;
  *type = zone->type;
  *lon0 = zone->lon0 * kRadiansPerDegree;
  *lat0 = zone->lat0 * kRadiansPerDegree;
  *false_easting = zone->false_easting * unit;
  *false_northing = zone->false_northing * unit;
  *k0 = 1.0 - zone->reduction;
  if (zone->type == kLcc) {
    *lat1 = zone->lat1 * kRadiansPerDegree;
    *lat2 = zone->lat2 * kRadiansPerDegree;
  } else if (zone->type == kOmerc) {
    *lon_center = kObliqueCenterLon * kRadiansPerDegree;
    *lat_center = kObliqueCenterLat * kRadiansPerDegree;
    *azimuth = portable::atan(kObliqueAzimuthTangent);
  }
}

}  // namespace

void TWspcs27(const char* zone_text, int16_t* type, double* lon0, double* lat0,
              double* false_easting, double* false_northing, double* k0, double* lat1, double* lat2,
              double* lon_center, double* lat_center, double* azimuth, TWstatus* status) {
  write_zone(find_zone(kZones1927, zone_text), kMetresPerSurveyFoot, type, lon0, lat0,
             false_easting, false_northing, k0, lat1, lat2, lon_center, lat_center, azimuth,
             status);
}

void TWspcs83(const char* zone_text, int16_t* type, double* lon0, double* lat0,
              double* false_easting, double* false_northing, double* k0, double* lat1, double* lat2,
              double* lon_center, double* lat_center, double* azimuth, TWstatus* status) {
  write_zone(find_zone(kZones1983, zone_text), 1, type, lon0, lat0, false_easting, false_northing,
             k0, lat1, lat2, lon_center, lat_center, azimuth, status);
}
