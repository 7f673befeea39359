// GeoJSON with its coordinates converted.
#pragma once

#include "convert_job.hpp"

namespace tidewater::command {

// Works through GeoJSON (RFC 7946) documents, or texts of one document a line: coordinates are
// converted, all else is handed on.  Memory grows with the largest geometry, not with the file.
// Gives the exit status.
int convert_geojson(const ConvertOptions& options);

}  // namespace tidewater::command
