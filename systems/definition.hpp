// What a coordinate system is, whatever text it came from.
#pragma once

#include <array>
#include <limits>
#include <optional>
#include <string>
#include <vector>

#include "tidewater/error.hpp"
#include "tidewater/system_kind.hpp"

namespace tidewater::detail {

struct EllipsoidDefinition {
  std::string name;
  int code = 0;                   // registry code, 0 when it has none
  double a = 0;                   // semi-major axis, metres
  double inverse_flattening = 0;  // 0: sphere
};

struct MeridianDefinition {
  std::string name = "Greenwich";
  int code = 8901;
  double longitude = 0;  // radians east of Greenwich
};

struct UnitDefinition {
  std::string name;
  int code = 0;
  double factor = 1;  // to metres or radians
};

struct DatumDefinition {
  std::string name;
  int code = 0;
  EllipsoidDefinition ellipsoid;
  MeridianDefinition meridian;
  // To WGS 84 by position vector: three metres, three arc seconds, parts per million (the order and
  // signs of PROJ's towgs84 and of WKT 1's TOWGS84).
  std::optional<std::array<double, 7>> to_wgs84;
};

struct ParameterValue {
  int code = 0;      // registry parameter code
  double value = 0;  // radians, metres or one
};

struct Definition {
  std::string name;
  int code = 0;  // registry code, 0 when it has none
  SystemKind kind = SystemKind::geographic2d;
  DatumDefinition datum;

  // Of a projected system: the registry's method code, or one of our own below zero (methods.hpp),
  // and what it is given.  `conversion` and `base` are names for texts, empty when unknown.
  int method = 0;
  std::vector<ParameterValue> parameters;
  std::string conversion;
  std::string base;
  int base_code = 0;  // registry code of the geographic system of a projected one

  UnitDefinition unit;  // of the horizontal axes
  std::string
      axes;  // letters E N W S U in the definition's own order, "EN", "NE", "WS", "NEU"; XYZ

  // Of a compound or vertical system: the vertical part's names and unit.
  std::string vertical_name;
  int vertical_code = 0;
  std::string vertical_datum;
  UnitDefinition vertical_unit;
  int horizontal_code = 0;  // of a compound system's horizontal part

  // Area of use in degrees; the name is empty and the figures the whole Earth when it is unknown.
  double west = -180, south = -90, east = 180, north = 90;
  std::string area;

  double parameter(int parameter_code, double otherwise = 0) const {
    for (const auto& given : parameters) {
      if (given.code == parameter_code) return given.value;
    }
    return otherwise;
  }
};

}  // namespace tidewater::detail
