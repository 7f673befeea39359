// The table of projection methods: what each is called, what it is given, and how it is computed.
#pragma once

#include <memory>
#include <span>
#include <string_view>

#include "definition.hpp"
#include "formula.hpp"

namespace tidewater::detail {

// Methods that the registry lacks have codes of our own, below zero.
enum OwnMethod : int {
  kRobinson = -1,
  kMollweide = -2,
  kEckert4 = -3,
  kSinusoidal = -4,
  kVanDerGrinten = -5,
  kMiller = -6,
  kGnomonic = -7,
  kStereographic = -8,
  kAzimuthalEquidistant = -9,
  kEquidistantConic = -10,
  kTiltedPerspective = -11,
  kBipolarConic = -12,
  kChamberlin = -13,
  kSpaceOblique = -14,
  kImwPolyconic = -15,
  kObliqueLambert = -16,
  kIndianPolyhedric = -17,
  kRectifiedSkewOrthomorphic = -18,
  kTwoPointOblique = -19,
  kMalaya = -20,
  kLandsat = -21,
};

// Parameters that the registry lacks, likewise.
enum OwnParameter : int {
  kLatitudeOfFirstPoint = -101,
  kLongitudeOfFirstPoint = -102,
  kLatitudeOfSecondPoint = -103,
  kLongitudeOfSecondPoint = -104,
  kLatitudeOfThirdPoint = -105,
  kLongitudeOfThirdPoint = -106,
  kTilt = -107,
  kSatellite = -108,
  kPath = -109,
  kInclination = -110,
  kPeriodRatio = -111,
  kAscendingNode = -112,
};

enum class Quantity { angle, length, scale };

// A parameter, whatever method it serves.
struct ParameterKind {
  int code;
  Quantity quantity;
  std::string_view name;        // the registry's, also that of WKT 2
  std::string_view words;       // the field's words
  std::string_view short_form;  // lat0, lon0, lat1, lat2, k0, x0, y0 ...
  double usual;                 // value when none is given
};

// How a method takes a parameter, with the names that depend on the method.
struct MethodParameter {
  int code;
  std::string_view proj;  // "lat_0"; empty where PROJ has none
  std::string_view wkt1;  // "latitude_of_origin"; the dialect of .prj files has the same words
};

// What a method's factory is given.
struct MethodArguments {
  const Definition& definition;
  double a, e, e2, f;

  double operator()(int parameter, double otherwise = 0) const {
    return definition.parameter(parameter, otherwise);
  }
};

struct Method {
  int code;
  std::string_view name;   // the registry's, also that of WKT 2
  std::string_view words;  // in the field's words, short forms after bars: "lambert conformal|lcc"
  std::string_view proj;   // name and fixed words, "omerc +no_uoff"; empty where PROJ has none
  std::string_view wkt1;   // "Lambert_Conformal_Conic_2SP"
  std::string_view esri;   // "Lambert_Conformal_Conic"
  std::span<const MethodParameter> parameters;
  std::unique_ptr<const Formula> (*make)(const MethodArguments&);
};

std::span<const Method> methods();

// Null when there is none.
const Method* method_by_code(int code);
const Method* method_by_words(std::string_view words);
const ParameterKind* parameter_kind(int code);

// How true a method's formulas are, in words; docs/systems.md says how it was measured.
std::string_view truth_of(int method);

}  // namespace tidewater::detail
