// Command-line options that describe how angles are written, and the records they stand for.
#pragma once

#include <CLI/CLI.hpp>
#include <string>

#include "tidewater/text.h"

namespace tidewater::command {

// How the angles of a position are written.
struct AngleFormat {
  std::string form = "degrees";     // degrees, grads, dms, packed
  std::string hemisphere = "sign";  // sign, front, behind
  std::string reverse = "none";     // none, both, lat, lon
  std::string order = "lat-lon";    // lat-lon, lon-lat
  int precision = -1;               // decimals; -1: by the form

  // The record for the library's text functions.
  AngleUnit unit() const;
  // The same for an angle that is neither latitude nor longitude.
  AngleFormat without_hemisphere() const;
};

// Adds --format, --hemisphere, --reverse and --order, each name with a prefix ("out-").
void add_angle_options(CLI::App& app, AngleFormat& format, const std::string& prefix,
                       const std::string& group);

}  // namespace tidewater::command
