// The factories of the method table, a source for each group.
#pragma once

#include <cmath>
#include <memory>
#include <string>

#include "formulas/constants.hpp"
#include "methods.hpp"

namespace tidewater::detail {

// Registry codes of parameters.
enum ParameterCode : int {
  kColatitude = 1036,
  kEllipsoidScaling = 1038,
  kPlaneHeight = 1039,
  kLat0 = 8801,
  kLon0 = 8802,
  kK0 = 8805,
  kX0 = 8806,
  kY0 = 8807,
  kLatC = 8811,
  kLonC = 8812,
  kAzimuth = 8813,
  kRectifiedAngle = 8814,
  kLineScale = 8815,
  kXC = 8816,
  kYC = 8817,
  kPseudoParallel = 8818,
  kPseudoScale = 8819,
  kLatF = 8821,
  kLonF = 8822,
  kLat1 = 8823,
  kLat2 = 8824,
  kXF = 8826,
  kYF = 8827,
  kInitialLon = 8830,
  kZoneWidth = 8831,
  kLatTrue = 8832,
  kLonOrigin = 8833,
  kTopoLat = 8834,
  kTopoLon = 8835,
  kTopoHeight = 8836,
  kViewHeight = 8840,
};

using Made = std::unique_ptr<const Formula>;

// The commonest plane: longitude of natural origin, scale, false easting and northing.
inline Plane natural_plane(const MethodArguments& given, double scale) {
  return {given(kLon0), given.a * scale, given.a * scale, given(kX0), given(kY0)};
}
inline Plane false_origin_plane(const MethodArguments& given, double scale) {
  return {given(kLonF), given.a * scale, given.a * scale, given(kXF), given(kYF)};
}

// Constants that came out wrong are an error with a sentence.
void require(bool good, const MethodArguments& given, const char* why);
void require(TWstatus word, const MethodArguments& given);
// The parallel along which a cylinder is true is no pole.
void require_parallel(const MethodArguments& given, double lat);

Made make_transverse_mercator(const MethodArguments& given);
Made make_transverse_mercator_south(const MethodArguments& given);
Made make_zoned_transverse_mercator(const MethodArguments& given);
Made make_lambert_1sp(const MethodArguments& given);
Made make_lambert_1sp_variant_b(const MethodArguments& given);
Made make_lambert_west(const MethodArguments& given);
Made make_lambert_2sp(const MethodArguments& given);
Made make_lambert_belgium(const MethodArguments& given);
Made make_lambert_michigan(const MethodArguments& given);
Made make_lambert_near_conformal(const MethodArguments& given);
Made make_mercator_a(const MethodArguments& given);
Made make_mercator_b(const MethodArguments& given);
Made make_mercator_c(const MethodArguments& given);
Made make_pseudo_mercator(const MethodArguments& given);
Made make_oblique_mercator_a(const MethodArguments& given);
Made make_oblique_mercator_b(const MethodArguments& given);
Made make_swiss_oblique(const MethodArguments& given);
Made make_two_point_oblique(const MethodArguments& given);
Made make_laborde(const MethodArguments& given);
Made make_krovak(const MethodArguments& given);
Made make_krovak_north(const MethodArguments& given);
Made make_krovak_modified(const MethodArguments& given);
Made make_krovak_modified_north(const MethodArguments& given);
Made make_oblique_stereographic(const MethodArguments& given);
Made make_polar_stereographic_a(const MethodArguments& given);
Made make_polar_stereographic_b(const MethodArguments& given);
Made make_polar_stereographic_c(const MethodArguments& given);
Made make_stereographic(const MethodArguments& given);
Made make_new_zealand(const MethodArguments& given);
Made make_rectified_skew(const MethodArguments& given);
Made make_oblique_lambert(const MethodArguments& given);
Made make_bipolar_conic(const MethodArguments& given);

Made make_albers(const MethodArguments& given);
Made make_azimuthal_equal_area(const MethodArguments& given);
Made make_azimuthal_equal_area_spherical(const MethodArguments& given);
Made make_cylindrical_equal_area(const MethodArguments& given);
Made make_cylindrical_equal_area_spherical(const MethodArguments& given);
Made make_equal_earth(const MethodArguments& given);
Made make_bonne(const MethodArguments& given);
Made make_bonne_south(const MethodArguments& given);
Made make_sinusoidal(const MethodArguments& given);
Made make_mollweide(const MethodArguments& given);
Made make_eckert4(const MethodArguments& given);

Made make_cassini(const MethodArguments& given);
Made make_hyperbolic_cassini(const MethodArguments& given);
Made make_polyconic(const MethodArguments& given);
Made make_equidistant_cylindrical(const MethodArguments& given);
Made make_equidistant_cylindrical_spherical(const MethodArguments& given);
Made make_equidistant_conic(const MethodArguments& given);
Made make_azimuthal_equidistant(const MethodArguments& given);
Made make_modified_azimuthal_equidistant(const MethodArguments& given);
Made make_guam(const MethodArguments& given);
Made make_colombia_urban(const MethodArguments& given);
Made make_tunisia_mining(const MethodArguments& given);
Made make_robinson(const MethodArguments& given);
Made make_miller(const MethodArguments& given);
Made make_van_der_grinten(const MethodArguments& given);
Made make_gnomonic(const MethodArguments& given);
Made make_orthographic(const MethodArguments& given);
Made make_local_orthographic(const MethodArguments& given);
Made make_vertical_perspective(const MethodArguments& given);
Made make_tilted_perspective(const MethodArguments& given);
Made make_imw_polyconic(const MethodArguments& given);

Made make_chamberlin(const MethodArguments& given);
Made make_indian_polyhedric(const MethodArguments& given);
Made make_malaya(const MethodArguments& given);
Made make_space_oblique(const MethodArguments& given);
Made make_landsat(const MethodArguments& given);

}  // namespace tidewater::detail
